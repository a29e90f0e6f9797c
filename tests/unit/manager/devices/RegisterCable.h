#pragma once

#include <functional>
#include <string>

#include "manager/scan/Cable.h"

/// A cable to one device of which only a data register matters: `scanned` gets the bits of each DR scan and gives
/// what comes out. Time adds up.
class RegisterCable : public Cable {
 public:
  std::function<BitVector(const BitVector& bits)> scanned;
  double seconds = 0;

  Status irScan(const Scan& scan) override {
    if (scan.in != nullptr) *scan.in = BitVector::fromNumber(1, scan.out.size());
    return {};
  }
  Status drScan(const Scan& scan) override {
    BitVector answer = scanned(scan.out);
    answer.resize(scan.out.size());
    if (scan.in != nullptr) *scan.in = answer;
    return {};
  }
  Status runTest(std::uint64_t /*cycles*/, double time, TapState /*state*/, TapState /*end*/) override {
    seconds += time;
    return {};
  }
  Status goTo(TapState /*state*/) override { return {}; }
  Status flush() override { return {}; }
  Status limitTck(std::uint32_t /*hertz*/) override { return {}; }
  Status driveResets(bool /*trst*/, bool /*srst*/) override { return {}; }
  Status clock(const BitVector& /*tms*/, const BitVector& /*tdi*/, BitVector* /*tdo*/) override { return {}; }
  std::string description() const override { return "a register"; }
};
