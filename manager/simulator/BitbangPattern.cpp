#include "manager/simulator/BitbangPattern.h"

#include <bit>
#include <cstring>

namespace {

using Word = std::uint64_t;
constexpr std::size_t wordBytes = sizeof(Word);
constexpr std::size_t clocks = 8;

// A pin byte is '0' + 4 TCK + 2 TMS + TDI. TMS and TDI count at the rise of TCK only, so in the high.
constexpr std::uint8_t lowByte = '0';
constexpr std::uint8_t highByte = '4';
constexpr std::uint8_t lowMask = 0xFC;
constexpr std::uint8_t highMask = 0xFE;
constexpr std::uint8_t tmsBit = 2;

constexpr bool isLow(std::uint8_t byte) { return (byte & lowMask) == lowByte; }
constexpr bool isHigh(std::uint8_t byte) { return (byte & lowMask) == highByte; }

Word load(const std::uint8_t* bytes) {
  Word word = 0;
  std::memcpy(&word, bytes, wordBytes);
  if constexpr (std::endian::native == std::endian::big) {
    Word turned = 0;
    for (std::size_t i = 0; i < wordBytes; ++i) turned = turned << 8 | (word >> (8 * i) & 0xFFU);
    return turned;
  }
  return word;
}

/// The lowest bits of bytes 0, 2, 4, 6, side by side.
constexpr Word gatherPairs(Word word) { return (word & 0x0001'0001'0001'0001U) * 0x0001'0002'0004'0008U >> 48 & 0xFU; }

/// The lowest bits of bytes 0, 3, 6, side by side.
constexpr Word gatherTriples(Word word) {
  return (word & 0x0001'0000'0100'0001U) * 0x0001'0000'0200'0004U >> 48 & 0x7U;
}

static_assert(gatherPairs(0x0001'0000'0001'0001U) == 0b1011);
static_assert(gatherTriples(0x0001'0000'0000'0001U) == 0b101 && gatherTriples(0x0000'0000'0100'0000U) == 0b010);

}  // namespace

constexpr BitbangPattern::BitbangPattern(Kind kind)
    : kind_(kind), words_(kind == Kind::lowHigh ? clocks * 2 / wordBytes : clocks * 3 / wordBytes) {
  const std::size_t bytesOfClock = reads() ? 3 : 2;
  for (std::size_t i = 0; i < words_ * wordBytes; ++i) {
    const std::size_t place = i % bytesOfClock;
    const std::size_t word = i / wordBytes;
    const unsigned shift = 8 * static_cast<unsigned>(i % wordBytes);
    const auto put = [shift](Word& to, std::uint8_t byte) { to |= Word{byte} << shift; };
    if (place == 0) {
      put(mask_[word], lowMask);
      put(levels_[word], lowByte);
    } else if (place == highPlace()) {
      put(mask_[word], highMask);
      put(levels_[word], highByte);
      put(tms_[word], tmsBit);
      if (highs_[word]++ == 0) firstHigh_[word] = static_cast<unsigned>(i % wordBytes);
    } else {
      put(mask_[word], 0xFF);
      put(levels_[word], 'R');
    }
  }
}

const BitbangPattern* BitbangPattern::find(std::span<const std::uint8_t> bytes) {
  static constexpr BitbangPattern lowHigh{Kind::lowHigh};
  static constexpr BitbangPattern lowReadHigh{Kind::lowReadHigh};
  static constexpr BitbangPattern lowHighRead{Kind::lowHighRead};
  if (bytes.size() < 3 || !isLow(bytes[0])) return nullptr;
  if (isHigh(bytes[1])) return bytes[2] == 'R' ? &lowHighRead : &lowHigh;
  return bytes[1] == 'R' && isHigh(bytes[2]) ? &lowReadHigh : nullptr;
}

std::size_t BitbangPattern::gather(std::span<const std::uint8_t> bytes, bool tms, BitVector& tdi) const {
  std::array<Word, mostWords> expected = levels_;
  if (tms)
    for (std::size_t i = 0; i < words_; ++i) expected[i] |= tms_[i];
  const std::size_t step = words_ * wordBytes;
  std::size_t place = 0;
  Word gathered = 0;
  unsigned bits = 0;
  for (; place + step <= bytes.size(); place += step) {
    const std::uint8_t* from = bytes.data() + place;
    Word different = 0;
    Word eight = 0;
    unsigned shift = 0;
    for (std::size_t i = 0; i < words_; ++i) {
      const Word word = load(from + i * wordBytes);
      different |= (word & mask_[i]) ^ expected[i];
      const Word levels = word >> (8 * firstHigh_[i]);
      eight |= (words_ == 2 ? gatherPairs(levels) : gatherTriples(levels)) << shift;
      shift += highs_[i];
    }
    if (different != 0) break;
    gathered |= eight << bits;
    bits += clocks;
    if (bits < BitVector::wordBits) continue;
    tdi.appendNumber(gathered, bits);
    gathered = 0;
    bits = 0;
  }
  tdi.appendNumber(gathered, bits);
  return place;
}
