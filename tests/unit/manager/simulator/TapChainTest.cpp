#include <gtest/gtest.h>

#include <deque>
#include <random>

#include "manager/simulator/BoardClock.h"
#include "manager/simulator/TapChain.h"

namespace {

/// A part with an IDCODE or without, and a data register of its own that captures a pattern.
PartPointer makePart(std::size_t irLength, std::optional<std::uint32_t> idcode, std::size_t dataLength) {
  auto part = std::make_shared<Part>();
  part->name = "part" + std::to_string(irLength);
  part->irLength = irLength;
  part->irCapture.value = BitVector::fromNumber(0b01, irLength);
  part->opcodes["DATA"] = {BitVector::fromNumber(0b0101, irLength), BitVector::fromNumber(0b0110, irLength)};
  part->opcodes["KEEP"] = {BitVector::fromNumber(0b0111, irLength)};
  if (idcode) {
    part->opcodes["IDCODE"] = {BitVector::fromNumber(0b0001, irLength)};
    part->idcodes.push_back({BitVector::fromNumber(*idcode, 32), BitVector(32, true)});
  }
  part->access["DATA"] = {"DATA", dataLength};
  return part;
}

BitVector patternOf(std::size_t length) {
  BitVector bits(length);
  for (std::size_t i = 0; i < length; ++i) bits.set(i, i % 3 == 0);
  return bits;
}

/// The same device bit by bit, as the standard describes it: the reference.
class SlowDevice {
 public:
  explicit SlowDevice(PartPointer part) : part_(std::move(part)), kept_(100, false) { reset(); }

  void reset() { instruction_ = part_->idcodes.empty() ? "BYPASS" : "IDCODE"; }
  bool tdo(TapState state) const {
    if (state == TapState::irShift) return ir_.front();
    return reg().front();
  }
  void clock(TapState state, TapState to, bool tdi) {
    if (state == TapState::irCapture) ir_ = bitsOf(part_->irCapture.value);
    if (state == TapState::drCapture && instruction_ != "KEEP") reg() = captured();
    if (state == TapState::irShift) push(ir_, tdi);
    if (state == TapState::drShift) push(reg(), tdi);
    if (to == TapState::irUpdate) decode();
    if (to == TapState::reset) reset();
  }

 private:
  using Bits = std::deque<bool>;

  static Bits bitsOf(const BitVector& bits) {
    Bits result;
    for (std::size_t i = 0; i < bits.size(); ++i) result.push_back(bits.get(i));
    return result;
  }
  static void push(Bits& bits, bool tdi) {
    bits.pop_front();
    bits.push_back(tdi);
  }
  Bits captured() const {
    if (instruction_ == "IDCODE") return bitsOf(part_->idcodes.front().value);
    if (instruction_ == "DATA") return bitsOf(patternOf(part_->access.at("DATA").length));
    return {false};
  }
  void decode() {
    instruction_ = "BYPASS";
    for (const auto& [name, codes] : part_->opcodes)
      for (const BitVector& code : codes)
        if (bitsOf(code) == ir_) instruction_ = name;
  }
  Bits& reg() { return instruction_ == "KEEP" ? kept_ : dr_; }
  const Bits& reg() const { return instruction_ == "KEEP" ? kept_ : dr_; }

  PartPointer part_;
  std::string instruction_;
  Bits ir_ = Bits(64, false);
  Bits dr_ = {false};
  Bits kept_;
};

/// The fast chain and the slow one side by side.
class BothChains {
 public:
  explicit BothChains(const std::vector<PartPointer>& parts) : chain_(clock_) {
    for (const PartPointer& part : parts) {
      slow_.emplace_back(part);
      const std::size_t length = part->access.at("DATA").length;
      TapDevice& tap = taps_.emplace_back(part, [] {});
      const BitVector idcode = part->idcodes.empty() ? BitVector() : part->idcodes.front().value;
      DataRegister& id = registers_.emplace_back(32, [idcode] { return idcode; });
      DataRegister& data = registers_.emplace_back(length, [length] { return patternOf(length); });
      DataRegister& kept = registers_.emplace_back(100);
      tap.define({.name = "IDCODE", .reg = &id});
      tap.define({.name = "DATA", .reg = &data});
      tap.define({.name = "KEEP", .reg = &kept});
      chain_.add(tap);
    }
    chain_.reset();
  }

  TapChain& fast() { return chain_; }
  std::uint64_t clocks() const { return clock_.clocks; }

  bool slowClock(bool tms, bool tdi) {
    const TapState to = Tap::next(state_, tms);
    const bool shifts = state_ == TapState::drShift || state_ == TapState::irShift;
    const bool level = shifts ? slow_.back().tdo(state_) : true;
    bool bit = tdi;
    for (SlowDevice& device : slow_) {
      const bool out = shifts && device.tdo(state_);
      device.clock(state_, to, bit);
      bit = out;
    }
    state_ = to;
    return level;
  }
  TapState state() const { return state_; }

 private:
  BoardClock clock_;
  std::deque<ShiftRegister> registers_;
  std::deque<TapDevice> taps_;
  TapChain chain_;
  std::deque<SlowDevice> slow_;
  TapState state_ = TapState::reset;
};

std::vector<PartPointer> makeChain(std::mt19937& random) {
  std::vector<PartPointer> parts;
  const std::size_t count = 1 + random() % 5;
  for (std::size_t i = 0; i < count; ++i) {
    const std::optional<std::uint32_t> idcode =
        random() % 3 == 0 ? std::nullopt : std::optional(static_cast<std::uint32_t>(random()) | 1U);
    parts.push_back(makePart(4 + random() % 5, idcode, 1 + random() % 300));
  }
  return parts;
}

class TapChainTest : public testing::TestWithParam<unsigned> {};

}  // namespace

TEST_P(TapChainTest, RunsOfAnyLengthGiveWhatSingleBitsGive) {
  std::mt19937 random(GetParam());
  BothChains chains(makeChain(random));
  std::size_t clocks = 0;
  for (int run = 0; run < 400; ++run) {
    const bool tms = random() % 2 == 0;
    // Long runs in the shift states, and short ones that lead from state to state.
    const std::size_t length = random() % 4 == 0 ? 1 + random() % 700 : 1 + random() % 3;
    BitVector tdi(length);
    for (std::size_t i = 0; i < length; ++i) tdi.set(i, random() % 2 == 0);
    BitVector expected;
    for (std::size_t i = 0; i < length; ++i) expected.append(chains.slowClock(tms, tdi.get(i)));
    BitVector got;
    if (random() % 3 == 0) {
      for (std::size_t i = 0; i < length; ++i) got.append(chains.fast().clockOnce(tms, tdi.get(i)));
    } else {
      chains.fast().clock(tms, tdi, &got);
    }
    clocks += length;
    ASSERT_EQ(got.binary(), expected.binary()) << "run " << run;
    ASSERT_EQ(chains.fast().state(), chains.state()) << "run " << run;
  }
  EXPECT_EQ(chains.clocks(), clocks);
}

INSTANTIATE_TEST_SUITE_P(Seeds, TapChainTest, testing::Range(1U, 41U));

TEST(TapChain, PiecesOfALongRunFitTogether) {
  std::mt19937 random(7);
  BothChains chains({makePart(4, 1, 3), makePart(6, 3, 200000)});
  const BitVector select = BitVector::fromNumber(0b0101'000101, 10);  // DATA in both: the one next to TDO first
  for (const bool tms : {false, true, true, false, false}) chains.fast().clockOnce(tms, false);
  chains.fast().clock(false, select.slice(0, 9), nullptr);
  chains.fast().clock(true, select.slice(9, 1), nullptr);
  for (const bool tms : {true, true, false, false}) chains.fast().clockOnce(tms, false);
  ASSERT_EQ(chains.fast().state(), TapState::drShift);
  BitVector tdi;
  for (int i = 0; i < 10000; ++i) tdi.appendNumber(random(), 32);
  BitVector tdo;
  chains.fast().clock(false, tdi, &tdo);
  BitVector expected = patternOf(200000);
  expected.append(patternOf(3));
  expected.append(tdi, 0, tdi.size() - expected.size());
  EXPECT_EQ(tdo, expected);
}

TEST(TapChain, FiveClocksOfHighTmsResetFromEverywhere) {
  for (std::uint32_t path = 0; path < 256; ++path) {
    BothChains chains({makePart(5, 0x1235, 9)});
    for (int i = 0; i < 8; ++i) chains.fast().clockOnce((path >> i & 1U) != 0, false);
    chains.fast().idleClocks(true, 5);
    ASSERT_EQ(chains.fast().state(), TapState::reset) << path;
  }
}

TEST(TapChain, AHeldResetIgnoresClocks) {
  BothChains chains({makePart(5, 0x1235, 9)});
  chains.fast().hold(true);
  chains.fast().idleClocks(false, 10);
  EXPECT_EQ(chains.fast().state(), TapState::reset);
  chains.fast().hold(false);
  chains.fast().idleClocks(false, 1);
  EXPECT_EQ(chains.fast().state(), TapState::idle);
}
