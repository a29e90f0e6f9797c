#include "manager/simulator/BpiBridge.h"

#include <algorithm>

namespace {

constexpr std::size_t length = 64;
constexpr std::uint64_t writeStrobe = std::uint64_t{1} << 48;
constexpr std::uint64_t readStrobe = std::uint64_t{1} << 49;
constexpr std::uint64_t ready = std::uint64_t{1} << 50;
constexpr std::uint64_t stream = std::uint64_t{1} << 51;
constexpr std::size_t busBits = 16;

}  // namespace

BpiBridge::BpiBridge(BpiFlash* flash, BoardClock& clock)
    : flash_(flash),
      clock_(clock),
      register_(
          length, [this] { return BitVector::fromNumber(address_ | std::uint64_t{data_} << 32 | ready, length); },
          [this](const BitVector& bits) { cycle(bits.number()); }) {}

void BpiBridge::capture() {
  streaming_ = streamNext_;
  streamNext_ = false;
  if (!streaming_) return register_.capture();
  word_ = read(address_++);
  wordBits_ = busBits;
}

void BpiBridge::shift(const BitVector& in, BitVector& out) {
  if (!streaming_) return register_.shift(in, out);
  const std::uint64_t start = clock_.clocks;
  for (std::size_t place = 0; place < in.size();) {
    const std::size_t count = std::min(wordBits_, in.size() - place);
    out.setNumber(place, count, word_);
    place += count;
    word_ = static_cast<std::uint16_t>(unsigned{word_} >> count);
    wordBits_ -= count;
    if (wordBits_ > 0) continue;
    clock_.clocks = start + place - 1;
    word_ = read(address_++);
    wordBits_ = busBits;
  }
  clock_.clocks = start;
}

bool BpiBridge::next() const { return streaming_ ? (word_ & 1U) != 0 : register_.next(); }

void BpiBridge::update() {
  if (!streaming_) register_.update();
}

void BpiBridge::cycle(std::uint64_t bits) {
  address_ = static_cast<std::uint32_t>(bits);
  streamNext_ = (bits & stream) != 0;
  if ((bits & writeStrobe) != 0 && flash_ != nullptr) flash_->write(address_, static_cast<std::uint16_t>(bits >> 32));
  if ((bits & readStrobe) != 0) data_ = read(address_);
}
