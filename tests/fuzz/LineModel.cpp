#include "tests/fuzz/LineModel.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <limits>

namespace fuzz {
namespace {

constexpr char substitute = 0x1A;

bool isBlank(char character) { return character == ' ' || character == '\t'; }
bool isDigit(char character) { return character >= '0' && character <= '9'; }
char lower(char character) { return character >= 'A' && character <= 'Z' ? char(character + ('a' - 'A')) : character; }

bool isNumber(std::string_view word) {
  if (!word.empty() && (word.front() == '+' || word.front() == '-')) word.remove_prefix(1);
  return !word.empty() && std::all_of(word.begin(), word.end(), isDigit);
}

}  // namespace

std::vector<std::string> linesOf(std::string_view text, std::size_t room) {
  std::vector<std::string> lines;
  while (!text.empty()) {
    const std::size_t end = text.substr(0, room + 2).find('\n');
    std::string line(text.substr(0, end));
    if (end != std::string_view::npos && line.ends_with('\r')) line.pop_back();
    if (end != std::string_view::npos && line.size() <= room) {
      text.remove_prefix(end + 1);
    } else {
      line = text.substr(0, room);
      text.remove_prefix(line.size());
    }
    std::replace(line.begin(), line.end(), '\0', substitute);
    lines.push_back(std::move(line));
  }
  return lines;
}

Words wordsOf(std::string_view line) {
  if (line.ends_with('\n')) line.remove_suffix(line.ends_with("\r\n") ? 2 : 1);
  while (!line.empty() && isBlank(line.front())) line.remove_prefix(1);
  Words result;
  result.comment = line.starts_with('#') || line.starts_with("//");
  bool inWord = false;
  for (const char character : line) {
    if (isBlank(character) && !result.openQuote) {
      inWord = false;
      continue;
    }
    if (!inWord) result.words.emplace_back();
    inWord = true;
    if (character == '"')
      result.openQuote = !result.openQuote;
    else
      result.words.back() += character;
  }
  if (result.words.empty()) result.words.emplace_back();
  return result;
}

bool equalIgnoringCase(std::string_view a, std::string_view b) {
  return std::equal(a.begin(), a.end(), b.begin(), b.end(), [](char x, char y) { return lower(x) == lower(y); });
}

bool isSwitch(std::string_view word) { return word.size() > 1 && word[0] == '-' && !isDigit(word[1]); }

bool lowerPositions(std::vector<std::string>& words) {
  bool positions = false;
  for (std::size_t i = 1; i < words.size(); ++i) {
    std::string& word = words[i];
    if (isSwitch(word)) {
      positions = equalIgnoringCase(word, "-p") || equalIgnoringCase(word, "-position");
      continue;
    }
    if (!positions || !isNumber(word)) continue;
    // A number beyond 64 bits comes out as the nearest one within.
    const long long number = std::strtoll(word.c_str(), nullptr, 10);
    if (number > std::numeric_limits<std::int32_t>::max() || number <= std::numeric_limits<std::int32_t>::min())
      return false;
    word = std::to_string(number - 1);
  }
  return true;
}

std::int32_t leadingNumber(const char* text) {
  constexpr long long smallest = std::numeric_limits<std::int32_t>::min();
  constexpr long long largest = std::numeric_limits<std::int32_t>::max();
  return static_cast<std::int32_t>(std::clamp(std::strtoll(text, nullptr, 10), smallest, largest));
}

}  // namespace fuzz
