#pragma once

#include <cstdint>

#include "interfaces/Export.h"

/// Whether traces are wanted: one byte.
class TESSEL_EXPORT DebugTrace {
 public:
  DebugTrace() = default;
  explicit DebugTrace(bool on) : on_(on ? 1 : 0) {}
  DebugTrace(const DebugTrace&) = default;
  DebugTrace& operator=(const DebugTrace& other);
  ~DebugTrace() = default;

  bool on() const { return on_ != 0; }

 private:
  std::uint8_t on_ = 0;
};
