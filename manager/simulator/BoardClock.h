#pragma once

#include <cstdint>

/// The time of a simulated board since it was made. Clocks are counted, so that a run of them takes just as long as
/// each by itself.
struct BoardClock {
  double period = 0;  ///< of TCK in seconds
  std::uint64_t clocks = 0;
  double elapsed = 0;  ///< seconds besides the clocks

  double now() const { return elapsed + static_cast<double>(clocks) * period; }
};
