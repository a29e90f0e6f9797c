// What the bundled device manager can't do yet: every operation here needs devices, a chain or content, and
// refuses with one error that names the operation.

#include "manager/manager/DeviceManager.h"
#include "manager/manager/Report.h"

namespace {

bool refuse(const char* operation) {
  return reportError("%s needs devices, which this device manager does not drive yet.\n", operation);
}

}  // namespace

bool DeviceManager::runDiagnostics() { return refuse("runCableDiagnostics"); }
bool DeviceManager::performOperation(int count, const char* const* words) {
  return refuse(count > 0 ? words[0] : "The operation");
}
const char* DeviceManager::getAttribute(int /*number*/) { return ""; }
DeviceOptionsMgr* DeviceManager::getDeviceOptionsMgr(MODE_TYPE /*mode*/, int /*position*/, bool /*attachedFlash*/) {
  return &noOptions_;
}

bool DeviceManager::addDeviceByPart(int /*position*/, const char* /*part*/) { return refuse("addDevice"); }
bool DeviceManager::addDeviceByFile(int /*position*/, const char* /*file*/, const char* /*bmmFile*/,
                                    std::vector<StringBase> /*extraFiles*/) {
  return refuse("addDevice");
}
bool DeviceManager::addCoreFiles(int /*position*/, CoreFiles /*files*/) { return refuse("Adding core files"); }
bool DeviceManager::clearCoreFiles(int /*position*/, int /*core*/) { return refuse("Clearing core files"); }
bool DeviceManager::addExtraFiles(int /*position*/, std::vector<StringBase> /*files*/) {
  return refuse("Adding extra files");
}
bool DeviceManager::clearAdditionalConfigFiles(int /*position*/) { return refuse("clearAdditionalConfigFiles"); }
bool DeviceManager::assignFile(int /*position*/, const char* /*file*/) { return refuse("assignFile"); }
bool DeviceManager::removeDevice(int /*position*/) { return refuse("deleteDevice"); }
bool DeviceManager::attachDeviceByPart(int /*position*/, FLASH_TYPE /*type*/, const char* /*part*/) {
  return refuse("attachFlash");
}
bool DeviceManager::assignFileToFlashDevice(int /*position*/, FLASH_TYPE /*type*/, const char* /*file*/) {
  return refuse("assignFileToAttachedFlash");
}
bool DeviceManager::deleteAttachedDevice(int /*position*/) { return refuse("deleteAttachedFlash"); }

const char* DeviceManager::getDeviceAttribute(int /*position*/, DeviceNS::ATTRIBUTE /*attribute*/) { return nullptr; }
bool DeviceManager::setDeviceAttribute(int /*position*/, DeviceNS::ATTRIBUTE /*attribute*/, const char* /*value*/,
                                       bool /*quiet*/) {
  return refuse("Setting a device attribute");
}
bool DeviceManager::setAttribute(int /*position*/, MODE_TYPE /*mode*/, DeviceNS::ATTRIBUTE /*attribute*/,
                                 const char* /*value*/, bool /*attached*/) {
  return refuse("Setting an attribute of attached flash");
}
bool DeviceManager::setAttribute(ConfigDeviceNS::ATTRIBUTE /*attribute*/, const char* /*value*/) {
  return refuse("Setting a configuration-device attribute");
}
bool DeviceManager::setAttribute(CollectionNS::ATTRIBUTE /*attribute*/, const char* /*value*/) {
  return refuse("Setting a collection attribute");
}
bool DeviceManager::setAttribute(DesignNS::ATTRIBUTE /*attribute*/, const char* /*value*/) {
  return refuse("Setting a design attribute");
}

bool DeviceManager::addCollection(const char* /*name*/) { return refuse("addCollection"); }
bool DeviceManager::removeCollection(const char* /*name*/) { return refuse("deleteCollection"); }
bool DeviceManager::renameCollection(const char* /*oldName*/, const char* /*newName*/) {
  return refuse("renameCollection");
}
bool DeviceManager::setCurrentCollection(const char* /*name*/) { return refuse("setCurrentCollection"); }
bool DeviceManager::addDesign(int /*version*/, const char* /*value*/, bool /*data*/, const char* /*rs*/, int /*kind*/) {
  return refuse("addDesign");
}
bool DeviceManager::addDesign(int /*version*/, const char* /*startAddress*/, const char* /*rs*/, int /*kind*/) {
  return refuse("addDesign");
}
bool DeviceManager::removeDesign(int /*version*/) { return refuse("deleteDesign"); }
bool DeviceManager::setCurrentDesign(int /*version*/) { return refuse("setCurrentDesign"); }
bool DeviceManager::addDeviceChain(int /*index*/) { return refuse("addDeviceChain"); }
bool DeviceManager::removeDeviceChain(int /*index*/) { return refuse("deleteDeviceChain"); }
bool DeviceManager::setCurrentDeviceChain(int /*index*/) { return refuse("setCurrentDeviceChain"); }
ModeInterface* DeviceManager::createModeInterface(MODE_TYPE /*mode*/, const char* /*path*/, const char* /*name*/,
                                                  std::uint32_t /*size*/) {
  refuse("addConfigDevice");
  return nullptr;
}
bool DeviceManager::addPromDevice2PromChain(int /*position*/, std::uint32_t /*size*/, const char* /*name*/) {
  return refuse("addPromDevice");
}
bool DeviceManager::removePromDevice(int /*position*/) { return refuse("deletePromDevice"); }
bool DeviceManager::generate(UT_CMDARGS* /*switches*/) { return refuse("generate"); }

bool DeviceManager::writeProjectRepository(const StringBase& /*file*/) { return refuse("saveProjectFile"); }
bool DeviceManager::readProjectRepository(const StringBase& /*file*/) { return refuse("loadProjectFile"); }
bool DeviceManager::saveCdf(const char* /*file*/, const StringBase& /*name*/, bool /*flag*/) {
  return refuse("saveCdf");
}
bool DeviceManager::createArchive(const StringBase& /*file*/, const StringBase& /*directory*/) {
  return refuse("saveArchive");
}
bool DeviceManager::loadArchive(const StringBase& /*file*/, const StringBase& /*directory*/) {
  return refuse("loadArchive");
}
