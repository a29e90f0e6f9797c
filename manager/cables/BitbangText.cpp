#include "manager/cables/BitbangText.h"

#include <array>
#include <bit>
#include <cstring>

namespace {

constexpr std::size_t byteValues = 256;
constexpr std::size_t byteBits = 8;

/// TCK, TMS and TDI as a digit.
constexpr char levels(bool tck, bool tms, bool tdi) {
  return static_cast<char>('0' + (tck ? 4 : 0) + (tms ? 2 : 0) + (tdi ? 1 : 0));
}

template <std::size_t Length>
using Texts = std::array<std::array<char, byteBits * Length>, byteValues>;

/// The texts of eight clocks by the byte of TDI.
template <std::size_t Length>
constexpr Texts<Length> makeTexts() {
  Texts<Length> result{};
  for (std::size_t value = 0; value < byteValues; ++value) {
    for (std::size_t bit = 0; bit < byteBits; ++bit) {
      const bool tdi = (value >> bit & 1U) != 0;
      char* clock = &result[value][bit * Length];
      clock[0] = levels(false, false, tdi);
      if (Length == BitbangText::bytesPerReadClock) clock[1] = BitbangText::sample;
      clock[Length - 1] = levels(true, false, tdi);
    }
  }
  return result;
}

constexpr auto writeTexts = makeTexts<BitbangText::bytesPerClock>();
constexpr auto readTexts = makeTexts<BitbangText::bytesPerReadClock>();

template <std::size_t Length>
char* write(char* to, BitbangText::Word tdi, std::size_t count, const Texts<Length>& texts) {
  for (; count >= byteBits; count -= byteBits, tdi >>= byteBits, to += byteBits * Length)
    std::memcpy(to, texts[tdi & (byteValues - 1)].data(), byteBits * Length);
  std::memcpy(to, texts[tdi & (byteValues - 1)].data(), count * Length);
  return to + count * Length;
}

/// Eight answers; the first one is the lowest byte.
BitbangText::Word loadBytes(const char* from) {
  BitbangText::Word result = 0;
  if constexpr (std::endian::native == std::endian::little) {
    std::memcpy(&result, from, sizeof result);
  } else {
    for (std::size_t i = 0; i < byteBits; ++i)
      result |= BitbangText::Word{static_cast<unsigned char>(from[i])} << (i * byteBits);
  }
  return result;
}

}  // namespace

namespace BitbangText {

char* writeData(char* to, Word tdi, std::size_t count, bool reads) {
  return reads ? write<bytesPerReadClock>(to, tdi, count, readTexts) : write<bytesPerClock>(to, tdi, count, writeTexts);
}

char* writeClock(char* to, bool tms, bool tdi, bool reads) {
  *to++ = levels(false, tms, tdi);
  if (reads) *to++ = sample;
  *to++ = levels(true, tms, tdi);
  return to;
}

std::optional<Word> readWord(const char* from) {
  constexpr Word zeros = 0x3030303030303030;  // '0' in each byte
  constexpr Word lowest = 0x0101010101010101;
  constexpr Word gather = 0x0102040810204080;  // brings the lowest bit of byte i to bit 56 + i
  Word result = 0;
  Word wrong = 0;
  for (std::size_t i = 0; i < byteBits; ++i) {
    const Word bits = loadBytes(from + i * byteBits) ^ zeros;
    wrong |= bits & ~lowest;
    result |= ((bits & lowest) * gather >> 56) << (i * byteBits);
  }
  return wrong == 0 ? std::optional(result) : std::nullopt;
}

std::optional<bool> readBit(char answer) {
  if (answer != '0' && answer != '1') return std::nullopt;
  return answer == '1';
}

}  // namespace BitbangText
