// What the bundled device manager can't do yet: every operation here is about the content of the formatter modes,
// projects or archives, and refuses with one error that names the operation.

#include "manager/manager/DeviceManager.h"
#include "manager/support/Report.h"

namespace {

bool refuse(const char* operation) { return reportError("%s is not built yet.\n", operation); }

}  // namespace

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
