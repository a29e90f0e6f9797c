#include "manager/simulator/DataRegister.h"

#include <algorithm>

void BypassRegister::shift(const BitVector& in, BitVector& out) {
  if (in.empty()) return;
  const std::span<const BitVector::Word> from = in.words();
  const std::span<BitVector::Word> to = out.words();
  to[0] = from[0] << 1 | BitVector::Word{bit_};
  for (std::size_t i = 1; i < from.size(); ++i) to[i] = from[i] << 1 | from[i - 1] >> (BitVector::wordBits - 1);
  const std::size_t used = in.size() % BitVector::wordBits;
  if (used != 0) to.back() &= (BitVector::Word{1} << used) - 1;
  bit_ = in.get(in.size() - 1);
}

ShiftRegister::ShiftRegister(std::size_t length, Captured captured, Updated updated)
    : length_(std::max<std::size_t>(length, 1)), captured_(std::move(captured)), updated_(std::move(updated)) {}

void ShiftRegister::capture() {
  if (captured_) load(captured_());
}

void ShiftRegister::shift(const BitVector& in, BitVector& out) {
  if (ring_.empty()) ring_.resize(length_);
  if (in.size() < length_) return rotate(in, out);
  out.copy(0, ring_, first_, length_ - first_);
  out.copy(length_ - first_, ring_, 0, first_);
  const std::size_t through = in.size() - length_;
  out.copy(length_, in, 0, through);
  ring_.copy(0, in, through, length_);
  first_ = 0;
}

void ShiftRegister::rotate(const BitVector& in, BitVector& out) {
  std::size_t done = 0;
  while (done < in.size()) {
    const std::size_t count = std::min(in.size() - done, length_ - first_);
    out.copy(done, ring_, first_, count);
    ring_.copy(first_, in, done, count);
    done += count;
    first_ += count;
    if (first_ == length_) first_ = 0;
  }
}

bool ShiftRegister::next() const { return !ring_.empty() && ring_.get(first_); }

void ShiftRegister::update() {
  if (updated_) updated_(value());
}

BitVector ShiftRegister::value() const {
  if (ring_.empty()) return BitVector(length_);
  if (first_ == 0) return ring_;
  BitVector result(length_);
  result.copy(0, ring_, first_, length_ - first_);
  result.copy(length_ - first_, ring_, 0, first_);
  return result;
}

void ShiftRegister::load(const BitVector& value) {
  ring_ = value;
  ring_.resize(length_);
  first_ = 0;
}
