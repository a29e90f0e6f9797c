#include <gtest/gtest.h>

#include "manager/simulator/Nets.h"
#include "tests/unit/manager/simulator/Jtag.h"

namespace {

/// Cells 3n, 3n+1, 3n+2 of a marlin3 are control, output and input of IO(n).
constexpr std::size_t cells = 56;

class BoundaryRegister : public testing::Test {
 protected:
  BitVector levels(std::size_t device) { return jtag_.data(device, released()); }
  /// All outputs off.
  static BitVector released() {
    BitVector bits(cells);
    for (std::size_t i = 0; i < 48; i += 3) bits.set(i, true);
    return bits;
  }
  static BitVector driving(std::size_t pin, bool level) {
    BitVector bits = released();
    bits.set(3 * pin, false);
    bits.set(3 * pin + 1, level);
    return bits;
  }

  TestBoard test_{R"json({"chain": [{"part": "marlin3-1"}, {"part": "marlin3-1"}],
                          "nets": [["0.IO(0)", "1.IO(5)"], ["0.IO(2)", "1.io(2)"]]})json"};
  Jtag jtag_{*test_.board, findParts(test_.parts, {"marlin3-1", "marlin3-1"})};
};

}  // namespace

TEST_F(BoundaryRegister, AnOutputReachesTheInputsOfItsNet) {
  jtag_.loadAll("EXTEST");
  for (const bool level : {true, false, true}) {
    BitVector both = released();  // device 1, which is next to TDO
    both.append(driving(0, level));
    jtag_.scanData(both);
    const BitVector captured = jtag_.scanData(both);
    EXPECT_EQ(captured.get(5 * 3 + 2), level) << "IO(5) of device 1";
    EXPECT_EQ(captured.get(cells + 2), level) << "a device sees its own pin";
    EXPECT_FALSE(captured.get(2 * 3 + 2)) << "another net";
  }
}

TEST_F(BoundaryRegister, SampleShowsPinsAndDrivesNone) {
  jtag_.load(0, "PRELOAD");
  jtag_.data(0, driving(0, true));
  EXPECT_FALSE(jtag_.data(0, driving(0, true)).get(2)) << "preloading drives nothing";
  jtag_.load(0, "EXTEST");
  jtag_.load(1, "SAMPLE");
  EXPECT_TRUE(levels(1).get(17)) << "a net keeps its level when nobody drives it";
  EXPECT_FALSE(levels(1).get(8)) << "another net is not concerned";
}

TEST_F(BoundaryRegister, AnOutputThatIsOffDrivesNothing) {
  jtag_.load(0, "PRELOAD");
  BitVector off = driving(0, true);
  off.set(0, true);
  jtag_.data(0, off);
  jtag_.load(0, "EXTEST");
  EXPECT_FALSE(jtag_.data(0, off).get(2));
  jtag_.data(0, driving(0, true));
  EXPECT_TRUE(jtag_.data(0, driving(0, true)).get(2));
}

TEST_F(BoundaryRegister, AnotherInstructionLetsThePinsGo) {
  jtag_.load(0, "EXTEST");
  jtag_.data(0, driving(2, false));
  jtag_.load(1, "EXTEST");
  jtag_.data(1, driving(2, true));
  EXPECT_TRUE(jtag_.data(1, driving(2, true)).get(8)) << "the first device would hold it low";
}

TEST_F(BoundaryRegister, ClampHoldsWhatWasPreloaded) {
  jtag_.load(1, "PRELOAD");
  jtag_.data(1, driving(2, true));
  jtag_.load(1, "CLAMP");
  EXPECT_EQ(jtag_.data(1, 0b11, 4), 0b1100U) << "the bypass register is selected";
  jtag_.load(0, "SAMPLE");
  EXPECT_TRUE(levels(0).get(8));
}

TEST(Nets, DriversThatDisagreeGiveLow) {
  Nets nets;
  const std::size_t net = nets.netOf({0, "a"});
  nets.join({1, "b"}, {0, "a"});
  EXPECT_EQ(nets.netOf({1, "b"}), net);
  EXPECT_FALSE(nets.level(net));
  nets.drive(net, 0, true);
  EXPECT_TRUE(nets.level(net));
  nets.drive(net, 1, false);
  EXPECT_FALSE(nets.level(net));
  nets.drive(net, 1, std::nullopt);
  EXPECT_TRUE(nets.level(net));
  nets.drive(net, 0, std::nullopt);
  EXPECT_TRUE(nets.level(net)) << "the last level stays";
}
