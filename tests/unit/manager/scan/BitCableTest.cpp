#include <gtest/gtest.h>

#include "manager/scan/BitCable.h"
#include "tests/unit/manager/scan/FakeChain.h"

namespace {

constexpr std::uint64_t dataOpcode = 0x2;

FakeTap tapWithData(std::size_t size) {
  FakeTap tap(4, 0x12345679);
  tap.addRegister(dataOpcode, size);
  return tap;
}

class BitCableTest : public testing::Test {
 protected:
  std::string levels() const {
    std::string result;
    for (const bool level : chain.levels) result += level ? '1' : '0';
    return result;
  }
  Status load(std::uint64_t opcode) { return cable.irScan({.out = BitVector::fromNumber(opcode, 4)}); }

  FakeChain chain{{tapWithData(12)}};
  FakeCable cable{chain};
};

TEST_F(BitCableTest, TheFirstCallResets) {
  ASSERT_TRUE(cable.goTo(TapState::idle));
  EXPECT_EQ(levels(), "111110");
  EXPECT_EQ(chain.state, TapState::idle);
}

TEST_F(BitCableTest, AFirstResetIsOne) {
  ASSERT_TRUE(cable.goTo(TapState::reset));
  EXPECT_EQ(levels(), "11111");
  ASSERT_TRUE(cable.goTo(TapState::reset));
  EXPECT_EQ(levels(), "1111111111");
}

TEST_F(BitCableTest, AScanGoesTheShortestWays) {
  ASSERT_TRUE(cable.goTo(TapState::idle));
  chain.levels.clear();
  ASSERT_TRUE(cable.irScan({.out = BitVector(4)}));
  EXPECT_EQ(levels(), "1100000110");
  chain.levels.clear();
  ASSERT_TRUE(cable.drScan({.out = BitVector(1), .end = TapState::drPause}));
  EXPECT_EQ(levels(), "10010");
  chain.levels.clear();
  ASSERT_TRUE(cable.drScan({.out = BitVector(2), .end = TapState::reset}));
  EXPECT_EQ(levels(), "100111111");
  EXPECT_EQ(chain.state, TapState::reset);
}

TEST_F(BitCableTest, AnInstructionScanMayEndInEachStableState) {
  for (const TapState end : {TapState::irPause, TapState::drPause, TapState::reset, TapState::idle}) {
    ASSERT_TRUE(cable.irScan({.out = BitVector::fromNumber(dataOpcode, 4), .end = end}));
    EXPECT_EQ(chain.state, end);
    EXPECT_EQ(cable.believed(), end);
  }
}

TEST_F(BitCableTest, ReadsIdcodeAfterReset) {
  BitVector in;
  ASSERT_TRUE(cable.goTo(TapState::reset));
  ASSERT_TRUE(cable.drScan({.out = BitVector(32), .in = &in}));
  EXPECT_EQ(in.hex(), "12345679");
}

TEST_F(BitCableTest, DataComeBackAndTheirOrderIsKept) {
  ASSERT_TRUE(load(dataOpcode));
  ASSERT_TRUE(cable.drScan({.out = BitVector::fromNumber(0xA5C, 12)}));
  EXPECT_EQ(chain.taps[0].stored(dataOpcode), FakeTap::bitsOf(0xA5C, 12));
  BitVector in;
  ASSERT_TRUE(cable.drScan({.out = BitVector(12), .in = &in}));
  EXPECT_EQ(in.hex(), "A5C");
}

TEST_F(BitCableTest, AScanOfNoBitsPassesCaptureAndUpdate) {
  ASSERT_TRUE(cable.goTo(TapState::idle));
  chain.levels.clear();
  BitVector in(3, true);
  ASSERT_TRUE(cable.drScan({.out = BitVector(), .in = &in}));
  EXPECT_EQ(levels(), "10110");  // select, capture, exit, update, idle
  EXPECT_TRUE(in.empty());
  chain.levels.clear();
  ASSERT_TRUE(cable.irScan({.out = BitVector(), .end = TapState::irPause}));
  EXPECT_EQ(levels(), "11010");
  EXPECT_EQ(chain.state, TapState::irPause);
}

TEST_F(BitCableTest, ADifferenceIsAMismatchAndTheEndStateIsReached) {
  ASSERT_TRUE(load(dataOpcode));
  ASSERT_TRUE(cable.drScan({.out = BitVector::fromNumber(0xA5C, 12)}));
  const BitVector expected = BitVector::fromNumber(0xA4C, 12);
  BitVector in;
  const Status status = cable.drScan(
      {.out = BitVector::fromNumber(0x123, 12), .in = &in, .expected = &expected, .end = TapState::drPause});
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "expected A4C, found A5C at bit 4 of 12");
  EXPECT_EQ(status.failure().kind, Failure::Kind::mismatch);
  EXPECT_EQ(in.hex(), "A5C");
  EXPECT_EQ(chain.state, TapState::drPause);
  EXPECT_EQ(cable.believed(), TapState::drPause);
}

TEST_F(BitCableTest, AMaskTakesBitsOut) {
  ASSERT_TRUE(load(dataOpcode));
  const BitVector expected = BitVector::fromNumber(0x810, 12);
  const BitVector others = BitVector::fromNumber(0x7EF, 12);
  const BitVector some = BitVector::fromNumber(0x7FF, 12);
  EXPECT_TRUE(cable.drScan({.out = BitVector(12), .expected = &expected, .mask = &others}));
  const Status status = cable.drScan({.out = BitVector(12), .expected = &expected, .mask = &some});
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "expected 810, found 000 (mask 7FF) at bit 4 of 12");
}

TEST_F(BitCableTest, OfALongScanTheBitsAroundTheDifferenceAreShown) {
  chain.taps[0].addRegister(3, 1000);
  ASSERT_TRUE(load(3));
  BitVector expected(1000);
  expected.set(137, true);
  const Status status = cable.drScan({.out = BitVector(1000), .expected = &expected});
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text,
            "expected ...0000000000000200..., found ...0000000000000000... at bit 137 of 1000 (bits 128 to 191 are "
            "shown)");
  BitVector last(1000);
  last.set(999, true);
  const Status atTheEnd = cable.drScan({.out = BitVector(1000), .expected = &last});
  ASSERT_FALSE(atTheEnd);
  EXPECT_EQ(atTheEnd.failure().text,
            "expected 8000000000000000..., found 0000000000000000... at bit 999 of 1000 (bits 936 to 999 are shown)");
}

TEST_F(BitCableTest, SizesThatDisagreeAreRefused) {
  const BitVector expected(11);
  const Status status = cable.drScan({.out = BitVector(12), .expected = &expected});
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "a scan of 12 bits cannot be compared with 11 bits");
  EXPECT_EQ(status.failure().kind, Failure::Kind::general);
  EXPECT_FALSE(cable.clock(BitVector(2), BitVector(3), nullptr));
}

TEST_F(BitCableTest, RunTestClocksAndWaitsInItsState) {
  ASSERT_TRUE(cable.goTo(TapState::idle));
  chain.levels.clear();
  ASSERT_TRUE(cable.runTest(7, 0.5, TapState::drPause, TapState::idle));
  EXPECT_EQ(levels(),
            "1010"
            "0000000"
            "110");
  EXPECT_EQ(cable.waited, 0.5);
  EXPECT_EQ(cable.waitedIn, TapState::drPause);
}

TEST_F(BitCableTest, RunTestInResetHoldsTmsHigh) {
  ASSERT_TRUE(cable.runTest(3, 0, TapState::reset, TapState::reset));
  EXPECT_EQ(levels(), "11111111");
  EXPECT_EQ(cable.waited, 0);
}

TEST_F(BitCableTest, RunTestNeedsAStableState) {
  const Status status = cable.runTest(3, 0, TapState::drShift, TapState::idle);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "the TAPs cannot stay in the state DRSHIFT");
}

TEST_F(BitCableTest, ClockingByHandKeepsTrackOfTheState) {
  ASSERT_TRUE(load(dataOpcode));
  BitVector tdo;
  // Idle to shift, three bits, then to pause.
  const BitVector tms = *BitVector::fromBinary("01000001");
  ASSERT_TRUE(cable.clock(tms, BitVector(8, true), &tdo));
  EXPECT_EQ(chain.state, TapState::drPause);
  EXPECT_EQ(cable.believed(), TapState::drPause);
  EXPECT_EQ(tdo.size(), 8U);
  ASSERT_TRUE(cable.goTo(TapState::idle));
  EXPECT_EQ(chain.taps[0].stored(dataOpcode), FakeTap::bitsOf(0xF00, 12));
}

TEST_F(BitCableTest, AfterTheResetLineTheStateIsReset) {
  ASSERT_TRUE(cable.goTo(TapState::irPause));
  ASSERT_TRUE(cable.driveResets(true, false));
  EXPECT_EQ(cable.believed(), TapState::reset);
}

}  // namespace
