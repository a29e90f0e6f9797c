#include <array>

#include "batch/CmdParser.h"
#include "batch/Files.h"
#include "batch/Messages.h"
#include "batch/Selection.h"
#include "batch/chain/ExtraFiles.h"
#include "batch/chain/Position.h"
#include "batch/chain/ProgrammingFiles.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_PATH.h"
#include "interfaces/portability/UT_STR.h"

using Messages::failure;

namespace {

/// Both hold their text and a terminating zero; what does not fit is refused.
using Extension = std::array<char, 8>;
using CsPin = std::array<char, 16>;

template <std::size_t size>
constexpr int sizeOf(const std::array<char, size>& /*buffer*/) {
  return static_cast<int>(size);
}

/// What addDevice has found out before it chooses a route.
struct Request {
  CmdParser& session;
  const UT_CMDARGS& args;
  const char* path;
  int position;
  CsPin csPin;
};

bool noteAdded(CmdParser& session, bool added) {
  if (added) session.lastIdentifyOk = true;
  return added;
}

bool addWithBlockMemoryMap(const Request& request, const char* bmmPath) {
  if (!probeFile(bmmPath)) return false;
  return noteAdded(request.session, request.session.deviceManager->addDeviceByFile(
                                        request.position, request.path, bmmPath, gatherSoftwareFiles(request.args)));
}

bool addWithCores(const Request& request) {
  if (UT_STR::ICompare(UT_PATH::GetExt(request.path), "bsd") != 0)
    return failure("Please specify the location of the IBM asic bsdl file using  -file <bsdlFile> \n");
  if (!probeFile(request.path)) return false;
  const DeviceManagerInterface::CoreFiles cores = gatherCoreFiles(request.args);
  DeviceManagerInterface& manager = *request.session.deviceManager;
  if (!manager.addDeviceByFile(request.position, request.path, nullptr, {})) return false;
  // Deliberate: the device is there, whatever becomes of its core files.
  request.session.lastIdentifyOk = true;
  return manager.addCoreFiles(request.position, cores);
}

bool addPlainFile(const Request& request) {
  DeviceManagerInterface& manager = *request.session.deviceManager;
  if (!manager.addDeviceByFile(request.position, request.path, nullptr, {})) return false;
  if (request.csPin[0] != '\0')
    manager.setDeviceAttribute(request.position, DeviceNS::CS_PIN, request.csPin.data(), true);
  return noteAdded(request.session, true);
}

bool addByContent(const Request& request) {
  if (const UT_CMDSWINFO* bmm = request.args.getsw("-bmm", 0)) return addWithBlockMemoryMap(request, bmm->getargtxt(0));
  if (request.args.findsw("-core")) return addWithCores(request);
  return addPlainFile(request);
}

bool addByFile(const Request& request, tESSELNS::MODE_TYPE mode, const Extension& extension) {
  const auto is = [&extension](const char* name) { return UT_STR::ICompare(extension.data(), name) == 0; };
  const bool isPromFile = is("mcs") || is("exo");
  switch (mode) {
    case tESSELNS::BOUNDARY_SCAN:
    case tESSELNS::BOUNDARY_SCAN_FILE:
    case tESSELNS::DESKTOP_CONFIGURATION:
      if (isPromFile) return addPromProgrammingFile(request.session, request.args, request.path, request.position);
      if (is("mpm")) return addMpmProgrammingFile(request.session, request.args, request.path, request.position);
      return addByContent(request);
    case tESSELNS::SPI:
      // Deliberate: any other file fails without a message.
      return isPromFile && addSpiProgrammingFile(request.session, request.args, request.path, request.position);
    default:
      return addByContent(request);
  }
}

/// The CS pin that parallel configuration-port mode asks for. False after a message.
bool readCsPin(const UT_CMDARGS& args, tESSELNS::MODE_TYPE mode, CsPin& pin) {
  if (mode != tESSELNS::PARALLEL_PORT) return true;
  const UT_CMDSWINFO* given = args.getsw("-cs", 0);
  if (given == nullptr) return failure("CS pin is required\n");
  if (UT_STR::Copy(pin.data(), sizeOf(pin), given->getargtxt(0))) return true;
  return failure("CS pin %s is too long, it may have %d characters.\n", given->getargtxt(0), sizeOf(pin) - 1);
}

}  // namespace

bool CmdParser::addDevice(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const tESSELNS::MODE_TYPE mode = deviceManager->getActiveMode();
  if (isContentMode(mode) && !checkChainContents(mode)) return false;
  Request request{*this, args, nullptr, -1, {}};
  if (!positionToAdd(*this, args, request.position)) return false;
  if (!readCsPin(args, mode, request.csPin)) return false;
  if (const UT_CMDSWINFO* part = args.getsw("-part", 0))
    return deviceManager->addDeviceByPart(request.position, part->getargtxt(0));
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return failure("Either -file or -part is required for addDevice.\n");
  request.path = file->getargtxt(0);
  if (!probeFile(request.path)) return false;
  Extension extension{};
  if (!UT_PATH::GetExt(request.path, extension.data(), sizeOf(extension)))
    return failure("The extension of file %s is too long, it may have %d characters.\n", request.path,
                   sizeOf(extension) - 1);
  return addByFile(request, mode, extension);
}
