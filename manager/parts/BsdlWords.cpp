#include <algorithm>
#include <charconv>
#include <limits>

#include "manager/parts/BsdlLexer.h"

namespace {

char upperOf(char character) {
  return character >= 'a' && character <= 'z' ? static_cast<char>(character - 'a' + 'A') : character;
}

char lowerOf(char character) {
  return character >= 'A' && character <= 'Z' ? static_cast<char>(character - 'A' + 'a') : character;
}

std::string without(std::string_view text, char character) {
  std::string result;
  std::copy_if(text.begin(), text.end(), std::back_inserter(result), [&](char one) { return one != character; });
  return result;
}

template <class Number, class... Options>
std::optional<Number> numberOf(std::string_view digits, Options... options) {
  Number number{};
  const char* end = digits.data() + digits.size();
  const auto [place, error] = std::from_chars(digits.data(), end, number, options...);
  if (error != std::errc() || place != end || digits.empty()) return std::nullopt;
  return number;
}

}  // namespace

namespace BsdlWords {

bool same(std::string_view left, std::string_view right) {
  return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                    [](char one, char other) { return lowerOf(one) == lowerOf(other); });
}

std::string upper(std::string_view text) {
  std::string result(text);
  std::transform(result.begin(), result.end(), result.begin(), upperOf);
  return result;
}

std::string lower(std::string_view text) {
  std::string result(text);
  std::transform(result.begin(), result.end(), result.begin(), lowerOf);
  return result;
}

bool isNameCharacter(char character) {
  const char letter = lowerOf(character);
  return (letter >= 'a' && letter <= 'z') || (letter >= '0' && letter <= '9') || letter == '_';
}

std::optional<std::size_t> count(std::string_view word, std::size_t most) {
  std::string digits = without(word, '_');
  int base = 10;
  if (const std::size_t mark = digits.find('#'); mark != std::string::npos) {
    const auto given = numberOf<unsigned>(std::string_view(digits).substr(0, mark));
    if (!given || *given < 2 || *given > 16 || digits.size() < mark + 3 || digits.back() != '#') return std::nullopt;
    base = static_cast<int>(*given);
    digits = digits.substr(mark + 1, digits.size() - mark - 2);
  }
  const auto number = numberOf<std::size_t>(digits, base);
  return number && *number <= most ? number : std::nullopt;
}

std::optional<double> real(std::string_view word, double most) {
  const std::string digits = without(word, '_');
  if (digits.empty() || digits[0] < '0' || digits[0] > '9') return std::nullopt;
  std::string_view text = digits;
  // A '+' of an exponent is no character of a number for from_chars.
  std::string plain;
  if (text.find('+') != std::string_view::npos) text = plain = without(text, '+');
  const auto number = numberOf<double>(text);
  return number && *number <= most ? number : std::nullopt;
}

std::string describe(const BsdlToken& token) {
  static constexpr std::size_t longest = 40;
  if (token.kind == BsdlToken::Kind::end) return "the end of the file";
  if (token.kind == BsdlToken::Kind::string) return "a string";
  return "'" + std::string(token.text.substr(0, longest)) + (token.text.size() > longest ? "...'" : "'");
}

}  // namespace BsdlWords
