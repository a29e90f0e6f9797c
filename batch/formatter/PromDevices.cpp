#include <cstdint>
#include <string>

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Selection.h"
#include "batch/Switches.h"
#include "interfaces/constraints/ConstraintsManager.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/ACDEntryNotFoundException.h"

using Messages::failure;

namespace {

const char* configDeviceName(tESSELNS::MODE_TYPE mode, const UT_CMDSWINFO* name) {
  if (mode == tESSELNS::PROM_FILE_FORMATTER) return "pff";
  if (name != nullptr) return name->getargtxt(0);
  if (mode == tESSELNS::SYSTEM_OBA_CF) return "obacf";
  return mode == tESSELNS::SYSTEM_OBA_MPM ? "obampm" : "";
}

struct Prom {
  std::uint32_t size = 0;
  std::string name;
};

/// A PROM named by its part. False after a message.
bool readSerialProm(const UT_CMDARGS& args, Prom& prom) {
  const UT_CMDSWINFO* name = args.getsw("-name", 0);
  if (name == nullptr) return failure("Option -name is required for pff serial mode.\n");
  // Deliberate: this text has no full stop, its twin below has one.
  if (args.findsw("-size")) Messages::warning("Option -size is not used for pff serial mode, setting is ignored\n");
  prom.name = name->getargtxt(0);
  return true;
}

/// A PROM given by its size. False after a message.
bool readParallelProm(const UT_CMDARGS& args, Prom& prom) {
  const UT_CMDSWINFO* size = args.getsw("-size", 0);
  if (size == nullptr) return failure("Option -size is required for pff parallel mode.\n");
  if (args.findsw("-name")) Messages::warning("Option -name is not used for pff parallel mode, setting is ignored.\n");
  const std::int32_t number = size->getargnum32(0);
  prom.size = static_cast<std::uint32_t>(number);
  prom.name = Port::format("%dk", number);
  return true;
}

}  // namespace

bool CmdParser::addConfigDevice(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  tESSELNS::MODE_TYPE mode = deviceManager->getActiveMode();
  const bool needsSize = mode != tESSELNS::PROM_FILE_FORMATTER;
  if (const UT_CMDSWINFO* given = args.getsw("-mode", 0))
    mode = ConstraintsManager::modeString2Type(given->getargtxt(0));
  std::uint32_t size = 1;
  if (needsSize) {
    const UT_CMDSWINFO* given = args.getsw("-size", 0);
    if (given == nullptr) return failure("The size of the configuration device must be specified.\n");
    size = static_cast<std::uint32_t>(given->getargnum32(0));
  }
  const UT_CMDSWINFO* path = args.getsw("-path", 0);
  return deviceManager->createModeInterface(mode, path == nullptr ? "" : path->getargtxt(0),
                                            configDeviceName(mode, args.getsw("-name", 0)), size) != nullptr;
}

bool CmdParser::deleteConfigDevice(UT_CMDARGS& /*args*/) {
  const tESSELNS::MODE_TYPE mode = deviceManager->getActiveMode();
  if (!isContentMode(mode))
    return failure(
        "You can only delete a configuration device in SystemOBA CF, SystemOBA MPM or Prom File Formatter mode.\n");
  deviceManager->clearMode(mode);
  return true;
}

bool CmdParser::addPromDevice(UT_CMDARGS& args) {
  if (!checkModeSet() || !checkSubModeSet()) return false;
  if (!isActiveMode(tESSELNS::PROM_FILE_FORMATTER))
    return failure("addPromDevice is only valid in PFF mode.\nsetMode to -PFF is required before this operation.\n");
  const UT_CMDSWINFO* position = findSwitch(args, "-p", "-position");
  if (position == nullptr) return failure("Position is required\n");
  const tESSELNS::SUBMODE_TYPE layout = deviceManager->getSubmode();
  const bool serial = layout == tESSELNS::PFF_SERIAL || layout == tESSELNS::PFF_VERSION;
  Prom prom;
  if (!(serial ? readSerialProm(args, prom) : readParallelProm(args, prom))) return false;
  try {
    return deviceManager->addPromDevice2PromChain(position->getargnum(0), prom.size, prom.name.c_str());
  } catch (const ACDEntryNotFoundException&) {
    return failure("Invalid part name, %s.\n", prom.name);
  }
}

bool CmdParser::deletePromDevice(UT_CMDARGS& args) {
  if (!isActiveMode(tESSELNS::PROM_FILE_FORMATTER))
    return failure("You cannot delete Prom Device when not in Prom File Formatter mode.\n");
  const UT_CMDSWINFO* position = findSwitch(args, "-p", "-position");
  if (position == nullptr) return failure("Position is required\n");
  return deviceManager->removePromDevice(position->getargnum(0));
}
