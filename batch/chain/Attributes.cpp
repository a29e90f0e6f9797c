#include <optional>

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Record.h"
#include "batch/Switches.h"
#include "interfaces/devicemanager/Collection.h"
#include "interfaces/devicemanager/Design.h"
#include "interfaces/devicemanager/Device.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_STR.h"

using Messages::failure;

namespace {

struct Setting {
  const char* name;
  const char* value;
};

bool setOnDevice(CmdParser& session, const UT_CMDARGS& args, int position, const Setting& setting) {
  DeviceManagerInterface& manager = *session.deviceManager;
  const int count = manager.getDeviceChainCount();
  if (position >= count)
    return failure(count == 1 ? "There is only %d device on the chain. Position %d does not exist.\n"
                              : "There are only %d devices on the chain. Position %d does not exist.\n",
                   count, position + 1);
  const DeviceNS::ATTRIBUTE attribute = Device::string2Attribute(setting.name);
  if (attribute == DeviceNS::CONFIG_FILE_NAME) return manager.assignFile(position, setting.value);
  if (args.findsw("-attached"))
    return manager.setAttribute(position, manager.getMode(), attribute, setting.value, true);
  return manager.setDeviceAttribute(position, attribute, setting.value, false);
}

bool setOnCollection(CmdParser& session, const Setting& setting) {
  if (!session.checkFormatterMode()) return false;
  if (session.deviceManager->getNumberCollections() == 0)
    return failure("There are no collections in current mode. Please use addCollection.\n");
  return session.deviceManager->setAttribute(Collection::string2Attribute(setting.name), setting.value);
}

bool setOnDesign(CmdParser& session, const Setting& setting) {
  if (!session.checkFormatterMode()) return false;
  if (session.deviceManager->getNumberDesigns() == 0)
    return failure("There are no designs in current mode. Please use addDesign.\n");
  return session.deviceManager->setAttribute(Design::string2Attribute(setting.name), setting.value);
}

}  // namespace

bool CmdParser::setAttribute(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const UT_CMDSWINFO* name = args.getsw("-attr", 0);
  if (name == nullptr) return failure("Attribute is required.\n");
  const UT_CMDSWINFO* value = args.getsw("-value", 0);
  if (value == nullptr) return failure("Attribute value is required.\n");
  const Setting setting{name->getargtxt(0), value->getargtxt(0)};
  if (const UT_CMDSWINFO* position = findSwitch(args, "-position", "-p"))
    return setOnDevice(*this, args, position->getargnum(0), setting);
  if (args.findsw("-configdevice") || UT_STR::ICompare(setting.name, "DIR") == 0)
    return checkFormatterMode() &&
           deviceManager->setAttribute(deviceManager->string2Attribute(setting.name), setting.value);
  if (args.findsw("-collection")) return setOnCollection(*this, setting);
  if (args.findsw("-design")) return setOnDesign(*this, setting);
  return false;
}

bool CmdParser::setConfigDeviceAttribute(ConfigDeviceNS::ATTRIBUTE attribute, const char* value, bool quiet) {
  std::optional<RecordingPause> pause;
  if (quiet) pause.emplace();
  return deviceManager->setAttribute(attribute, value);
}
