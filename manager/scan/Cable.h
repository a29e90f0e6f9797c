#pragma once

#include <cstdint>
#include <string>

#include "manager/scan/BitVector.h"
#include "manager/scan/TapState.h"
#include "manager/support/Result.h"

/// One scan. What `in`, `expected` and `mask` point to stays in place until the call returns; vectors have the size
/// of `out`.
struct Scan {
  const BitVector& out;
  BitVector* in = nullptr;              ///< gets the bits that came out of the chain
  const BitVector* expected = nullptr;  ///< what must come out
  const BitVector* mask = nullptr;      ///< the bits of `expected` that count; null for all
  TapState end = TapState::idle;        ///< a stable state
};

/// Something that carries scans to a chain of TAPs: hardware, a network server, a simulated board, a vector file.
/// One thread. The state of the TAPs is the cable's to know; a new cable begins with a reset.
///
/// Calls may be carried out later, in their order, as long as a scan that reads or compares has its answer when it
/// returns and `flush` leaves nothing undone. Data that differ from those expected are a failure of kind `mismatch`,
/// a connection that is gone is one of kind `link`, and every later call has it again.
class Cable {
 public:
  virtual ~Cable() = default;

  virtual Status irScan(const Scan& scan) = 0;
  virtual Status drScan(const Scan& scan) = 0;
  /// Stays in `state`, a stable one, for at least that many TCKs and that long; goes to `end` then.
  virtual Status runTest(std::uint64_t cycles, double seconds, TapState state = TapState::idle,
                         TapState end = TapState::idle) = 0;
  /// By the shortest path; to `reset` with five TCKs of TMS high from anywhere.
  virtual Status goTo(TapState state) = 0;
  /// Returns when everything has been carried out.
  virtual Status flush() = 0;

  /// The highest TCK in Hz; 0 for no limit.
  virtual Status limitTck(std::uint32_t hertz) = 0;
  /// Drives the reset lines; true is asserted.
  virtual Status driveResets(bool trst, bool srst) = 0;
  /// Clocks by hand: a TCK for each bit of `tms`, with `tdi` of the same size. `tdo`, when not null, gets the levels
  /// seen at the rises of TCK.
  virtual Status clock(const BitVector& tms, const BitVector& tdi, BitVector* tdo) = 0;
  /// Whether the cable only records, so that reads have no answer and comparisons succeed.
  virtual bool recordsOnly() const { return false; }
  /// Such as "simulated board quad.json" or "remote server localhost:3335".
  virtual std::string description() const = 0;
};
