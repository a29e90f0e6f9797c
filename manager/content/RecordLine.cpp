#include "manager/content/RecordLine.h"

#include <array>

#include "manager/support/TextPlace.h"

namespace {

constexpr std::array<std::int8_t, 256> digitValues = [] {
  std::array<std::int8_t, 256> values{};
  values.fill(-1);
  for (std::int8_t digit = 0; digit < 10; ++digit) values[static_cast<std::size_t>('0' + digit)] = digit;
  for (std::int8_t digit = 10; digit < 16; ++digit) {
    values[static_cast<std::size_t>('A' + digit - 10)] = digit;
    values[static_cast<std::size_t>('a' + digit - 10)] = digit;
  }
  return values;
}();

constexpr std::string_view digits = "0123456789ABCDEF";

bool isBlank(char character) { return character == ' ' || character == '\t'; }

}  // namespace

bool RecordLine::next() {
  while (next_ < text_.size()) {
    place_ = next_;
    const std::size_t lineEnd = text_.find_first_of("\r\n", next_);
    end_ = lineEnd == std::string_view::npos ? text_.size() : lineEnd;
    next_ = lineEnd == std::string_view::npos ? text_.size() : lineEnd + 1;
    while (end_ > place_ && isBlank(text_[end_ - 1])) --end_;
    if (place_ < end_) return true;
  }
  place_ = end_ = text_.size();
  return false;
}

Status RecordLine::mark(char upper, std::string_view what) {
  const char found = atEnd() ? '\0' : text_[place_];
  const char folded = found >= 'a' && found <= 'z' ? static_cast<char>(found - 'a' + 'A') : found;
  if (folded != upper) return failureAt(place_, what);
  ++place_;
  return {};
}

char RecordLine::take() { return atEnd() ? '\0' : text_[place_++]; }

Status RecordLine::bytes(std::size_t count, std::vector<std::uint8_t>& to) {
  for (std::size_t i = 0; i < count; ++i) {
    int byte = 0;
    for (int half = 0; half < 2; ++half, ++place_) {
      if (atEnd()) return failureAt(place_, "the record is shorter than its length says");
      const int digit = HexDigits::value(text_[place_]);
      if (digit < 0) return failureAt(place_, "expected a hex digit");
      byte = byte * 16 + digit;
    }
    to.push_back(static_cast<std::uint8_t>(byte));
  }
  return {};
}

Status RecordLine::end() {
  if (!atEnd()) return failureAt(place_, "the record is longer than its length says");
  return {};
}

Failure RecordLine::failureAt(std::size_t place, std::string_view message) const {
  return ::failureAt(name_, text_, place, message);
}

int HexDigits::value(char digit) { return digitValues[static_cast<unsigned char>(digit)]; }

void HexDigits::append(std::string& text, std::uint8_t byte) {
  text += digits[byte >> 4U];
  text += digits[byte & 15U];
}

std::string HexDigits::number(std::uint64_t value, int digitCount) {
  std::string text;
  for (int shift = 60; shift >= 0; shift -= 4)
    if (!text.empty() || value >> shift != 0 || shift < 4 * digitCount) text += digits[value >> shift & 15U];
  return text;
}
