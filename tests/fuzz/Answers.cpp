#include "tests/fuzz/Answers.h"

#include <array>
#include <charconv>
#include <limits>

#include "interfaces/devicemanager/DeviceNS.h"
#include "interfaces/utility/Callback.h"
#include "interfaces/utility/U_OptionsMgr.h"
#include "tests/conformance/runner/CallValues.h"
#include "tests/conformance/runner/Operations.h"

namespace fuzz {
namespace {

using conformance::Answer;
using conformance::toValue;
using conformance::Value;

Value textValue(const char* text) { return toValue(text); }

Value texts(std::initializer_list<const char*> words) {
  std::vector<Value> items;
  for (const char* word : words) items.push_back(textValue(word));
  return Value(Value::Kind::list, std::move(items));
}

/// What a call answers when it fails; `Value::Kind::none` when it cannot.
Value failureOf(std::string_view name) {
  const conformance::Operation* const operation = conformance::findOperation(name, -1);
  if (operation == nullptr) return {};
  switch (operation->answer) {
    case Answer::boolean:
      return toValue(false);
    case Answer::number:
      return toValue(0);
    case Answer::text:
    case Answer::object:
      return Value(Value::Kind::null);
    default:
      return {};
  }
}

/// 0 to 35 for a digit or a small letter, -1 for any other character.
int choiceOf(char character) {
  if (character >= '0' && character <= '9') return character - '0';
  if (character >= 'a' && character <= 'z') return character - 'a' + 10;
  return -1;
}

constexpr int mostDevices = 35;  // stands for a number that 16 bits do not hold

}  // namespace

Answers::Answers(std::string_view line) {
  bool first = true;
  while (!line.empty()) {
    const std::string_view word = line.substr(0, line.find(' '));
    line.remove_prefix(std::min(word.size() + 1, line.size()));
    if (first)
      choose(word);
    else
      takeWord(word);
    first = false;
  }
}

void Answers::choose(std::string_view choices) {
  std::array<int, 10> chosen{};
  chosen.fill(-1);
  for (std::size_t i = 0; i < chosen.size() && i < choices.size(); ++i) chosen[i] = choiceOf(choices[i]);
  const auto [mode, active, submode, chain, content, attributes, collection, target, options, events] = chosen;
  constexpr int modes = 10;
  constexpr int submodes = 7;
  if (mode >= 0) giveNumber("getMode", mode % modes);
  if (active >= 0) giveNumber("getActiveMode", active % modes);
  if (submode >= 0) giveNumber("getSubmode", submode % submodes);
  if (chain >= 0) giveNumber("getDeviceChainCount", chain == mostDevices ? 40000 : chain);
  chooseContent(content);
  chooseAttributes(attributes);
  chooseCollection(collection);
  chooseTarget(target);
  chooseOptions(options);
  chooseEvents(events);
}

void Answers::takeWord(std::string_view word) {
  if (word == "log") batchLog = true;
  if (word == "throw")
    give("addPromDevice2PromChain", Value(Value::Kind::exception, std::string("ACDEntryNotFoundException")));
  if (!word.starts_with('!')) return;
  word.remove_prefix(1);
  const std::string_view name = word.substr(0, word.find('@'));
  const std::string_view digits = word.substr(std::min(name.size() + 1, word.size()));
  int occurrence = 0;
  std::from_chars(digits.data(), digits.data() + digits.size(), occurrence);
  Value failure = failureOf(name);
  if (failure.kind != Value::Kind::none) give(name, std::move(failure), occurrence);
}

void Answers::give(std::string_view call, Value answer, int occurrence) {
  script.givens.push_back({{std::string(call), std::nullopt, occurrence}, std::move(answer)});
}

void Answers::giveNumber(std::string_view call, std::int64_t number) { give(call, toValue(number)); }

void Answers::giveAttribute(int attribute, const char* text) {
  std::vector<Value> arguments{Value(Value::Kind::any), toValue(static_cast<DeviceNS::ATTRIBUTE>(attribute))};
  script.givens.push_back({{"getDeviceAttribute", std::move(arguments), 0}, textValue(text)});
}

void Answers::chooseContent(int choice) {
  if (choice < 0) return;
  giveNumber("getNumberCollections", choice & 1);
  giveNumber("getNumberDesigns", (choice >> 1) & 1);
  giveNumber("getNumberDeviceChains", (choice >> 2) & 1);
}

void Answers::chooseAttributes(int choice) {
  if (choice < 0) return;
  if (choice == 0) giveAttribute(DeviceNS::NAME, "unknown");
  if (choice == 9) giveAttribute(DeviceNS::NAME, "marlin3-1");
  if ((choice & 1) != 0) giveAttribute(DeviceNS::SPI_PART, "W25Q128");
  if ((choice & 2) != 0) giveAttribute(DeviceNS::SPI_FILE, "flash.mcs");
  if ((choice & 4) != 0) giveAttribute(DeviceNS::BPI_PART, "28F128");
  if ((choice & 8) != 0) giveAttribute(DeviceNS::BPI_FILE, "flash.exo");
}

void Answers::chooseCollection(int choice) {
  static constexpr const char* names[] = {"c1", "", "-output", "two words"};
  if (choice >= 0) give("getCurrentCollectionName", textValue(names[choice % 4]));
}

void Answers::chooseTarget(int choice) {
  struct Target {
    int mode;
    int position;
    bool attached;
  };
  static constexpr Target targets[] = {{0, 0, false}, {0, 1, false}, {0, 1, true},
                                       {5, 1, false}, {4, 0, true},  {8, 2147483647, false}};
  if (choice < 0) return;
  const Target& target = targets[choice % 6];
  give("getTargetDevice",
       Value(Value::Kind::tuple, {toValue(target.mode), toValue(target.position), toValue(target.attached)}));
}

void Answers::chooseOptions(int choice) {
  if (choice < 0) return;
  const Value words = choice % 2 == 0 ? texts({"-e", "-v"}) : texts({"", "-usercode", "00FF"});
  for (const char* call : {"getProgramOptions", "getVerifyOptions", "getEraseOptions"}) give(call, words);
  if (choice >= 2) give("isOptionSet", toValue(true));
}

void Answers::chooseEvents(int choice) {
  constexpr std::int32_t smallest = std::numeric_limits<std::int32_t>::min();
  constexpr std::int32_t largest = std::numeric_limits<std::int32_t>::max();
  using Kind = conformance::During::Kind;
  const conformance::CallPattern operation{"performOperation", std::nullopt, 0};
  const conformance::CallPattern question{"getDeviceChainCount", std::nullopt, 0};
  if (choice == 1)
    for (const std::array<std::int32_t, 3> progress :
         {std::array{std::int32_t{Callback::start}, 0, 9}, std::array{std::int32_t{Callback::update}, 5, 9},
          std::array{std::int32_t{Callback::end}, 9, 9}})
      script.durings.push_back({operation, Kind::progress, progress, 0});
  if (choice == 2)
    for (const std::int32_t total : {0, -1, smallest, largest})
      script.durings.push_back({operation, Kind::progress, {Callback::update, smallest, total}, 0});
  if (choice == 3) script.durings.push_back({operation, Kind::consoleEvent, {}, 0});
  if (choice == 4) script.durings.push_back({operation, Kind::consoleEvent, {}, 2});
  if (choice == 5) script.durings.push_back({question, Kind::consoleEvent, {}, 0});
}

}  // namespace fuzz
