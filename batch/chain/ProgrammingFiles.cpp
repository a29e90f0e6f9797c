#include "batch/chain/ProgrammingFiles.h"

#include "batch/Messages.h"
#include "batch/Switches.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"

using Messages::failure;

namespace {

struct Texts {
  const char* noSwitch;
  const char* noPart;
  const char* addFailed;
  const char* assignFailed;
};

bool addWithFile(CmdParser& session, const UT_CMDSWINFO* partSwitch, const char* path, int position,
                 const Texts& texts) {
  if (partSwitch == nullptr) return failure(texts.noSwitch);
  const char* part = partSwitch->getargtxt(0);
  if (part == nullptr) return failure(texts.noPart);
  if (!session.deviceManager->addDeviceByPart(position, part)) return failure(texts.addFailed, part, position);
  if (!session.deviceManager->assignFile(position, path)) return failure(texts.assignFailed, path);
  session.lastIdentifyOk = true;
  return true;
}

}  // namespace

bool addPromProgrammingFile(CmdParser& session, const UT_CMDARGS& args, const char* path, int position) {
  return addWithFile(
      session, findSwitch(args, "-sprom", "-spi", "-fpga"), path, position,
      {"An SPROM , spi or Marlin3an part name must be specified using the -sprom/-spi/-fpga switch for "
       "programming mcs/exo files.\n",
       "An SPROM or SPI or Marlin3an part name must be specified for SPROM programming files.\n",
       "Failed to add PROM device %s at position %d.\n", "Failed to process PROM programming file '%s'.\n"});
}

bool addSpiProgrammingFile(CmdParser& session, const UT_CMDARGS& args, const char* path, int position) {
  // Deliberate: the first text names -sprom, the switch is -spi.
  return addWithFile(
      session, findSwitch(args, "-spi"), path, position,
      {"An SPI part name must be specified using the -sprom switch for SPI programming files.\n",
       "An SPI part name must be specified for SPI programming files.\n",
       "Failed to add SPI device %s at position %d.\n", "Failed to process SPI programming file '%s'.\n"});
}

bool addMpmProgrammingFile(CmdParser& session, const UT_CMDARGS& args, const char* path, int position) {
  static constexpr const char* addFailed = "Failed to add MPM device %s at position %d.\n";
  DeviceManagerInterface& manager = *session.deviceManager;
  const UT_CMDSWINFO* partSwitch = findSwitch(args, "-mpm");
  if (partSwitch == nullptr)
    return failure("An MPM part name must be specified using the -mpm switch for MPM programming files.\n");
  const char* part = partSwitch->getargtxt(0);
  if (part == nullptr) return failure("An MPM part name must be specified for MPM programming files.\n");
  if (!manager.addDeviceByPart(position, "zp18v01")) return failure(addFailed, part, position);
  manager.setDeviceAttribute(position, DeviceNS::MPM_PAIR, "true", true);
  if (!manager.addDeviceByPart(position + 1, part)) {
    Messages::error(addFailed, part, position);
    manager.removeDevice(position);
    return false;
  }
  // Before the file is assigned: it stays set when that fails.
  session.lastIdentifyOk = true;
  if (manager.assignFile(position + 1, path)) return true;
  Messages::error("Failed to process MPM Programming file '%s'.\n", path);
  manager.removeDevice(position);
  return false;
}
