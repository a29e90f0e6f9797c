#include <gtest/gtest.h>

#include "manager/scan/ChainScan.h"
#include "tests/unit/manager/scan/FakeChain.h"

namespace {

std::vector<std::string> shown(const std::vector<BitVector>& idcodes) {
  std::vector<std::string> result;
  for (const BitVector& idcode : idcodes) result.push_back(idcode.hex());
  return result;
}

std::string problem(FakeChain& chain) {
  FakeCable cable(chain);
  const Result<ChainScan::Found> found = ChainScan::find(cable);
  return found ? "" : found.failure().text;
}

TEST(ChainScan, FindsDevicesInTheirOrderAndTheirInstructionBits) {
  FakeChain chain(
      {FakeTap(4, 0x10000001), FakeTap(6, std::nullopt), FakeTap(38, 0xFFFFFFFD), FakeTap(2, std::nullopt)});
  FakeCable cable(chain);
  const Result<ChainScan::Found> found = ChainScan::find(cable);
  ASSERT_TRUE(found) << found.failure().text;
  EXPECT_EQ(shown(found->idcodes), (std::vector<std::string>{"10000001", "0", "FFFFFFFD", "0"}));
  EXPECT_EQ(found->idcodes[1], BitVector(1));
  EXPECT_EQ(found->totalIrLength, 50U);
  EXPECT_EQ(found->irCapture.binary(),
            "0001"
            "000001" +
                std::string(37, '0') +
                "1"
                "01");
  EXPECT_EQ(chain.state, TapState::reset);
}

TEST(ChainScan, OneDeviceIsEnough) {
  FakeChain chain({FakeTap(8, 0x0A001093)});
  FakeCable cable(chain);
  const Result<ChainScan::Found> found = ChainScan::find(cable);
  ASSERT_TRUE(found) << found.failure().text;
  EXPECT_EQ(shown(found->idcodes), std::vector<std::string>{"0A001093"});
  EXPECT_EQ(found->totalIrLength, 8U);
}

TEST(ChainScan, FindsAsManyAsThereMayBe) {
  FakeChain chain(std::vector<FakeTap>(256, FakeTap(2, 0x12345679)));
  FakeCable cable(chain);
  const Result<ChainScan::Found> found = ChainScan::find(cable);
  ASSERT_TRUE(found) << found.failure().text;
  EXPECT_EQ(found->idcodes.size(), 256U);
  EXPECT_EQ(found->totalIrLength, 512U);
}

TEST(ChainScan, MoreAreTooMany) {
  FakeChain chain(std::vector<FakeTap>(257, FakeTap(2, 0x12345679)));
  EXPECT_EQ(problem(chain),
            "the chain is broken: what was shifted in at TDI did not come out of the data registers after reset, of "
            "256 devices at most, within 8192 bits");
  FakeChain bypassed(std::vector<FakeTap>(257, FakeTap(2, std::nullopt)));
  EXPECT_NE(problem(bypassed), "");
}

TEST(ChainScan, AStuckTdoIsNamed) {
  FakeChain chain({FakeTap(8, 0x0A001093)});
  chain.tdo = FakeChain::Tdo::low;
  EXPECT_EQ(problem(chain),
            "TDO is stuck at 0: 8256 bits read are all 0. Is the board powered, and is the cable connected?");
  chain.tdo = FakeChain::Tdo::high;
  EXPECT_EQ(problem(chain),
            "TDO is stuck at 1: 8256 bits read are all 1. Is the board powered, and is the cable connected?");
}

TEST(ChainScan, ABrokenChainIsNoticed) {
  FakeChain chain({FakeTap(8, 0x0A001093)});
  chain.tdo = FakeChain::Tdo::inverted;
  EXPECT_TRUE(problem(chain).starts_with("the chain is broken: ")) << problem(chain);
}

TEST(ChainScan, NothingIsLeftInTheInstructionRegistersButBypass) {
  FakeChain chain({FakeTap(4, 0x10000001), FakeTap(6, 0x10000003)});
  FakeCable cable(chain);
  const Result<BitVector> captured = ChainScan::captureInstructions(cable, 2);
  ASSERT_TRUE(captured);
  EXPECT_EQ(chain.taps[0].instruction(), FakeTap::bitsOf(0xF, 4));
  EXPECT_EQ(chain.taps[1].instruction(), FakeTap::bitsOf(0x3F, 6));
  const Result<std::size_t> length = ChainScan::measureData(cable, 10);
  ASSERT_TRUE(length);
  EXPECT_EQ(*length, 2U);
}

TEST(ChainScan, InstructionRegistersThatAreTooShortContradict) {
  FakeChain chain({FakeTap(4, 0x10000001)});
  FakeCable cable(chain);
  const Result<BitVector> captured = ChainScan::captureInstructions(cable, 3);
  ASSERT_FALSE(captured);
  EXPECT_EQ(captured.failure().text,
            "the instruction registers of 3 devices have 4 bits together, expected 2 a device at least");
}

/// TDI and TDO joined.
class Wire : public FakeCable {
 public:
  using FakeCable::FakeCable;
  Status shift(const BitVector& tdi, bool, BitVector* tdo) override {
    if (tdo != nullptr) *tdo = tdi;
    return {};
  }
};

TEST(ChainScan, AWireIsNoDevice) {
  FakeChain chain({});
  Wire cable(chain);
  const Result<ChainScan::Found> found = ChainScan::find(cable);
  ASSERT_FALSE(found);
  EXPECT_EQ(found.failure().text, "there is no device on the chain: TDI comes out at TDO at once");
}

class Recorder : public FakeCable {
 public:
  using FakeCable::FakeCable;
  bool recordsOnly() const override { return true; }
};

TEST(ChainScan, NeedsAnswers) {
  FakeChain chain({FakeTap(4, 0x10000001)});
  Recorder cable(chain);
  const Result<ChainScan::Found> found = ChainScan::find(cable);
  ASSERT_FALSE(found);
  EXPECT_EQ(found.failure().text, "a chain cannot be examined through the fake chain, which only records");
}

}  // namespace
