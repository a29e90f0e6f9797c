#include "manager/simulator/BitbangDecoder.h"

#include <algorithm>
#include <bit>
#include <cstring>

namespace {

constexpr unsigned tckPin = 4;
constexpr unsigned tmsPin = 2;
constexpr unsigned tdiPin = 1;

/// Appends '0' or '1' for each bit.
void appendDigits(const BitVector& bits, std::vector<std::uint8_t>& digits) {
  const std::size_t first = digits.size();
  // Eight at a time; those beyond the last bit are cut off again.
  digits.resize(first + (bits.size() + 7) / 8 * 8);
  std::uint8_t* to = digits.data() + first;
  for (std::size_t place = 0; place < bits.size(); place += BitVector::wordBits) {
    BitVector::Word word = bits.words()[place / BitVector::wordBits];
    const std::size_t end = std::min(BitVector::wordBits, bits.size() - place);
    for (std::size_t i = 0; i < end; i += 8, word >>= 8, to += 8) {
      // Each byte keeps one bit of its own, which the sum carries to the byte's highest place.
      const std::uint64_t spread = (word & 0xFFU) * 0x0101'0101'0101'0101U & 0x8040'2010'0804'0201U;
      std::uint64_t eight = ((spread + 0x7F7F'7F7F'7F7F'7F7FU) >> 7 & 0x0101'0101'0101'0101U) | 0x3030'3030'3030'3030U;
      if constexpr (std::endian::native == std::endian::big) {
        for (std::size_t j = 0; j < 8; ++j) to[j] = static_cast<std::uint8_t>(eight >> (8 * j));
      } else {
        std::memcpy(to, &eight, sizeof eight);
      }
    }
  }
  digits.resize(first + bits.size());
}

}  // namespace

BitbangDecoder::BitbangDecoder(SimulatedBoard& board) : board_(board), tdo_(board.tdo()) {}

void BitbangDecoder::feed(std::span<const std::uint8_t> bytes, std::vector<std::uint8_t>& answers) {
  while (!bytes.empty() && !ended_) {
    const std::size_t done = run(bytes, answers);
    bytes = bytes.subspan(done);
    if (done > 0 || bytes.empty()) continue;
    step(bytes.front(), answers);
    bytes = bytes.subspan(1);
  }
}

void BitbangDecoder::step(std::uint8_t byte, std::vector<std::uint8_t>& answers) {
  if (byte >= '0' && byte <= '7') return drivePins(byte - unsigned{'0'});
  if (byte >= 'r' && byte <= 'u') {
    const unsigned lines = byte - unsigned{'r'};
    return board_.driveResets((lines & 2U) != 0, (lines & 1U) != 0);
  }
  if (byte == 'R') answers.push_back(tdo_ ? '1' : '0');
  if (byte == 'Q') ended_ = true;
}

void BitbangDecoder::drivePins(unsigned levels) {
  const bool tck = (levels & tckPin) != 0;
  if (tck && !tck_) board_.clockLevels((levels & tmsPin) != 0 ? 1 : 0, levels & tdiPin, 1);
  if (!tck && tck_) tdo_ = board_.tdo();
  tck_ = tck;
}

std::size_t BitbangDecoder::run(std::span<const std::uint8_t> bytes, std::vector<std::uint8_t>& answers) {
  // The first low is a fall only when TCK is high; a reset since the last fall would make a difference.
  if (!tck_ && tdo_ != board_.tdo()) return 0;
  const BitbangPattern* pattern = BitbangPattern::find(bytes);
  if (pattern == nullptr) return 0;
  const bool tms = ((bytes[pattern->highPlace()] - unsigned{'0'}) & tmsPin) != 0;
  tdi_.clear();
  const std::size_t done = pattern->gather(bytes, tms, tdi_);
  if (done == 0) return 0;
  clock(tms, pattern->reads(), answers);
  tck_ = true;
  return done;
}

void BitbangDecoder::clock(bool tms, bool reads, std::vector<std::uint8_t>& answers) {
  const std::size_t last = tdi_.size() - 1;
  if (reads) {
    answered_.clear();
    board_.clock(tms, tdi_, &answered_);
    tdo_ = answered_.get(last);
    return appendDigits(answered_, answers);
  }
  const bool lastTdi = tdi_.get(last);
  tdi_.resize(last);
  board_.clock(tms, tdi_, nullptr);
  tdo_ = board_.tdo();
  board_.clockLevels(tms ? 1 : 0, lastTdi ? 1 : 0, 1);
}
