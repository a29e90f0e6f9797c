#pragma once

#include <chrono>
#include <functional>

/// How long a piece of work takes at its fastest, in seconds.
inline double fastest(int rounds, const std::function<void()>& work) {
  double best = 0;
  for (int i = 0; i < rounds; ++i) {
    const auto start = std::chrono::steady_clock::now();
    work();
    const double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    if (i == 0 || seconds < best) best = seconds;
  }
  return best;
}

/// TCKs a second that the board's side of the protocol carries out, without a network. False when a bar is missed.
bool reportDecoder();
/// A mebibyte through a chain and back over TCP, with a client that compares. False when the bar is missed or other
/// bits come back.
bool reportRoundTrip();
