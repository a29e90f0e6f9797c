// The static functions of the device-manager library and the external conversion utilities, answered by the
// stage in their place.

#include "interfaces/converters/Converters.h"
#include "interfaces/devicemanager/AttributeNames.h"
#include "interfaces/devicemanager/Collection.h"
#include "interfaces/devicemanager/Design.h"
#include "interfaces/devicemanager/Device.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/devicemanager/ModeInterface.h"
#include "tests/conformance/runner/CallValues.h"
#include "tests/conformance/runner/ScriptedManager.h"
#include "tests/conformance/runner/Stage.h"

namespace {

using conformance::Stage;
using conformance::toValue;
using conformance::Value;

/// The attribute of that name from the table all device managers share, unless the case gives another one.
template <class Attribute, std::size_t count>
Attribute attributeNamed(const AttributeNames::Row<Attribute> (&table)[count], const char* name) {
  const std::int64_t real = AttributeNames::find<Attribute>(table, name);
  return Attribute(Stage::current().call("string2Attribute", {toValue(name)}, toValue(real)).number);
}

}  // namespace

DeviceManagerInterface::~DeviceManagerInterface() = default;

DeviceManagerInterface* DeviceManagerInterface::getDeviceManager() {
  Stage& stage = Stage::current();
  const Value answer = stage.call("getDeviceManager", {});
  return answer.kind == Value::Kind::null ? nullptr : stage.deviceManager();
}

void DeviceManagerInterface::removeDeviceManager() {
  Stage& stage = Stage::current();
  stage.call("removeDeviceManager", {});
  stage.removeDeviceManager();
}

ModeInterface::~ModeInterface() = default;
void ModeInterface::setBatchCommandOff() { Stage::current().call("setBatchCommandOff", {}); }
void ModeInterface::setBatchCommandOn() { Stage::current().call("setBatchCommandOn", {}); }

DeviceNS::ATTRIBUTE Device::string2Attribute(const char* name) { return attributeNamed(AttributeNames::device, name); }

CollectionNS::ATTRIBUTE Collection::string2Attribute(const char* name) {
  return attributeNamed(AttributeNames::collection, name);
}

DesignNS::ATTRIBUTE Design::string2Attribute(const char* name) { return attributeNamed(AttributeNames::design, name); }

ConfigDeviceNS::ATTRIBUTE conformance::ScriptedManager::string2Attribute(const char* name) {
  return attributeNamed(AttributeNames::configDevice, name);
}

bool ObaInterface(int count, const char* const* words) {
  return Stage::current().call("ObaInterface", {conformance::wordList(count, words)}).number != 0;
}

int playCsvfInterface(int count, const char* const* words) {
  return static_cast<int>(Stage::current().call("playCsvfInterface", {conformance::wordList(count, words)}).number);
}

int svf2CsvfInterface(int count, const char* const* words) {
  return static_cast<int>(Stage::current().call("svf2CsvfInterface", {conformance::wordList(count, words)}).number);
}
