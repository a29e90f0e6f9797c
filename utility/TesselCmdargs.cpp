#include "interfaces/utility/TesselCmdargs.h"

#include <algorithm>
#include <string>
#include <string_view>

#include "interfaces/portability/Port_MsgManData.h"
#include "interfaces/portability/UT_STR.h"
#include "utility/CommandTable.h"

using namespace CommandTable;

namespace {

template <class... Arguments>
[[noreturn]] void reject(const char* format, const Arguments&... arguments) {
  const std::string text = Port::format(format, arguments...);
  Port_MsgManData::createObject("tESSEL", "../s/TesselCmdargs", __LINE__, "").issueError("%s\n", text);
  throw InvalidArgumentException(text);
}

const Switch* findSwitch(std::span<const Switch> switches, const char* name) {
  for (const Switch& each : switches)
    if (UT_STR::ICompare(each.name, name) == 0) return &each;
  return nullptr;
}

const Switch* findSwitch(const Command& command, const char* name) {
  const Switch* found = findSwitch(command.common, name);
  return found != nullptr ? found : findSwitch(command.own, name);
}

/// Whether a word of the line may be a key, in its place or out of it.
bool holdsKey(const Command& command, const UT_CMDARGS& given) {
  if (command.secret) return true;
  for (int i = 0; i < given.getnumsw(); ++i)
    if (UT_STR::INCompare(given.getsw(i)->getswname(), "-key", 4) == 0) return true;
  return false;
}

/// A line under check.
struct Line {
  const Command& command;
  const UT_CMDARGS& given;

  /// A word as it may stand in a message.
  const char* shown(const char* word) const { return holdsKey(command, given) ? "(not shown)" : word; }
  /// The same for a switch: only one such as `-key=...` may hold the key.
  const char* shownSwitch(const char* name) const {
    return UT_STR::INCompare(name, "-key", 4) == 0 ? shown(name) : name;
  }
};

std::string switchNames(const Command& command) {
  std::string names;
  for (const auto& switches : {command.common, command.own})
    for (const Switch& each : switches) names += (names.empty() ? "" : " ") + std::string(each.name);
  return names.empty() ? "no switches" : names;
}

/// A whole decimal number with or without a sign, of any size.
bool isNumber(const char* text) {
  if (*text == '-' || *text == '+') ++text;
  if (*text == '\0') return false;
  while (*text >= '0' && *text <= '9') ++text;
  return *text == '\0';
}

bool wantsNumber(const Switch& row, int index) {
  return row.kind == Kind::number || (row.kind == Kind::numberThenText && index == 0);
}

void checkSwitch(const Line& line, const Switch& row, const UT_CMDSWINFO& given) {
  const char* const command = line.command.word;
  if (given.getnumargs() < row.least)
    reject("Switch %s of %s needs its argument: %s. Try help -m %s.", given.getswname(), command, row.argument,
           command);
  // Not the number itself: positions are 0-based by now, the user counts from 1.
  if (given.getnumargs() > row.most && row.kind == Kind::number)
    reject("Switch %s of %s takes one number. Try help -m %s.", given.getswname(), command, command);
  if (given.getnumargs() > row.most)
    reject("Unexpected word %s after switch %s of %s. Try help -m %s.", line.shown(given.getargtxt(row.most)),
           given.getswname(), command, command);
  for (int i = 0; i < given.getnumargs(); ++i)
    if (wantsNumber(row, i) && !isNumber(given.getargtxt(i)))
      reject("Switch %s of %s takes a number, not %s. Try help -m %s.", given.getswname(), command,
             line.shown(given.getargtxt(i)), command);
}

/// The row of a switch as typed; null when the command has none of that name.
const Switch* rowOf(const Command& command, const char* name) {
  static constexpr Switch anyName = flag("", "");
  static constexpr Switch anyNameWithWord = optionalText("", "", "");
  if (command.switches == Switches::anyName) return &anyName;
  if (command.switches == Switches::anyNameWithWord) return &anyNameWithWord;
  return findSwitch(command, name);
}

void check(const Command& command, const UT_CMDARGS& given, const char* firstWord) {
  if (command.switches == Switches::anything) return;
  const Line line{command, given};
  if (given.getnumargs() > 0)
    reject("Unexpected word %s after %s: a switch begins with -. Try help -m %s.", line.shown(firstWord), command.word,
           command.word);
  for (int i = 0; i < given.getnumsw(); ++i) {
    const UT_CMDSWINFO& each = *given.getsw(i);
    const Switch* row = rowOf(command, each.getswname());
    if (row == nullptr)
      reject("Unknown switch %s of %s, which takes %s. Try help -m %s.", line.shownSwitch(each.getswname()),
             command.word, switchNames(command), command.word);
    checkSwitch(line, *row, each);
  }
}

std::string switchForm(const Switch& row) {
  if (row.kind == Kind::flag) return row.name;
  std::string argument = row.argument;
  if (row.most == anyNumber) argument += "...";
  return std::string(row.name) + " <" + argument + ">";
}

}  // namespace

std::unique_ptr<UT_CMDARGS> TesselCmdargs::getCmdargs(int count, const char* const* words, bool check) {
  auto given = std::make_unique<UT_CMDARGS>(count, words);
  if (!check) return given;
  const Command* command = CommandTable::find(given->getcmd());
  if (command == nullptr) throw ACDEntryNotFoundException(given->getcmd());
  ::check(*command, *given, given->getnumargs() > 0 ? words[1] : "");
  return given;
}

std::vector<StringBase> TesselCmdargs::findAllCommands() { return findMatchingCommands(""); }

std::vector<StringBase> TesselCmdargs::findMatchingCommands(const char* text) {
  const std::string wanted = text;
  const auto sameLetter = [](char a, char b) { return UT_STR::Lower(a) == UT_STR::Lower(b); };
  std::vector<StringBase> words;
  for (const Command* command : CommandTable::all()) {
    const std::string_view word = command->word;
    const auto found = std::search(word.begin(), word.end(), wanted.begin(), wanted.end(), sameLetter);
    if (found != word.end() || wanted.empty()) words.emplace_back(command->word);
  }
  return words;
}

StringBase TesselCmdargs::findBatchFormatString(const char* word) {
  const Command* command = CommandTable::find(word);
  if (command == nullptr) return {};
  std::string text = std::string(command->word) + ": " + command->meaning + "\n";
  for (const auto& switches : {command->common, command->own})
    for (const Switch& row : switches) {
      std::string form = "  " + switchForm(row);
      form.resize(std::max<std::size_t>(form.size() + 2, 26), ' ');
      text += form + row.meaning + "\n";
    }
  text += command->note;
  if (command->shortest > 0) text += Port::format("Short forms of %d letters and more do.\n", command->shortest);
  if (*command->example != '\0') text += "Example: " + std::string(command->example);
  return StringBase(text);
}

void TesselCmdargs::accept(const char* word) { CommandTable::accept(word); }
