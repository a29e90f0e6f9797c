#include "manager/simulator/SpiBridge.h"

#include <algorithm>
#include <array>
#include <bit>

namespace {

/// The bits of each byte in the other order.
constexpr std::array<std::uint8_t, 256> reversed = [] {
  std::array<std::uint8_t, 256> table{};
  for (unsigned byte = 0; byte < table.size(); ++byte)
    for (unsigned bit = 0; bit < 8; ++bit)
      if ((byte >> bit & 1U) != 0) table[byte] = static_cast<std::uint8_t>(table[byte] | 0x80U >> bit);
  return table;
}();

constexpr std::uint8_t pulledUp = 0xFF;

}  // namespace

void SpiBridge::capture() {
  deselect();
  phase_ = Phase::search;
  pending_ = false;
}

void SpiBridge::shift(const BitVector& in, BitVector& out) {
  out.fill(false);
  if (in.empty()) return;
  const std::uint64_t start = clock_.clocks;
  shiftBits(in, out);
  clock_.clocks = start;
}

void SpiBridge::shiftBits(const BitVector& in, BitVector& out) {
  out.set(0, pending_);
  pending_ = false;
  const std::uint64_t start = clock_.clocks;
  const std::size_t size = in.size();
  for (std::size_t place = 0; place < size;) {
    if (phase_ == Phase::done) return;
    if (phase_ == Phase::search) {
      place = search(in, place);
      continue;
    }
    if (phase_ == Phase::length) {
      takeLengthBit(in.get(place++));
      continue;
    }
    clock_.clocks = start + place;
    const std::size_t behind = transferBytes(in, place, out);
    if (behind != place) {
      place = behind;
      continue;
    }
    const bool level = transferBit(in.get(place++));
    if (place < size) {
      out.set(place, level);
    } else {
      pending_ = level;
    }
  }
}

std::size_t SpiBridge::search(const BitVector& in, std::size_t place) {
  while (place < in.size()) {
    const std::size_t count = std::min(BitVector::wordBits, in.size() - place);
    const BitVector::Word bits = in.number(place, count);
    if (bits != 0) {
      phase_ = Phase::length;
      lengthBits_ = 0;
      left_ = 0;
      return place + static_cast<std::size_t>(std::countr_zero(bits)) + 1;
    }
    place += count;
  }
  return place;
}

void SpiBridge::takeLengthBit(bool bit) {
  left_ = left_ << 1 | std::uint64_t{bit};
  if (++lengthBits_ < 32) return;
  ++left_;
  phase_ = Phase::transfer;
  bitOfByte_ = 0;
  if (flash_ != nullptr) flash_->select();
}

std::size_t SpiBridge::transferBytes(const BitVector& in, std::size_t place, BitVector& out) {
  if (bitOfByte_ != 0 || flash_ == nullptr) return place;
  while (left_ > 8 && place + 9 <= in.size()) {
    out.setNumber(place + 1, 8, reversed[flash_->answer()]);
    clock_.clocks += 7;
    flash_->receive(reversed[in.number(place, 8)]);
    ++clock_.clocks;
    place += 8;
    left_ -= 8;
  }
  return place;
}

bool SpiBridge::transferBit(bool bit) {
  if (bitOfByte_ == 0) {
    answer_ = flash_ == nullptr ? pulledUp : flash_->answer();
    received_ = 0;
  }
  received_ = static_cast<std::uint8_t>(received_ << 1 | int{bit});
  const bool level = (answer_ >> (7 - bitOfByte_) & 1) != 0;
  bitOfByte_ = (bitOfByte_ + 1) % 8;
  if (bitOfByte_ == 0 && flash_ != nullptr) flash_->receive(received_);
  if (--left_ == 0) deselect();
  return level;
}

void SpiBridge::deselect() {
  if (phase_ == Phase::transfer && flash_ != nullptr) flash_->deselect(bitOfByte_ == 0);
  phase_ = Phase::done;
}
