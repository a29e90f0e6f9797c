#include <string>

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Switches.h"
#include "batch/settings/PortWord.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_PATH.h"
#include "interfaces/portability/UT_STR.h"

using Messages::failure;

namespace {

constexpr int automaticBaud = -1;

/// The name of the file that a file cable of the type writes. False after a message.
bool outputFile(const UT_CMDARGS& args, const char* type, std::string& name) {
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return failure("No file specified for open %s file\n", type);
  name = file->getargtxt(0);
  const char* extension = UT_PATH::GetExt(name.c_str());
  if (extension == nullptr) {
    name = name + "." + type;
    Messages::debug("Create %s\n", name);
  } else if (UT_STR::ICompare(extension, type) != 0) {
    return failure("Incorrect file extension, %s\n", extension);
  }
  return true;
}

int baudOf(const UT_CMDARGS& args, int baud) {
  const UT_CMDSWINFO* given = findSwitch(args, "-b", "-baud");
  if (given == nullptr) return baud;
  return UT_STR::IMatch(given->getargtxt(0), "AUTO") ? automaticBaud : given->getargnum32(0);
}

}  // namespace

bool CmdParser::setCable(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const UT_CMDSWINFO* portSwitch = findSwitch(args, "-p", "-port");
  if (portSwitch == nullptr) return failure("Port is required\n");
  const PortWord port = classifyPort(portSwitch->getargtxt(0));
  std::string file;
  if (port.fileCable && !outputFile(args, port.type, file)) return false;
  const UT_CMDSWINFO* server = args.getsw("-server", 0);
  if (!deviceManager->setCable(port.fileCable ? file.c_str() : port.type, port.index, baudOf(args, port.baud), true,
                               server == nullptr ? nullptr : server->getargtxt(0), false))
    return false;
  cableSet = deviceManager->lockCable(cableLock);
  if (!cableSet) Messages::status("Cable is not available. Please try again later.\n");
  return cableSet;
}

bool CmdParser::setCableSpeed(UT_CMDARGS& args) {
  const UT_CMDSWINFO* speed = args.getsw("-speed", 0);
  if (speed == nullptr) return failure("Speed is required.\n");
  deviceManager->setCableSpeed(speed->getargnum32(0));
  return true;
}

bool CmdParser::setCableOption(UT_CMDARGS& args) {
  const UT_CMDSWINFO* option = args.getsw("-option", 0);
  if (option == nullptr) return failure("-option is required.\n");
  const UT_CMDSWINFO* value = args.getsw("-value", 0);
  if (value == nullptr) return failure("-value is required.\n");
  // Deliberate: the command succeeds whatever the device manager makes of the option.
  deviceManager->setCableOption(option->getargtxt(0), value->getargtxt(0));
  return true;
}

bool CmdParser::runCableDiagnostics(UT_CMDARGS& /*args*/) { return checkCableSet() && deviceManager->runDiagnostics(); }
