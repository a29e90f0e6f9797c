#include "interfaces/utility/CommandSet.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdint>
#include <cstring>
#include <functional>
#include <limits>
#include <string_view>
#include <utility>

#include "interfaces/portability/Console.h"
#include "interfaces/portability/Port_MsgManData.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "interfaces/portability/UT_STR.h"

namespace {

constexpr std::size_t usualWordLength = 16;
constexpr std::size_t usualWordCount = 8;

Port_MsgManData message(int line) { return Port_MsgManData::createObject("tESSEL", "../s/CommandSet", line, ""); }

bool isBlank(char character) { return character == ' ' || character == '\t'; }

const char* skipBlanks(const char* place, const char* end) {
  while (place != end && isBlank(*place)) ++place;
  return place;
}

/// All empty words of all sets; they take no text.
constexpr const char* emptyWord = "";

/// A word of one text at the same place in another.
const char* moved(const char* word, const char* from, const char* to) {
  return word == emptyWord ? emptyWord : to + (word - from);
}

enum class Lowering { notANumber, done, tooLarge };

/// The number one below a whole decimal number.
Lowering lower(std::string_view word, std::int32_t& lowered) {
  const bool plus = word.front() == '+';
  if (plus) word.remove_prefix(1);
  std::int64_t value = 0;
  const auto [end, error] = std::from_chars(word.data(), word.data() + word.size(), value);
  if (error == std::errc::invalid_argument || end != word.data() + word.size()) return Lowering::notANumber;
  if (plus && word.front() == '-') return Lowering::notANumber;
  constexpr std::int64_t smallest = std::numeric_limits<std::int32_t>::min();
  constexpr std::int64_t largest = std::numeric_limits<std::int32_t>::max();
  if (error != std::errc() || value > largest || value - 1 < smallest) return Lowering::tooLarge;
  lowered = static_cast<std::int32_t>(value - 1);
  return Lowering::done;
}

}  // namespace

CommandSet::CommandSet(int capacity) {
  const auto words = static_cast<std::size_t>(capacity < 0 ? 0 : capacity);
  words_.reserve(words);
  reserveText(words * usualWordLength);
}

CommandSet::CommandSet(const CommandSet& other) { *this = other; }

CommandSet& CommandSet::operator=(const CommandSet& other) {
  if (this == &other) return *this;
  clear();
  reserveText(other.size_);
  words_.reserve(other.words_.size());
  if (other.size_ > 0) std::memcpy(text_.get(), other.text_.get(), other.size_);
  for (const char* word : other.words_) words_.push_back(moved(word, other.text_.get(), text_.get()));
  size_ = other.size_;
  converted_ = other.converted_;
  holdsKey_ = other.holdsKey_;
  return *this;
}

void CommandSet::reserveText(std::size_t size) {
  if (size <= capacity_ - size_) return;
  const std::size_t capacity = std::max(2 * capacity_, size_ + size);
  auto text = std::make_unique_for_overwrite<char[]>(capacity);
  if (size_ > 0) std::memcpy(text.get(), text_.get(), size_);
  for (const char*& word : words_) word = moved(word, text_.get(), text.get());
  wipe();
  text_ = std::move(text);
  capacity_ = capacity;
}

std::unique_ptr<CommandSet> CommandSet::string2CommandSet(const char* line) {
  auto set = std::make_unique<CommandSet>(0);
  if (!string2CommandSet(line, *set)) set.reset();
  return set;
}

bool CommandSet::string2CommandSet(const char* line, CommandSet& set) {
  const char* end = line + std::strlen(line);
  if (end != line && end[-1] == '\n') {
    --end;
    if (end != line && end[-1] == '\r') --end;
  }
  const char* place = skipBlanks(line, end);
  if (place != end && (*place == '#' || (*place == '/' && place + 1 != end && place[1] == '/'))) return false;
  set.clear();
  if (place == end)
    set.words_.push_back(emptyWord);
  else if (!set.splitWords(place, end))
    // Without the text: it may hold a key.
    message(__LINE__).issueWarning("Missing closing quote, the text ends with the line.\n");
  return true;
}

void CommandSet::noteKey(const char* word) {
  if (!Port::Secret::announces(word)) return;
  holdsKey_ = true;
  Port::Secret::forbidCoreDump();
}

void CommandSet::swap(CommandSet& other) noexcept {
  text_.swap(other.text_);
  std::swap(size_, other.size_);
  std::swap(capacity_, other.capacity_);
  words_.swap(other.words_);
  std::swap(converted_, other.converted_);
  std::swap(holdsKey_, other.holdsKey_);
}

void CommandSet::clear() {
  wipe();
  holdsKey_ = false;
  size_ = 0;
  words_.clear();
  converted_ = false;
}

/// Splits into an empty set; false when a quote stays open.
bool CommandSet::splitWords(const char* place, const char* end) {
  // Every character but one that separates is stored once; a word that ends with the line adds its zero.
  reserveText(static_cast<std::size_t>(end - place) + 1);
  words_.reserve(usualWordCount);
  bool quoted = false;
  char* out = text_.get();
  while (place != end) {
    words_.push_back(out);
    for (; place != end && (quoted || !isBlank(*place)); ++place) {
      // Blanks, tabs and quotes are all at or below the quote: the usual character needs one look.
      while (static_cast<unsigned char>(*place) > '"') {
        *out++ = *place++;
        if (place == end) break;
      }
      if (place == end || (!quoted && isBlank(*place))) break;
      if (*place == '"')
        quoted = !quoted;
      else
        *out++ = *place;
    }
    *out++ = '\0';
    noteKey(words_.back());
    place = skipBlanks(place, end);
  }
  size_ = static_cast<std::size_t>(out - text_.get());
  return !quoted;
}

void CommandSet::addCommand(const char* word) {
  if (*word == '\0') {
    words_.push_back(emptyWord);
    return;
  }
  const std::size_t size = std::strlen(word) + 1;
  // The word may be one of this set's own, which moves with the rest.
  const char* const begin = text_.get();
  const std::less<const char*> before;
  const bool own = begin != nullptr && !before(word, begin) && before(word, begin + size_);
  const std::ptrdiff_t place = own ? word - begin : 0;
  reserveText(size);
  if (own) word = text_.get() + place;
  words_.push_back(text_.get() + size_);
  std::memcpy(text_.get() + size_, word, size);
  size_ += size;
  noteKey(words_.back());
}

void CommandSet::addCommand(int number) { addCommand(std::to_string(number).c_str()); }

bool CommandSet::decrementPositions() {
  if (converted_) return true;
  bool positions = false;
  std::int32_t lowered = 0;
  for (std::size_t i = 1; i < words_.size(); ++i) {
    const char* word = words_[i];
    if (UT_CMDARGS::isSwitch(word)) {
      positions = UT_STR::ICompare(word, "-p") == 0 || UT_STR::ICompare(word, "-position") == 0;
      continue;
    }
    if (!positions || *word == '\0') continue;
    switch (lower(word, lowered)) {
      case Lowering::notANumber:
        break;
      case Lowering::tooLarge:
        message(__LINE__).issueError("Position %s is out of range, positions start at 1.\n", word);
        return false;
      case Lowering::done:
        replaceWord(i, lowered);
        break;
    }
  }
  converted_ = true;
  return true;
}

void CommandSet::replaceWord(std::size_t index, std::int32_t number) {
  std::array<char, 16> digits{};
  const char* end = std::to_chars(digits.data(), digits.data() + digits.size() - 1, number).ptr;
  const auto size = static_cast<std::size_t>(end - digits.data()) + 1;
  char* place = text_.get() + (words_[index] - text_.get());
  if (size > std::strlen(place) + 1) {
    // It does not fit where the old one stands, which is left unused.
    reserveText(size);
    place = text_.get() + size_;
    size_ += size;
    words_[index] = place;
  }
  std::memcpy(place, digits.data(), size);
}

void CommandSet::printCommands(bool echo) const {
  if (!echo) return;
  std::string line;
  for (int i = 0; i < getNumberCommands(); ++i) line += (i == 0 ? "" : " ") + std::string(getCommand(i));
  line += '\n';
  Port::Console::print(line.c_str());
}
