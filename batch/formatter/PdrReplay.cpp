#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/formatter/ContentRules.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/pdr/Pdr.h"
#include "interfaces/portability/ACDEntryNotFoundException.h"
#include "interfaces/portability/File.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "interfaces/portability/UT_STR.h"

using Messages::failure;

namespace {

constexpr int unitsPerMega = 1024;

/// The size that a PROM's text gives; only the parallel layout reads it so, though others are parallel, too.
std::uint32_t promSize(tESSELNS::SUBMODE_TYPE layout, const char* prom) {
  if (layout != tESSELNS::PFF_PARALLEL) return 0;
  const auto size = static_cast<std::uint32_t>(UT_STR::AToI(prom));
  return UT_STR::IMatch(prom, "*M") ? size * unitsPerMega : size;
}

void addProms(DeviceManagerInterface& manager, const Pdr& pdr) {
  for (int i = 0; i < pdr.getNumberPromDevices(); ++i) {
    const char* prom = pdr.getPromDevice(i);
    try {
      manager.addPromDevice2PromChain(i, promSize(pdr.getMode(), prom), prom);
    } catch (const ACDEntryNotFoundException&) {
      Messages::error("Invalid part name, %s.\n", prom);  // and on, as after any failed call of the replay
    }
  }
}

/// True when there was a device.
bool addDesigns(DeviceManagerInterface& manager, const Pdr& pdr) {
  bool anyDevice = false;
  for (int design = 0; design < pdr.getNumberDesignRecords(); ++design) {
    manager.addDesign(design, pdr.getStartAddress(design), nullptr, designKind);
    manager.addDeviceChain(0);
    for (int i = 0; i < pdr.getNumberDevices(design); ++i) {
      manager.addDeviceByPart(i, pdr.getDevice(design, i));
      anyDevice = true;
    }
  }
  return anyDevice;
}

/// Rebuilds the content that the PDR describes. No call's result is looked at.
bool replay(DeviceManagerInterface& manager, const Pdr& pdr) {
  manager.createModeInterface(tESSELNS::PROM_FILE_FORMATTER, ".", "pff", 1);
  manager.setSubmode(pdr.getMode());
  manager.setAttribute(ConfigDeviceNS::FILE_FORMAT, pdr.getFileFormat());
  manager.setAttribute(ConfigDeviceNS::SWAP_BIT, pdr.getSwapBit());
  manager.setAttribute(ConfigDeviceNS::FILL_VALUE, pdr.getFillValue());
  manager.addCollection("mpmpffcollection");
  manager.setAttribute(ConfigDeviceNS::DIRECTION, pdr.getDirection());
  addProms(manager, pdr);
  return addDesigns(manager, pdr);
}

}  // namespace

bool CmdParser::loadPdr(UT_CMDARGS& args) {
  // Deliberate: the mode changes before anything is checked.
  deviceManager->setMode(tESSELNS::PROM_FILE_FORMATTER, true);
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return failure("PDR file name is required.\n");
  const char* path = file->getargtxt(0);
  if (!Port::File::probe(path)) return failure("Open file error, %s\n", path);
  Pdr pdr(path);
  const bool readable = pdr.read();
  deviceManager->clearAllModes();
  if (!readable) return failure("Pdr File read error.\n");
  return replay(*deviceManager, pdr);
}
