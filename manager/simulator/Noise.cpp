#include "manager/simulator/Noise.h"

#include <cmath>

Noise::Noise(const BoardDescription::Noise& noise) : rate_(noise.rate), random_(noise.seed) {
  if (active()) draw();
}

void Noise::apply(BitVector& bits) {
  if (!active()) return;
  std::uint64_t place = 0;
  while (distance_ < bits.size() - place) {
    place += distance_;
    bits.set(static_cast<std::size_t>(place), !bits.get(static_cast<std::size_t>(place)));
    ++place;
    draw();
  }
  distance_ -= bits.size() - place;
}

void Noise::skip(std::uint64_t count) {
  if (!active()) return;
  while (distance_ < count) {
    count -= distance_ + 1;
    draw();
  }
  distance_ -= count;
}

/// The distances between independent events are distributed geometrically.
void Noise::draw() {
  random_ += 0x9E3779B97F4A7C15U;
  std::uint64_t mixed = random_;
  mixed = (mixed ^ mixed >> 30) * 0xBF58476D1CE4E5B9U;
  mixed = (mixed ^ mixed >> 27) * 0x94D049BB133111EBU;
  mixed ^= mixed >> 31;
  const double uniform = (static_cast<double>(mixed >> 11) + 1) * 0x1p-53;  // above 0, at most 1
  constexpr double farthest = 1e18;
  const double distance = rate_ >= 1 ? 0 : std::floor(std::log(uniform) / std::log1p(-rate_));
  distance_ = static_cast<std::uint64_t>(distance < farthest ? distance : farthest);
}
