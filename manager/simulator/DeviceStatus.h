#pragma once

#include <cstdint>

#include "manager/simulator/BoardClock.h"

/// What ISC_STATUS tells about a device, and the modes that its models share.
class DeviceStatus {
 public:
  /// With `endless` a busy time that has begun never ends.
  DeviceStatus(const BoardClock& clock, bool endless) : clock_(clock), endless_(endless) {}

  bool busy() const { return started_ && (endless_ || clock_.now() < busyUntil_); }
  void beBusy(double seconds) {
    started_ = true;
    busyUntil_ = clock_.now() + seconds;
  }
  /// The byte of the built-in parts.
  std::uint8_t byte() const {
    return static_cast<std::uint8_t>(int{busy()} | int{done} << 1 | int{error} << 2 | int{enabled} << 3 |
                                     int{readProtected} << 4 | int{writeProtected} << 5);
  }

  bool done = false;     ///< an FPGA that started up
  bool error = false;    ///< a bad bitstream, or a refused operation
  bool enabled = false;  ///< between ISC_ENABLE and ISC_DISABLE
  bool readProtected = false;
  bool writeProtected = false;

 private:
  const BoardClock& clock_;
  bool endless_;
  bool started_ = false;
  double busyUntil_ = 0;
};
