#include "tests/conformance/runner/LineCursor.h"

#include <algorithm>
#include <array>
#include <charconv>

namespace conformance {
namespace {

constexpr std::string_view blanks = " \t";
constexpr std::array<std::string_view, 4> attributeFamilies = {"DeviceNS", "ConfigDeviceNS", "CollectionNS",
                                                               "DesignNS"};
constexpr std::array<std::string_view, 2> exceptions = {"ACDEntryNotFoundException", "InvalidArgumentException"};

struct Escape {
  char letter;
  char meaning;
};
constexpr Escape escapes[] = {{'n', '\n'}, {'t', '\t'}, {'r', '\r'}, {'f', '\f'}, {'"', '"'}, {'\\', '\\'}};

bool isNamePart(char character) {
  return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z') ||
         (character >= '0' && character <= '9') || character == '_';
}

template <std::size_t count>
bool holds(const std::array<std::string_view, count>& names, std::string_view name) {
  return std::find(names.begin(), names.end(), name) != names.end();
}

}  // namespace

void LineCursor::fail(const std::string& what) const {
  throw CaseError(std::string(place_.file) + ":" + std::to_string(place_.line) + ": " + what);
}

void LineCursor::skipBlanks() { at_ = std::min(line_.find_first_not_of(blanks, at_), line_.size()); }

bool LineCursor::atEnd() {
  skipBlanks();
  return at_ == line_.size();
}

char LineCursor::peek() { return atEnd() ? '\0' : line_[at_]; }

bool LineCursor::take(std::string_view token) {
  skipBlanks();
  if (line_.substr(at_, token.size()) != token) return false;
  at_ += token.size();
  return true;
}

void LineCursor::require(std::string_view token) {
  if (!take(token)) fail("expected '" + std::string(token) + "' at '" + std::string(line_.substr(at_)) + "'");
}

void LineCursor::requireEnd() {
  if (!atEnd()) fail("unexpected '" + std::string(line_.substr(at_)) + "' at the end of the line");
}

std::string LineCursor::name(const char* what) {
  skipBlanks();
  const std::size_t begin = at_;
  while (at_ < line_.size() && isNamePart(line_[at_])) ++at_;
  if (at_ == begin) fail(std::string("expected ") + what);
  return std::string(line_.substr(begin, at_ - begin));
}

std::string LineCursor::wordOrText(const char* what) {
  if (peek() == '"') return text();
  const std::size_t begin = at_;
  at_ = std::min(line_.find_first_of(blanks, at_), line_.size());
  if (at_ == begin) fail(std::string("expected ") + what);
  return std::string(line_.substr(begin, at_ - begin));
}

std::string LineCursor::rest() {
  std::string text(line_.substr(at_));
  at_ = line_.size();
  return text;
}

char LineCursor::escape() {
  if (at_ == line_.size()) fail("the quoted text is not closed");
  const char letter = line_[at_++];
  for (const Escape& escape : escapes)
    if (escape.letter == letter) return escape.meaning;
  if (letter != 'x') fail(std::string("unknown escape '\\") + letter + "' in a quoted text");
  unsigned byte = 0;
  const char* const begin = line_.data() + at_;
  const char* const end = begin + std::min<std::size_t>(2, line_.size() - at_);
  if (std::from_chars(begin, end, byte, 16).ptr != begin + 2) fail("two hexadecimal digits must follow '\\x'");
  at_ += 2;
  return static_cast<char>(byte);
}

std::string LineCursor::text() {
  require("\"");
  std::string text;
  while (at_ < line_.size()) {
    const char character = line_[at_++];
    if (character == '"') return text;
    text += character == '\\' ? escape() : character;
  }
  fail("the quoted text is not closed");
}

std::int64_t LineCursor::number() {
  skipBlanks();
  std::int64_t number = 0;
  const std::from_chars_result result = std::from_chars(line_.data() + at_, line_.data() + line_.size(), number);
  if (result.ec == std::errc::result_out_of_range) fail("the number does not fit 64 bits");
  if (result.ec != std::errc()) fail("expected a number");
  at_ = static_cast<std::size_t>(result.ptr - line_.data());
  if (at_ < line_.size() && isNamePart(line_[at_])) fail("malformed number");
  return number;
}

bool LineCursor::boolean() {
  const std::string word = name("true or false");
  if (word != "true" && word != "false") fail("expected true or false instead of '" + word + "'");
  return word == "true";
}

std::vector<Value> LineCursor::valuesUpTo(std::string_view closing) {
  std::vector<Value> values;
  if (take(closing)) return values;
  do {
    values.push_back(value());
  } while (take(","));
  require(closing);
  return values;
}

Value LineCursor::map() {
  std::vector<Value> entries;
  if (!take("}")) {
    do {
      const std::int64_t key = number();
      require(":");
      entries.emplace_back(Value::Kind::entry, std::vector<Value>{value()}, key);
    } while (take(","));
    require("}");
  }
  std::stable_sort(entries.begin(), entries.end(), [](const Value& a, const Value& b) { return a.number < b.number; });
  return Value(Value::Kind::map, std::move(entries));
}

Value LineCursor::word() {
  const std::string word = name("a value");
  if (word == "true") return Value(Value::Kind::boolean, 1);
  if (word == "false") return Value(Value::Kind::boolean, 0);
  if (word == "null") return Value(Value::Kind::null);
  if (word == "interface") return Value(Value::Kind::modeInterface);
  if (holds(attributeFamilies, word)) return Value(Value::Kind::attribute, word, number());
  if (word != "throw") fail("unknown value '" + word + "'");
  const std::string exception = name("the name of an exception");
  if (!holds(exceptions, exception)) fail("unknown exception '" + exception + "'");
  return Value(Value::Kind::exception, exception);
}

Value LineCursor::value() {
  const char first = peek();
  if (first == '"') return Value(Value::Kind::text, text());
  if (first == '-' || (first >= '0' && first <= '9')) return Value(Value::Kind::number, number());
  if (take("*")) return Value(Value::Kind::any);
  if (take("[")) return Value(Value::Kind::list, valuesUpTo("]"));
  if (take("(")) return Value(Value::Kind::tuple, valuesUpTo(")"));
  if (take("{")) return map();
  return word();
}

}  // namespace conformance
