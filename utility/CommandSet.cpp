#include "interfaces/utility/CommandSet.h"

#include <charconv>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <limits>
#include <string_view>

#include "interfaces/portability/Port_MsgManData.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "interfaces/portability/UT_STR.h"

namespace {

constexpr std::size_t usualWordLength = 16;

Port_MsgManData message(int line) { return Port_MsgManData::createObject("tESSEL", "../s/CommandSet", line, ""); }

bool isBlank(char character) { return character == ' ' || character == '\t'; }

/// Reads one word, whose quotes are dropped, and moves past it. False when a quote stays open.
bool readWord(const char*& place, const char* end, std::string& text) {
  bool quoted = false;
  for (; place != end && (quoted || !isBlank(*place)); ++place) {
    if (*place == '"')
      quoted = !quoted;
    else
      text += *place;
  }
  return !quoted;
}

const char* skipBlanks(const char* place, const char* end) {
  while (place != end && isBlank(*place)) ++place;
  return place;
}

enum class Lowering { notANumber, done, tooLarge };

/// The number one below a whole decimal number, as text.
Lowering lower(std::string_view word, std::string& lowered) {
  const bool plus = word.front() == '+';
  if (plus) word.remove_prefix(1);
  std::int64_t value = 0;
  const auto [end, error] = std::from_chars(word.data(), word.data() + word.size(), value);
  if (error == std::errc::invalid_argument || end != word.data() + word.size()) return Lowering::notANumber;
  if (plus && word.front() == '-') return Lowering::notANumber;
  constexpr std::int64_t smallest = std::numeric_limits<std::int32_t>::min();
  constexpr std::int64_t largest = std::numeric_limits<std::int32_t>::max();
  if (error != std::errc() || value > largest || value - 1 < smallest) return Lowering::tooLarge;
  lowered = std::to_string(value - 1);
  return Lowering::done;
}

}  // namespace

CommandSet::CommandSet(int capacity) {
  const auto words = static_cast<std::size_t>(capacity < 0 ? 0 : capacity);
  starts_.reserve(words);
  text_.reserve(words * usualWordLength);
}

CommandSet::CommandSet(const CommandSet& other)
    : text_(other.text_), starts_(other.starts_), converted_(other.converted_) {}

CommandSet& CommandSet::operator=(const CommandSet& other) {
  text_ = other.text_;
  starts_ = other.starts_;
  pointers_.clear();
  converted_ = other.converted_;
  return *this;
}

std::unique_ptr<CommandSet> CommandSet::string2CommandSet(const char* line) {
  const char* end = line + std::strlen(line);
  if (end != line && end[-1] == '\n') {
    --end;
    if (end != line && end[-1] == '\r') --end;
  }
  const char* place = skipBlanks(line, end);
  if (place != end && (*place == '#' || (*place == '/' && place + 1 != end && place[1] == '/'))) return nullptr;

  auto set = std::make_unique<CommandSet>(0);
  if (place == end) {
    set->addCommand("");
    return set;
  }
  set->starts_.reserve(8);
  set->text_.reserve(static_cast<std::size_t>(end - place) + 8);
  bool closed = true;
  while (place != end) {
    set->starts_.push_back(set->text_.size());
    closed = readWord(place, end, set->text_);
    set->text_ += '\0';
    place = skipBlanks(place, end);
  }
  if (!closed)
    message(__LINE__).issueWarning("Missing closing quote, the text ends with the line: %s\n", std::string(line, end));
  return set;
}

const char* CommandSet::getCommand(int index) const {
  if (index < 0 || index >= getNumberCommands()) return "";
  return text_.data() + starts_[static_cast<std::size_t>(index)];
}

const char* const* CommandSet::getCommands() const {
  if (pointers_.empty()) {
    pointers_.reserve(starts_.size() + 1);
    for (const std::size_t start : starts_) pointers_.push_back(text_.data() + start);
    pointers_.push_back(nullptr);
  }
  return pointers_.data();
}

void CommandSet::addCommand(const char* word) {
  starts_.push_back(text_.size());
  text_.append(word, std::strlen(word) + 1);
  pointers_.clear();
}

void CommandSet::addCommand(int number) { addCommand(std::to_string(number).c_str()); }

bool CommandSet::decrementPositions() {
  if (converted_) return true;
  CommandSet result(getNumberCommands() + 1);
  bool positions = false;
  bool changed = false;
  std::string lowered;
  for (int i = 0; i < getNumberCommands(); ++i) {
    const char* word = getCommand(i);
    if (i > 0 && UT_CMDARGS::isSwitch(word))
      positions = UT_STR::ICompare(word, "-p") == 0 || UT_STR::ICompare(word, "-position") == 0;
    const Lowering outcome = positions && *word != '\0' ? lower(word, lowered) : Lowering::notANumber;
    if (outcome == Lowering::tooLarge) {
      message(__LINE__).issueError("Position %s is out of range, positions start at 1.\n", word);
      return false;
    }
    changed = changed || outcome == Lowering::done;
    result.addCommand(outcome == Lowering::done ? lowered.c_str() : word);
  }
  if (changed) *this = std::move(result);
  converted_ = true;
  return true;
}

void CommandSet::printCommands(bool echo) const {
  if (!echo) return;
  std::string line;
  for (int i = 0; i < getNumberCommands(); ++i) line += (i == 0 ? "" : " ") + std::string(getCommand(i));
  line += '\n';
  std::fwrite(line.data(), 1, line.size(), stdout);
  std::fflush(stdout);
}
