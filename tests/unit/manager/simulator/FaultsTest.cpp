// The faults that a board file asks for.

#include <gtest/gtest.h>

#include "tests/unit/manager/simulator/Jtag.h"

namespace {

std::string withFaults(const std::string& faults) {
  return R"({"chain": [{"part": "zp18v01"}], "faults": )" + faults + "}";
}

/// Shifts bits through BYPASS and gives what came out, one clock later.
BitVector throughBypass(TestBoard& test, const BitVector& bits) {
  Jtag jtag(*test.board, findParts(test.parts, {"zp18v01"}));
  jtag.loadOpcode(0, BitVector());
  BitVector longer = bits;
  longer.append(false);
  return jtag.data(0, longer).slice(1, bits.size());
}

std::size_t differences(const BitVector& left, const BitVector& right) {
  std::size_t count = 0;
  for (std::size_t i = 0; i < left.size(); ++i) count += left.get(i) != right.get(i) ? 1 : 0;
  return count;
}

constexpr std::size_t many = 100000;

}  // namespace

TEST(Faults, WithoutThemBitsComeThrough) {
  TestBoard test(withFaults("{}"));
  EXPECT_EQ(throughBypass(test, randomBits(many, 1)), randomBits(many, 1));
}

TEST(Faults, StuckTdo) {
  for (const bool level : {false, true}) {
    TestBoard test(withFaults(level ? R"({"stuckTdo": 1})" : R"({"stuckTdo": 0})"));
    EXPECT_EQ(throughBypass(test, randomBits(many, 1)), BitVector(many, level));
    EXPECT_EQ(test.board->tdo(), level);
    EXPECT_EQ(test.board->clockLevels(0, 0, 8), level ? 0xFFU : 0U);
  }
}

TEST(Faults, NoiseFlipsBitsAtItsRate) {
  for (const char* line : {"flipTdo", "flipTdi"}) {
    TestBoard test(withFaults("{\"" + std::string(line) + R"(": {"rate": 0.01, "seed": 5}})"));
    const std::size_t flipped = differences(throughBypass(test, randomBits(many, 1)), randomBits(many, 1));
    EXPECT_GT(flipped, many / 100 / 2) << line;
    EXPECT_LT(flipped, many / 100 * 2) << line;
  }
}

TEST(Faults, NoiseIsTheSameForTheSameSeedHoweverItIsClocked) {
  const std::string text =
      withFaults(R"({"flipTdo": {"rate": 0.05, "seed": 5}, "flipTdi": {"rate": 0.02, "seed": 9}})");
  TestBoard inRuns(text);
  TestBoard inSteps(text);
  TestBoard otherSeed(withFaults(R"({"flipTdo": {"rate": 0.05, "seed": 6}, "flipTdi": {"rate": 0.02, "seed": 9}})"));
  const BitVector bits = randomBits(5000, 3);
  BitVector runs;
  BitVector steps;
  BitVector others;
  for (TestBoard* test : {&inRuns, &inSteps, &otherSeed}) test->board->clockLevels(0b0010, 0, 4);
  for (std::size_t place = 0; place < bits.size(); place += 500) {
    inRuns.board->clock(false, bits.slice(place, 500), &runs);
    otherSeed.board->clock(false, bits.slice(place, 500), &others);
    for (std::size_t i = 0; i < 500; ++i)
      steps.append(inSteps.board->clockLevels(0, bits.get(place + i) ? 1 : 0, 1) != 0);
  }
  EXPECT_EQ(runs, steps);
  EXPECT_NE(runs, others);
}

TEST(Faults, TdoIsWhatTheNextClockReads) {
  TestBoard test(withFaults(R"({"flipTdo": {"rate": 0.3, "seed": 1}})"));
  test.board->clockLevels(0b0010, 0, 4);
  for (int i = 0; i < 1000; ++i) {
    const bool before = test.board->tdo();
    ASSERT_EQ(test.board->clockLevels(0, 1, 1) != 0, before) << i;
  }
}

TEST(Faults, ABusyBitThatNeverEnds) {
  TestBoard test(R"({"chain": [{"part": "marlin3an-1", "spi": {"part": "w25q64"}, "faults": {"busyForever": true}}]})");
  Jtag jtag(*test.board, findParts(test.parts, {"marlin3an-1"}));
  jtag.access(0, "ISC_ENABLE", 0xD0, 8);
  EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8) & 1U, 0U) << "nothing was begun";
  jtag.access(0, "ISC_ERASE", 0xA5, 8);
  jtag.wait(1e6);
  EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8) & 1U, 1U);
}

TEST(Faults, AWrongIdcode) {
  TestBoard test(R"({"chain": [{"part": "zp18v01", "faults": {"idcode": "DEADBEEF"}}]})");
  Jtag jtag(*test.board, findParts(test.parts, {"zp18v01"}));
  EXPECT_EQ(jtag.access(0, "IDCODE", 0, 32), 0xDEADBEEFU);
}

TEST(Faults, ALinkThatDrops) {
  TestBoard test(withFaults(R"({"dropAfter": 100})"));
  test.board->countLinkBytes(99);
  EXPECT_TRUE(test.board->linkUp());
  EXPECT_EQ(test.board->linkBytesLeft(), 1U);
  test.board->countLinkBytes(5);
  EXPECT_FALSE(test.board->linkUp());
  test.board->reconnect();
  EXPECT_TRUE(test.board->linkUp());
}
