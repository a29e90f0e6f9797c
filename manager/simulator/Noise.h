#pragma once

#include <cstdint>

#include "manager/scan/BitVector.h"
#include "manager/simulator/BoardDescription.h"

/// Flips bits of a stream at random places, the same ones for the same seed.
class Noise {
 public:
  explicit Noise(const BoardDescription::Noise& noise);

  bool active() const { return rate_ > 0; }
  /// Whether the next bit is flipped.
  bool flipsNext() const { return active() && distance_ == 0; }
  /// Goes on by all bits of the vector and flips those whose turn it is.
  void apply(BitVector& bits);
  /// Goes on by so many bits.
  void skip(std::uint64_t count);

 private:
  void draw();

  double rate_;
  std::uint64_t random_;
  std::uint64_t distance_ = 0;  ///< bits before the next flip
};
