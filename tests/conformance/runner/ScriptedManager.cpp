#include "tests/conformance/runner/ScriptedManager.h"

#include <algorithm>

namespace conformance {

// Mode, submode, target, preferences.

DeviceManagerInterface::MODE_TYPE ScriptedManager::getMode() { return MODE_TYPE(number("getMode")); }
DeviceManagerInterface::MODE_TYPE ScriptedManager::getActiveMode() { return MODE_TYPE(number("getActiveMode")); }
bool ScriptedManager::setMode(MODE_TYPE mode, bool makeActive) { return succeeds("setMode", mode, makeActive); }
DeviceManagerInterface::SUBMODE_TYPE ScriptedManager::getSubmode() { return SUBMODE_TYPE(number("getSubmode")); }
bool ScriptedManager::setSubmode(SUBMODE_TYPE submode) { return succeeds("setSubmode", submode); }
bool ScriptedManager::clearMode(MODE_TYPE mode) { return succeeds("clearMode", mode); }
bool ScriptedManager::clearAllModes() { return succeeds("clearAllModes"); }

void ScriptedManager::setTargetDevice(MODE_TYPE mode, int position, bool attached) {
  ask("setTargetDevice", mode, position, attached);
}

void ScriptedManager::getTargetDevice(MODE_TYPE& mode, int& position, bool& attached) {
  const Value target = ask("getTargetDevice");
  mode = MODE_TYPE(target.items[0].number);
  position = static_cast<int>(target.items[1].number);
  attached = target.items[2].number != 0;
}

bool ScriptedManager::setPreference(TesselPreference::PREFERENCE preference, const char* value) {
  return succeeds("setPreference", preference, value);
}
bool ScriptedManager::setMbBpiDevice(const char* device) { return succeeds("setMbBpiDevice", device); }
bool ScriptedManager::setMbBpiType(const char* type) { return succeeds("setMbBpiType", type); }
bool ScriptedManager::setMbBpiChain(const char* chain) { return succeeds("setMbBpiChain", chain); }
bool ScriptedManager::setBpiWidth(MODE_TYPE mode, const char* width) { return succeeds("setBpiWidth", mode, width); }

// Cable.

bool ScriptedManager::setCable(const char* type, int port, int baud, bool open, const char* server, bool quiet) {
  return succeeds("setCable", type, port, baud, open, server, quiet);
}
bool ScriptedManager::lockCable(int tries) { return succeeds("lockCable", tries); }
bool ScriptedManager::unlockCable() { return succeeds("unlockCable"); }
bool ScriptedManager::closeCable(bool final) { return succeeds("closeCable", final); }
int ScriptedManager::setCableSpeed(int speed) { return static_cast<int>(number("setCableSpeed", speed)); }
bool ScriptedManager::setCableOption(const char* name, const char* value) {
  return succeeds("setCableOption", name, value);
}
bool ScriptedManager::runDiagnostics() { return succeeds("runDiagnostics"); }
bool ScriptedManager::info() { return succeeds("info"); }

// Recording.

bool ScriptedManager::writeBatchCommand(const StringBase& line) { return succeeds("writeBatchCommand", line); }
void ScriptedManager::setBatchCommandFile(const char* file) { ask("setBatchCommandFile", file); }

// Operations.

void ScriptedManager::setCallbackFunction(bool (*function)(Callback&)) {
  stage_.setProgressFunction(function);
  ask("setCallbackFunction");
}

bool ScriptedManager::performOperation(int count, const char* const* words) {
  return succeeds("performOperation", wordList(count, words));
}

const char* ScriptedManager::getAttribute(int number) { return keep(ask("getAttribute", number)); }

DeviceOptionsMgr* ScriptedManager::getDeviceOptionsMgr(MODE_TYPE mode, int position, bool attachedFlash) {
  const auto options = [&](const char* name) {
    std::vector<StringBase> words;
    for (const Value& word : ask(name, mode, position, attachedFlash).items) words.emplace_back(word.text.c_str());
    return words;
  };
  ask("getDeviceOptionsMgr", mode, position, attachedFlash);
  DeviceOptionsMgr& manager = options_[DeviceKey(mode, position, attachedFlash)];
  manager.setProgramOptions(options("getProgramOptions"));
  manager.setVerifyOptions(options("getVerifyOptions"));
  manager.setEraseOptions(options("getEraseOptions"));
  constexpr int onlyFpga = U_OptionsMgr::onlyFpga;
  manager.setOption(onlyFpga, succeeds("isOptionSet", mode, position, attachedFlash, onlyFpga));
  return &manager;
}

// The current chain.

int ScriptedManager::getDeviceChainCount() { return static_cast<int>(number("getDeviceChainCount")); }
bool ScriptedManager::addDeviceByPart(int position, const char* part) {
  return succeeds("addDeviceByPart", position, part);
}
bool ScriptedManager::addDeviceByFile(int position, const char* file, const char* bmmFile,
                                      std::vector<StringBase> extraFiles) {
  return succeeds("addDeviceByFile", position, file, bmmFile, extraFiles);
}
bool ScriptedManager::addCoreFiles(int position, CoreFiles files) { return succeeds("addCoreFiles", position, files); }
bool ScriptedManager::clearCoreFiles(int position, int core) { return succeeds("clearCoreFiles", position, core); }
bool ScriptedManager::addExtraFiles(int position, std::vector<StringBase> files) {
  return succeeds("addExtraFiles", position, files);
}
bool ScriptedManager::clearAdditionalConfigFiles(int position) {
  return succeeds("clearAdditionalConfigFiles", position);
}
bool ScriptedManager::assignFile(int position, const char* file) { return succeeds("assignFile", position, file); }
bool ScriptedManager::removeDevice(int position) { return succeeds("removeDevice", position); }
bool ScriptedManager::attachDeviceByPart(int position, FLASH_TYPE type, const char* part) {
  return succeeds("attachDeviceByPart", position, type, part);
}
bool ScriptedManager::assignFileToFlashDevice(int position, FLASH_TYPE type, const char* file) {
  return succeeds("assignFileToFlashDevice", position, type, file);
}
bool ScriptedManager::deleteAttachedDevice(int position) { return succeeds("deleteAttachedDevice", position); }

// Attributes.

const char* ScriptedManager::getDeviceAttribute(int position, DeviceNS::ATTRIBUTE attribute) {
  return keep(ask("getDeviceAttribute", position, attribute));
}
bool ScriptedManager::setDeviceAttribute(int position, DeviceNS::ATTRIBUTE attribute, const char* value, bool quiet) {
  return succeeds("setDeviceAttribute", position, attribute, value, quiet);
}
bool ScriptedManager::setAttribute(int position, MODE_TYPE mode, DeviceNS::ATTRIBUTE attribute, const char* value,
                                   bool attached) {
  return succeeds("setAttribute", position, mode, attribute, value, attached);
}
bool ScriptedManager::setAttribute(ConfigDeviceNS::ATTRIBUTE attribute, const char* value) {
  return succeeds("setAttribute", attribute, value);
}
bool ScriptedManager::setAttribute(CollectionNS::ATTRIBUTE attribute, const char* value) {
  return succeeds("setAttribute", attribute, value);
}
bool ScriptedManager::setAttribute(DesignNS::ATTRIBUTE attribute, const char* value) {
  return succeeds("setAttribute", attribute, value);
}

// Content of the formatter and configuration-system modes.

int ScriptedManager::getNumberCollections() { return static_cast<int>(number("getNumberCollections")); }
int ScriptedManager::getNumberDesigns() { return static_cast<int>(number("getNumberDesigns")); }
int ScriptedManager::getNumberDeviceChains() { return static_cast<int>(number("getNumberDeviceChains")); }
bool ScriptedManager::addCollection(const char* name) { return succeeds("addCollection", name); }
bool ScriptedManager::removeCollection(const char* name) { return succeeds("removeCollection", name); }
bool ScriptedManager::renameCollection(const char* oldName, const char* newName) {
  return succeeds("renameCollection", oldName, newName);
}
bool ScriptedManager::setCurrentCollection(const char* name) { return succeeds("setCurrentCollection", name); }
const char* ScriptedManager::getCurrentCollectionName() { return keep(ask("getCurrentCollectionName")); }
bool ScriptedManager::addDesign(int version, const char* value, bool data, const char* rs, int kind) {
  return succeeds("addDesign", version, value, data, rs, kind);
}
bool ScriptedManager::addDesign(int version, const char* startAddress, const char* rs, int kind) {
  return succeeds("addDesign", version, startAddress, rs, kind);
}
bool ScriptedManager::removeDesign(int version) { return succeeds("removeDesign", version); }
bool ScriptedManager::setCurrentDesign(int version) { return succeeds("setCurrentDesign", version); }
bool ScriptedManager::addDeviceChain(int index) { return succeeds("addDeviceChain", index); }
bool ScriptedManager::removeDeviceChain(int index) { return succeeds("removeDeviceChain", index); }
bool ScriptedManager::setCurrentDeviceChain(int index) { return succeeds("setCurrentDeviceChain", index); }

ModeInterface* ScriptedManager::createModeInterface(MODE_TYPE mode, const char* path, const char* name,
                                                    std::uint32_t size) {
  const Value answer = ask("createModeInterface", mode, path, name, size);
  return answer.kind == Value::Kind::null ? nullptr : &modeInterface_;
}
bool ScriptedManager::addPromDevice2PromChain(int position, std::uint32_t size, const char* name) {
  return succeeds("addPromDevice2PromChain", position, size, name);
}
bool ScriptedManager::removePromDevice(int position) { return succeeds("removePromDevice", position); }
bool ScriptedManager::generate(UT_CMDARGS* switches) { return succeeds("generate", parsedWords(switches)); }

// Project files.

bool ScriptedManager::writeProjectRepository(const StringBase& file) {
  return succeeds("writeProjectRepository", file);
}
bool ScriptedManager::readProjectRepository(const StringBase& file) { return succeeds("readProjectRepository", file); }
bool ScriptedManager::saveCdf(const char* file, const StringBase& name, bool flag) {
  return succeeds("saveCdf", file, name, flag);
}
bool ScriptedManager::createArchive(const StringBase& file, const StringBase& directory) {
  return succeeds("createArchive", file, directory);
}
bool ScriptedManager::loadArchive(const StringBase& file, const StringBase& directory) {
  return succeeds("loadArchive", file, directory);
}

// Texts that are given back.

const char* ScriptedManager::keep(const Value& text) {
  if (text.kind == Value::Kind::null) return nullptr;
  return texts_.emplace_back(text.text).c_str();
}

void ScriptedManager::crossOutTexts() {
  if (!texts_.empty()) std::fill(texts_.back().begin(), texts_.back().end(), '#');
}

}  // namespace conformance
