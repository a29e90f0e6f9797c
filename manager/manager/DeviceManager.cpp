#include "manager/manager/DeviceManager.h"

#include "interfaces/constraints/ModeKeywords.h"
#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/Port_MsgManDefault.h"
#include "interfaces/portability/UT_STR.h"
#include "manager/support/Report.h"

bool DeviceManager::recording = true;

namespace {

const char* keyword(tESSELNS::MODE_TYPE mode) {
  const char* name = "";
  // The last keyword of a mode is its long one.
  for (const ModeKeywords::Mode& row : ModeKeywords::modes)
    if (row.mode == mode) name = row.keyword;
  return name;
}

const char* keyword(tESSELNS::MODE_TYPE mode, tESSELNS::SUBMODE_TYPE submode) {
  for (const ModeKeywords::Submode& row : ModeKeywords::submodes)
    if (row.requiredMode == mode && row.submode == submode) return row.keyword;
  return "";
}

/// A value as a word of a command line.
std::string quoted(const char* value) {
  const std::string text = value;
  return text.empty() || text.find_first_of(" \t") != std::string::npos ? "\"" + text + "\"" : text;
}

}  // namespace

DeviceManager::DeviceManager() = default;
DeviceManager::~DeviceManager() { disconnect(); }

bool DeviceManager::setMode(MODE_TYPE mode, bool makeActive) {
  if (mode < tESSELNS::BOUNDARY_SCAN || mode > tESSELNS::PROM_FILE_FORMATTER)
    return reportError("There is no mode %d.\n", mode);
  const bool changed = mode_ != mode || (makeActive && activeMode_ != mode);
  mode_ = mode;
  if (changed) submodeSet_ = false;
  if (makeActive) activeMode_ = mode;
  if (changed) recordStep(Port::format("setMode -%s", keyword(mode)));
  return true;
}

bool DeviceManager::setSubmode(SUBMODE_TYPE submode) {
  const char* name = keyword(activeMode_, submode);
  if (*name == '\0') return reportError("Mode %d has no submode %d.\n", activeMode_, submode);
  const bool changed = !submodeSet_ || submode_ != submode;
  submode_ = submode;
  submodeSet_ = true;
  if (changed) recordStep(Port::format("setSubmode -%s", name));
  return true;
}

bool DeviceManager::clearMode(MODE_TYPE mode) {
  chains_.erase(mode);
  return true;
}

bool DeviceManager::clearAllModes() {
  chains_.clear();
  return true;
}

void DeviceManager::setTargetDevice(MODE_TYPE mode, int position, bool attached) {
  const Target target{mode, position, attached};
  if (target == target_) return;
  target_ = target;
  recordStep(Port::format("setTargetDevice -p %d%s", position + 1, attached ? " -attached" : ""));
}

void DeviceManager::getTargetDevice(MODE_TYPE& mode, int& position, bool& attached) {
  mode = target_.mode;
  position = target_.position;
  attached = target_.attached;
}

bool DeviceManager::setPreference(TesselPreference::PREFERENCE preference, const char* value) {
  TesselPreference& preferences = TesselPreference::getPreferenceObject();
  if (preference == TesselPreference::unknown) {
    std::string names;
    for (int i = 0; i < TesselPreference::count; ++i)
      names += std::string(" ") + TesselPreference::pref2String(static_cast<TesselPreference::PREFERENCE>(i));
    return reportError("Unknown preference. There are:%s.\n", names);
  }
  const std::string before = preferences.get(preference);
  if (!preferences.set(preference, value))
    return reportError("Preference %s can't be \"%s\", expected %s.\n", TesselPreference::pref2String(preference),
                       value, TesselPreference::expectedValue(preference));
  if (preference == TesselPreference::lineWidth)
    Port_MsgDispatcher::getDefaultMsgMan()->setMaxLineWidth(preferences.getNumber(preference));
  if (before != value)
    recordStep(Port::format("setPreference -pref %s:%s", TesselPreference::pref2String(preference), value));
  return true;
}

bool DeviceManager::store(std::string& field, const char* value, const std::string& step) {
  if (field == value) return true;
  field = value;
  recordStep(step);
  return true;
}

bool DeviceManager::setMbBpiDevice(const char* device) {
  return store(multiboot_.device, device, "setMbBpiDevice -device " + quoted(device));
}

bool DeviceManager::setMbBpiType(const char* type) {
  return store(multiboot_.type, type, "setMbBpiType -type " + quoted(type));
}

bool DeviceManager::setMbBpiChain(const char* chain) {
  return store(multiboot_.chain, chain, "SetMbBpiChain " + quoted((std::string("-") + chain).c_str()));
}

bool DeviceManager::setBpiWidth(MODE_TYPE /*mode*/, const char* width) {
  return store(multiboot_.width, width, "SetBpiWidth -width " + quoted(width));
}

bool DeviceManager::writeBatchCommand(const StringBase& line) { return batchCommands_.write(std::string(line.view())); }

void DeviceManager::setBatchCommandFile(const char* file) { batchCommands_.rename(file); }

void DeviceManager::recordStep(const std::string& line) {
  const bool wanted =
      UT_STR::ICompare(TesselPreference::getPreferenceObject().get(TesselPreference::recordSteps), "true") == 0;
  if (recording && wanted) batchCommands_.write(line);
}

void DeviceManager::setCallbackFunction(bool (*function)(Callback&)) { progress_ = function; }
