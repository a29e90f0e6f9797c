#pragma once

#include "manager/scan/Cable.h"

/// A cable that knows levels only: it lowers scans to runs of TCKs.
class BitCable : public Cable {
 public:
  Status irScan(const Scan& scan) override;
  Status drScan(const Scan& scan) override;
  Status runTest(std::uint64_t cycles, double seconds, TapState state, TapState end) override;
  Status goTo(TapState state) override;
  Status clock(const BitVector& tms, const BitVector& tdi, BitVector* tdo) override;

 protected:
  /// Clocks one TCK for each bit of `tdi`. TMS is low but for the last bit, which has `lastTms`.
  /// `tdo`, when not null, has the size of `tdi` and gets the levels seen at the rises of TCK.
  virtual Status shift(const BitVector& tdi, bool lastTms, BitVector* tdo) = 0;
  /// Clocks TMS levels, bit 0 first, with TDI low, nothing read; at most 32.
  virtual Status clockTms(std::uint32_t tms, int count) = 0;
  /// Clocks `count` times with this TMS, TDI low, nothing read.
  virtual Status idleClocks(bool tms, std::uint64_t count) = 0;
  /// Clocks any levels; the way of `clock`.
  virtual Status clockLevels(const BitVector& tms, const BitVector& tdi, BitVector* tdo) = 0;
  /// Lets time pass with no clock. What was clocked before is carried out first.
  virtual Status wait(double seconds) = 0;

  /// Asked first by every call: the failure of a link that is gone.
  virtual Status link() const { return {}; }

  TapState state() const { return state_; }
  /// Tells that the TAPs were reset by a line.
  void setState(TapState state) { state_ = state; }

 private:
  Status scan(const Scan& scan, TapState shiftState);
  Status shiftBits(const Scan& scan, TapState shiftState, BitVector* found);
  /// The way of a scan of no bits: capture, then exit.
  Status passCapture(TapState shiftState);
  Status resetTaps();
  /// Stays when the TAPs are there already.
  Status moveTo(TapState state);

  TapState state_ = TapState::reset;
  bool stateKnown_ = false;  ///< false until the first reset
};
