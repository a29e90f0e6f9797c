#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <vector>

#include "manager/scan/BitCable.h"
#include "manager/scan/BitVector.h"
#include "manager/scan/TapState.h"

/// A TAP the plain way: every register is a row of bits that moves by one at a clock. Device registers keep what
/// was updated last and capture it.
struct FakeTap {
  using Bits = std::vector<bool>;

  static Bits bitsOf(std::uint64_t number, std::size_t size) {
    Bits result(size);
    for (std::size_t i = 0; i < size; ++i) result[i] = (number >> i & 1U) != 0;
    return result;
  }

  /// Instructions: all ones and unknown ones are BYPASS; 1 is IDCODE, where there is one.
  FakeTap(std::size_t irLength, std::optional<std::uint32_t> idcode) : idcode_(idcode), ir_(irLength) { reset(); }

  /// A register of `size` bits behind an instruction.
  void addRegister(std::uint64_t opcode, std::size_t size) { registers_[bitsOf(opcode, ir_.size())] = Bits(size); }
  const Bits& stored(std::uint64_t opcode) const { return registers_.at(bitsOf(opcode, ir_.size())); }

  void reset() { instruction_ = idcode_ ? bitsOf(1, ir_.size()) : Bits(ir_.size(), true); }
  void captureIr() { ir_ = bitsOf(1, ir_.size()); }
  void updateIr() { instruction_ = ir_; }
  void captureDr() {
    if (const auto found = registers_.find(instruction_); found != registers_.end())
      dr_ = found->second;
    else if (idcode_ && instruction_ == bitsOf(1, ir_.size()))
      dr_ = bitsOf(*idcode_, 32);
    else
      dr_ = Bits(1);
  }
  void updateDr() {
    if (const auto found = registers_.find(instruction_); found != registers_.end()) found->second = dr_;
  }
  Bits& shifting(bool ir) { return ir ? ir_ : dr_; }
  const Bits& instruction() const { return instruction_; }

 private:
  std::optional<std::uint32_t> idcode_;
  Bits ir_;
  Bits instruction_;
  Bits dr_ = Bits(1);
  std::map<Bits, Bits> registers_;
};

/// TAPs in a row, clocked a bit at a time.
class FakeChain {
 public:
  /// What a broken TDO line does.
  enum class Tdo { works, low, high, inverted };

  explicit FakeChain(std::vector<FakeTap> tapsOfIt, TapState start = TapState::drPause)
      : taps(std::move(tapsOfIt)), state(start) {}

  /// One rise of TCK; gives the level of TDO at it.
  bool clock(bool tms, bool tdi) {
    const bool shifts = state == TapState::irShift || state == TapState::drShift;
    const bool level = shifts ? shift(tdi) : false;
    ++clocks;
    levels.push_back(tms);
    state = Tap::next(state, tms);
    for (FakeTap& tap : taps) enter(tap);
    return broken(level);
  }

  /// TDO before the next rise, when it works.
  bool peek() {
    const bool ir = state == TapState::irShift;
    return (ir || state == TapState::drShift) && taps.back().shifting(ir).front();
  }

  std::vector<FakeTap> taps;
  TapState state;
  std::uint64_t clocks = 0;
  std::vector<bool> levels;  ///< of TMS, as they came
  Tdo tdo = Tdo::works;
  /// Every so many bits TDO is wrong; 0 for never.
  std::uint64_t errorEvery = 0;

 private:
  bool shift(bool bit) {
    for (FakeTap& tap : taps) {
      FakeTap::Bits& row = tap.shifting(state == TapState::irShift);
      const bool out = row.front();
      row.erase(row.begin());
      row.push_back(bit);
      bit = out;
    }
    return bit;
  }

  void enter(FakeTap& tap) const {
    if (state == TapState::reset) tap.reset();
    if (state == TapState::irCapture) tap.captureIr();
    if (state == TapState::irUpdate) tap.updateIr();
    if (state == TapState::drCapture) tap.captureDr();
    if (state == TapState::drUpdate) tap.updateDr();
  }

  bool broken(bool level) {
    if (tdo == Tdo::low) return false;
    if (tdo == Tdo::high) return true;
    const bool wrong = errorEvery != 0 && clocks % errorEvery == 0;
    return level != (wrong || tdo == Tdo::inverted);
  }
};

/// A cable to a fake chain.
class FakeCable : public BitCable {
 public:
  explicit FakeCable(FakeChain& chain) : chain_(chain) {}

  Status flush() override { return {}; }
  Status limitTck(std::uint32_t) override { return {}; }
  Status driveResets(bool trst, bool) override {
    if (trst) setState(TapState::reset);
    return {};
  }
  std::string description() const override { return "fake chain"; }
  TapState believed() const { return state(); }

  double waited = 0;       ///< seconds
  TapState waitedIn = {};  ///< at the last wait

 protected:
  Status shift(const BitVector& tdi, bool lastTms, BitVector* tdo) override {
    for (std::size_t i = 0; i < tdi.size(); ++i) {
      const bool level = chain_.clock(lastTms && i + 1 == tdi.size(), tdi.get(i));
      if (tdo != nullptr) tdo->set(i, level);
    }
    return {};
  }
  Status clockTms(std::uint32_t tms, int count) override {
    for (int i = 0; i < count; ++i) chain_.clock((tms >> i & 1U) != 0, false);
    return {};
  }
  Status idleClocks(bool tms, std::uint64_t count) override {
    for (; count > 0; --count) chain_.clock(tms, false);
    return {};
  }
  Status clockLevels(const BitVector& tms, const BitVector& tdi, BitVector* tdo) override {
    for (std::size_t i = 0; i < tdi.size(); ++i) {
      const bool level = chain_.clock(tms.get(i), tdi.get(i));
      if (tdo != nullptr) tdo->set(i, level);
    }
    return {};
  }
  Status wait(double seconds) override {
    waited += seconds;
    waitedIn = chain_.state;
    return {};
  }

 private:
  FakeChain& chain_;
};
