#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

/// The text of the remote-bitbang protocol, many clocks at a time. A clock is its levels with TCK low, then with TCK
/// high; one that is read has the sample between, when TDO shows what a TAP sees at the rise.
namespace BitbangText {

using Word = std::uint64_t;

constexpr char sample = 'R';
constexpr char quit = 'Q';
constexpr std::size_t bytesPerClock = 2;
constexpr std::size_t bytesPerReadClock = 3;

/// The byte that drives the reset lines.
constexpr char resets(bool trst, bool srst) { return static_cast<char>('r' + (trst ? 2 : 0) + (srst ? 1 : 0)); }

/// Writes up to 64 clocks with TMS low, bit 0 of `tdi` first; gives the end of the text.
char* writeData(char* to, Word tdi, std::size_t count, bool reads);
/// Writes one clock with any levels.
char* writeClock(char* to, bool tms, bool tdi, bool reads);

/// 64 answers as a word, the first one lowest; empty when one is neither 0 nor 1.
std::optional<Word> readWord(const char* from);
/// One answer.
std::optional<bool> readBit(char answer);

}  // namespace BitbangText
