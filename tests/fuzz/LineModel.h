#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

/// The rules of lines, words, switches and numbers once more, written for plainness and not for speed. The
/// fuzzers hold them against the interpreter's own.
namespace fuzz {

/// The lines of a file as a reader with room for `room` characters gives them.
std::vector<std::string> linesOf(std::string_view text, std::size_t room);

struct Words {
  bool comment = false;
  bool openQuote = false;
  std::vector<std::string> words;
};
Words wordsOf(std::string_view line);

bool equalIgnoringCase(std::string_view a, std::string_view b);
bool isSwitch(std::string_view word);

/// Lowers the positions among the words; false when one is out of range.
bool lowerPositions(std::vector<std::string>& words);

/// The leading decimal number of a text, clamped to 32 bits.
std::int32_t leadingNumber(const char* text);

}  // namespace fuzz
