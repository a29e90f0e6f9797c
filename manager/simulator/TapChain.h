#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "manager/scan/TapState.h"
#include "manager/simulator/BoardClock.h"
#include "manager/simulator/TapDevice.h"

/// TAPs in a row that share TCK and TMS, so that all are in one state; device 0 is the first behind TDI. Levels are
/// those at the rises of TCK. Outside the shift states TDO is pulled up.
class TapChain {
 public:
  /// The devices are others' and outlive the chain.
  explicit TapChain(BoardClock& clock) : clock_(clock) {}

  /// Adds a device next to TDO.
  void add(TapDevice& device) { devices_.push_back(&device); }

  /// One TMS level for all bits; `tdo`, when not null, is appended as many.
  void clock(bool tms, const BitVector& tdi, BitVector* tdo);
  void idleClocks(bool tms, std::uint64_t count);
  bool clockOnce(bool tms, bool tdi);
  /// Resets all TAPs at once, with no clock.
  void reset();
  /// While it is held, clocks leave the TAPs in Test-Logic-Reset.
  void hold(bool held) { held_ = held; }

  bool tdo() const;
  TapState state() const { return state_; }

 private:
  bool shifting() const { return state_ == TapState::drShift || state_ == TapState::irShift; }
  bool stays(bool tms) const { return held_ || Tap::next(state_, tms) == state_; }
  DataRegister& registerOf(TapDevice& device) const;
  void stay(const BitVector& tdi, std::size_t first, BitVector* tdo);
  void shift(const BitVector& tdi, BitVector* tdo);
  const BitVector& shiftThrough(const BitVector& tdi);
  void pass(std::uint64_t clocks) { clock_.clocks += clocks; }
  void enter(TapState state);
  void leave();

  BoardClock& clock_;
  std::vector<TapDevice*> devices_;
  TapState state_ = TapState::reset;
  bool held_ = false;
  BitVector buffers_[2];  ///< what passes from device to device
  BitVector bit_ = BitVector(1);
};
