#pragma once

#include <cstdint>

/// A progress event, made by the device manager for the time of one callback.
class Callback {
 public:
  enum ProgressStatus : std::int32_t { start = 0, end = 1, update = 2 };

  Callback(std::int32_t status, std::int32_t current, std::int32_t total)
      : status_(status), current_(current), total_(total) {}

  std::int32_t getProgressStatus() const { return status_; }
  /// Work done so far, in the units of `getTotalCount`.
  std::int32_t getCurrentCount() const { return current_; }
  /// Total work; expected to be non-zero with an update.
  std::int32_t getTotalCount() const { return total_; }

 private:
  std::int32_t status_;
  std::int32_t current_;
  std::int32_t total_;
};
