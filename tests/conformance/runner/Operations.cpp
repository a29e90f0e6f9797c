#include "tests/conformance/runner/Operations.h"

#include <algorithm>

namespace conformance {
namespace {

constexpr Operation table[] = {
    // Statics of the device manager.
    {"getDeviceManager", 0, Answer::object, "interface"},
    {"removeDeviceManager", 0, Answer::none, ""},
    // Mode, submode, target, preferences.
    {"getMode", 0, Answer::number, "9"},
    {"getActiveMode", 0, Answer::number, "9"},
    {"setMode", 2, Answer::boolean, "true"},
    {"getSubmode", 0, Answer::number, "0"},
    {"setSubmode", 1, Answer::boolean, "true"},
    {"clearMode", 1, Answer::boolean, "true"},
    {"clearAllModes", 0, Answer::boolean, "true"},
    {"setTargetDevice", 3, Answer::none, ""},
    {"getTargetDevice", 0, Answer::target, "(9, -1, false)"},
    {"setPreference", 2, Answer::boolean, "true"},
    {"setMbBpiDevice", 1, Answer::boolean, "true"},
    {"setMbBpiType", 1, Answer::boolean, "true"},
    {"setMbBpiChain", 1, Answer::boolean, "true"},
    {"setBpiWidth", 2, Answer::boolean, "true"},
    // Cable.
    {"setCable", 6, Answer::boolean, "true"},
    {"lockCable", 1, Answer::boolean, "true"},
    {"unlockCable", 0, Answer::boolean, "true"},
    {"closeCable", 1, Answer::boolean, "true"},
    {"setCableSpeed", 1, Answer::number, "0"},
    {"setCableOption", 2, Answer::boolean, "true"},
    {"runDiagnostics", 0, Answer::boolean, "true"},
    {"info", 0, Answer::boolean, "true"},
    // Recording.
    {"writeBatchCommand", 1, Answer::boolean, "true"},
    {"setBatchCommandFile", 1, Answer::none, ""},
    {"setBatchCommandOff", 0, Answer::none, ""},
    {"setBatchCommandOn", 0, Answer::none, ""},
    // Operations.
    {"setCallbackFunction", 0, Answer::none, ""},
    {"performOperation", 1, Answer::boolean, "true"},
    {"getAttribute", 1, Answer::text, "null"},
    {"getDeviceOptionsMgr", 3, Answer::none, ""},  // answers by the four questions below
    {"getProgramOptions", 3, Answer::options, "[]"},
    {"getVerifyOptions", 3, Answer::options, "[]"},
    {"getEraseOptions", 3, Answer::options, "[]"},
    {"isOptionSet", 4, Answer::boolean, "false"},
    // The current chain.
    {"getDeviceChainCount", 0, Answer::number, "0"},
    {"addDeviceByPart", 2, Answer::boolean, "true"},
    {"addDeviceByFile", 4, Answer::boolean, "true"},
    {"addCoreFiles", 2, Answer::boolean, "true"},
    {"clearCoreFiles", 2, Answer::boolean, "true"},
    {"addExtraFiles", 2, Answer::boolean, "true"},
    {"clearAdditionalConfigFiles", 1, Answer::boolean, "true"},
    {"assignFile", 2, Answer::boolean, "true"},
    {"removeDevice", 1, Answer::boolean, "true"},
    {"attachDeviceByPart", 3, Answer::boolean, "true"},
    {"assignFileToFlashDevice", 3, Answer::boolean, "true"},
    {"deleteAttachedDevice", 1, Answer::boolean, "true"},
    // Attributes.
    {"getDeviceAttribute", 2, Answer::text, "null"},
    {"setDeviceAttribute", 4, Answer::boolean, "true"},
    {"setAttribute", 2, Answer::boolean, "true"},
    {"setAttribute", 5, Answer::boolean, "true"},
    {"string2Attribute", 1, Answer::number, "-1"},  // the fallback is the real table's answer
    // Content of the formatter and configuration-system modes.
    {"getNumberCollections", 0, Answer::number, "0"},
    {"getNumberDesigns", 0, Answer::number, "0"},
    {"getNumberDeviceChains", 0, Answer::number, "0"},
    {"addCollection", 1, Answer::boolean, "true"},
    {"removeCollection", 1, Answer::boolean, "true"},
    {"renameCollection", 2, Answer::boolean, "true"},
    {"setCurrentCollection", 1, Answer::boolean, "true"},
    {"getCurrentCollectionName", 0, Answer::text, "\"\""},
    {"addDesign", 5, Answer::boolean, "true"},
    {"addDesign", 4, Answer::boolean, "true"},
    {"removeDesign", 1, Answer::boolean, "true"},
    {"setCurrentDesign", 1, Answer::boolean, "true"},
    {"addDeviceChain", 1, Answer::boolean, "true"},
    {"removeDeviceChain", 1, Answer::boolean, "true"},
    {"setCurrentDeviceChain", 1, Answer::boolean, "true"},
    {"createModeInterface", 4, Answer::object, "interface"},
    {"addPromDevice2PromChain", 3, Answer::boolean, "true"},
    {"removePromDevice", 1, Answer::boolean, "true"},
    {"generate", 1, Answer::boolean, "true"},
    // Project files.
    {"writeProjectRepository", 1, Answer::boolean, "true"},
    {"readProjectRepository", 1, Answer::boolean, "true"},
    {"saveCdf", 3, Answer::boolean, "true"},
    {"createArchive", 2, Answer::boolean, "true"},
    {"loadArchive", 2, Answer::boolean, "true"},
    // External conversion utilities.
    {"ObaInterface", 1, Answer::boolean, "true"},
    {"playCsvfInterface", 1, Answer::number, "1"},
    {"svf2CsvfInterface", 1, Answer::number, "1"},
};

bool areTexts(const Value& list) {
  return std::all_of(list.items.begin(), list.items.end(),
                     [](const Value& item) { return item.kind == Value::Kind::text; });
}

bool isTarget(const Value& tuple) {
  const std::vector<Value>& items = tuple.items;
  return items.size() == 3 && items[0].kind == Value::Kind::number && items[1].kind == Value::Kind::number &&
         items[2].kind == Value::Kind::boolean;
}

}  // namespace

std::span<const Operation> operations() { return table; }

const Operation* findOperation(std::string_view name, int arguments) {
  for (const Operation& operation : table)
    if (operation.name == name && (arguments < 0 || operation.arguments == arguments)) return &operation;
  return nullptr;
}

bool isOperation(std::string_view name) { return findOperation(name, -1) != nullptr; }

bool isTraced(std::string_view name) {
  return !name.starts_with("get") && name != "isOptionSet" && !name.starts_with("string2");
}

bool fits(Answer answer, const Value& value) {
  if (value.kind == Value::Kind::exception) return true;
  switch (answer) {
    case Answer::none:
      return false;
    case Answer::boolean:
      return value.kind == Value::Kind::boolean;
    case Answer::number:
      return value.kind == Value::Kind::number;
    case Answer::text:
      return value.kind == Value::Kind::text || value.kind == Value::Kind::null;
    case Answer::options:
      return value.kind == Value::Kind::list && areTexts(value);
    case Answer::target:
      return value.kind == Value::Kind::tuple && isTarget(value);
    case Answer::object:
      return value.kind == Value::Kind::modeInterface || value.kind == Value::Kind::null;
  }
  return false;
}

}  // namespace conformance
