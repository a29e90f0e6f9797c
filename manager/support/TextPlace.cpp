#include "manager/support/TextPlace.h"

#include <algorithm>

namespace {

/// How much of a line is shown before the place and from it on, in bytes.
constexpr std::size_t shownBefore = 60;
constexpr std::size_t shownAfter = 40;
constexpr std::string_view cut = "...";

/// A character in UTF-8 is a first byte and such bytes behind it.
bool isContinuation(char byte) { return (static_cast<unsigned char>(byte) & 0xC0U) == 0x80U; }

std::size_t columns(std::string_view text) {
  return text.size() - static_cast<std::size_t>(std::count_if(text.begin(), text.end(), isContinuation));
}

/// A terminal must not act on what a damaged file holds.
std::string printable(std::string_view text) {
  std::string result(text);
  for (char& byte : result) {
    if (byte == '\t') byte = ' ';
    if (static_cast<unsigned char>(byte) < 0x20 || byte == 0x7F) byte = '?';
  }
  return result;
}

/// The line with a caret under its byte `place`, long lines cut on both sides.
std::string picture(std::string_view line, std::size_t place) {
  std::size_t first = place > shownBefore ? place - shownBefore : 0;
  while (first < place && isContinuation(line[first])) ++first;
  std::size_t end = std::min(line.size(), place + shownAfter);
  while (end < line.size() && isContinuation(line[end]) && end < place + shownAfter + 3) ++end;

  const std::string_view before = line.substr(first, place - first);
  std::string shown = "  ";
  if (first > 0) shown += cut;
  shown += printable(before);
  const std::string caret = std::string(2 + (first > 0 ? cut.size() : 0) + columns(before), ' ') + '^';
  shown += printable(line.substr(place, end - place));
  if (end < line.size()) shown += cut;
  return shown + '\n' + caret;
}

}  // namespace

Failure failureAt(std::string_view name, std::string_view text, std::size_t offset, std::string_view message) {
  offset = std::min(offset, text.size());
  const std::string_view before = text.substr(0, offset);
  const std::size_t lineNumber = 1 + static_cast<std::size_t>(std::count(before.begin(), before.end(), '\n'));
  const std::size_t newLine = before.rfind('\n');
  const std::size_t begin = newLine == std::string_view::npos ? 0 : newLine + 1;
  std::string_view line = text.substr(begin, text.find('\n', offset) - begin);
  if (line.ends_with('\r')) line.remove_suffix(1);
  const std::size_t place = std::min(offset - begin, line.size());

  std::string result(name);
  result += ':' + std::to_string(lineNumber) + ':' + std::to_string(columns(line.substr(0, place)) + 1) + ": ";
  result += message;
  if (!line.empty()) result += '\n' + picture(line, place);
  return {.text = result};
}
