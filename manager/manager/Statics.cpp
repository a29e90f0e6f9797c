// The functions that a device-manager library owes its hosts beside the facade itself.

#include <memory>

#include "interfaces/devicemanager/AttributeNames.h"
#include "interfaces/devicemanager/Collection.h"
#include "interfaces/devicemanager/Design.h"
#include "interfaces/devicemanager/Device.h"
#include "interfaces/devicemanager/ModeInterface.h"
#include "manager/manager/DeviceManager.h"

namespace {

std::unique_ptr<DeviceManager>& theDeviceManager() {
  static std::unique_ptr<DeviceManager> manager;
  return manager;
}

}  // namespace

DeviceManagerInterface::~DeviceManagerInterface() = default;
ModeInterface::~ModeInterface() = default;

DeviceManagerInterface* DeviceManagerInterface::getDeviceManager() {
  if (theDeviceManager() == nullptr) theDeviceManager() = std::make_unique<DeviceManager>();
  return theDeviceManager().get();
}

void DeviceManagerInterface::removeDeviceManager() { theDeviceManager().reset(); }

void ModeInterface::setBatchCommandOff() { DeviceManager::recording = false; }
void ModeInterface::setBatchCommandOn() { DeviceManager::recording = true; }

DeviceNS::ATTRIBUTE Device::string2Attribute(const char* name) {
  return AttributeNames::find<DeviceNS::ATTRIBUTE>(AttributeNames::device, name);
}
CollectionNS::ATTRIBUTE Collection::string2Attribute(const char* name) {
  return AttributeNames::find<CollectionNS::ATTRIBUTE>(AttributeNames::collection, name);
}
DesignNS::ATTRIBUTE Design::string2Attribute(const char* name) {
  return AttributeNames::find<DesignNS::ATTRIBUTE>(AttributeNames::design, name);
}
ConfigDeviceNS::ATTRIBUTE DeviceManager::string2Attribute(const char* name) {
  return AttributeNames::find<ConfigDeviceNS::ATTRIBUTE>(AttributeNames::configDevice, name);
}
