#include <gtest/gtest.h>

#include "manager/scan/ScanChain.h"
#include "tests/unit/manager/scan/FakeChain.h"

namespace {

constexpr std::uint64_t dataOpcode = 0x6;

FakeTap tap(std::size_t irLength, std::optional<std::uint32_t> idcode, std::size_t dataLength) {
  FakeTap result(irLength, idcode);
  result.addRegister(dataOpcode, dataLength);
  return result;
}

class ScanChainTest : public testing::Test {
 protected:
  FakeChain fake{{tap(4, 0x10000001, 8), tap(6, std::nullopt, 70), tap(5, 0x20000003, 9)}};
  FakeCable cable{fake};
  ScanChain chain{cable, {4, 6, 5}};
};

TEST_F(ScanChainTest, OneDeviceGetsTheInstructionTheOthersBypass) {
  BitVector captured;
  ASSERT_TRUE(chain.loadInstruction(1, BitVector::fromNumber(dataOpcode, 6), &captured));
  EXPECT_EQ(fake.taps[0].instruction(), FakeTap::bitsOf(0xF, 4));
  EXPECT_EQ(fake.taps[1].instruction(), FakeTap::bitsOf(dataOpcode, 6));
  EXPECT_EQ(fake.taps[2].instruction(), FakeTap::bitsOf(0x1F, 5));
  EXPECT_EQ(captured, BitVector::fromNumber(1, 6));
}

TEST_F(ScanChainTest, EveryDeviceGetsItsInstruction) {
  ASSERT_TRUE(chain.loadInstructions(
      {BitVector::fromNumber(9, 4), BitVector::fromNumber(0x2A, 6), BitVector::fromNumber(0x13, 5)}));
  EXPECT_EQ(fake.taps[0].instruction(), FakeTap::bitsOf(9, 4));
  EXPECT_EQ(fake.taps[1].instruction(), FakeTap::bitsOf(0x2A, 6));
  EXPECT_EQ(fake.taps[2].instruction(), FakeTap::bitsOf(0x13, 5));
}

TEST_F(ScanChainTest, DataReachTheDeviceAndComeBackFromEachPlace) {
  const std::vector<std::size_t> irLengths = {4, 6, 5};
  const std::vector<std::string> data = {"A5", "2B3C4D5E6F708192A3", "1C7"};
  const std::vector<std::size_t> lengths = {8, 70, 9};
  for (std::size_t device = 0; device < 3; ++device) {
    ASSERT_TRUE(chain.loadInstruction(device, BitVector::fromNumber(dataOpcode, irLengths[device])));
    const BitVector out = *BitVector::fromHex(data[device], lengths[device]);
    ASSERT_TRUE(chain.scanData(device, {.out = out}));
    const FakeTap::Bits& stored = fake.taps[device].stored(dataOpcode);
    for (std::size_t i = 0; i < out.size(); ++i) ASSERT_EQ(stored[i], out.get(i)) << device << ", bit " << i;
    BitVector in;
    EXPECT_TRUE(chain.scanData(device, {.out = BitVector(out.size()), .in = &in, .expected = &out}));
    EXPECT_EQ(in, out) << device;
  }
}

TEST_F(ScanChainTest, ADifferenceIsNamedByTheDevicesOwnBits) {
  ASSERT_TRUE(chain.loadInstruction(0, BitVector::fromNumber(dataOpcode, 4)));
  ASSERT_TRUE(chain.scanData(0, {.out = BitVector::fromNumber(0x24, 8)}));
  const BitVector expected = BitVector::fromNumber(0x20, 8);
  const BitVector mask = BitVector::fromNumber(0xFB, 8);
  EXPECT_TRUE(chain.scanData(0, {.out = BitVector::fromNumber(0x24, 8), .expected = &expected, .mask = &mask}));
  const Status status = chain.scanData(0, {.out = BitVector(8), .expected = &expected});
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "expected 20, found 24 at bit 2 of 8");
  EXPECT_EQ(status.failure().kind, Failure::Kind::mismatch);
}

TEST_F(ScanChainTest, TheEndStateIsPassedOn) {
  ASSERT_TRUE(chain.loadInstruction(2, BitVector::fromNumber(dataOpcode, 5), nullptr, TapState::irPause));
  EXPECT_EQ(fake.state, TapState::irPause);
  ASSERT_TRUE(chain.scanData(2, {.out = BitVector(9), .end = TapState::drPause}));
  EXPECT_EQ(fake.state, TapState::drPause);
}

TEST_F(ScanChainTest, WrongSizesAndPlacesAreRefused) {
  const Status wrongLength = chain.loadInstruction(1, BitVector(5));
  ASSERT_FALSE(wrongLength);
  EXPECT_EQ(wrongLength.failure().text,
            "an instruction of 5 bits does not fit the device 1 of the chain, whose instruction register has 6");
  EXPECT_FALSE(chain.loadInstruction(3, BitVector(5)));
  EXPECT_FALSE(chain.scanData(3, {.out = BitVector(5)}));
  EXPECT_FALSE(chain.loadInstructions({BitVector(4), BitVector(6)}));
  EXPECT_FALSE(chain.loadInstructions({BitVector(4), BitVector(6), BitVector(6)}));
  EXPECT_EQ(fake.clocks, 0U);
}

/// Keeps the last scan, and has no answers.
class RecordingCable : public FakeCable {
 public:
  using FakeCable::FakeCable;
  bool recordsOnly() const override { return true; }
  Status irScan(const Scan& scan) override { return keep(scan); }
  Status drScan(const Scan& scan) override { return keep(scan); }

  BitVector out;
  std::optional<BitVector> expected;
  std::optional<BitVector> mask;

 private:
  Status keep(const Scan& scan) {
    out = scan.out;
    expected = scan.expected == nullptr ? std::nullopt : std::optional(*scan.expected);
    mask = scan.mask == nullptr ? std::nullopt : std::optional(*scan.mask);
    return {};
  }
};

TEST_F(ScanChainTest, ARecordingCableGetsWhatIsComparedWithoutTheBypassBits) {
  RecordingCable recorder(fake);
  ScanChain recorded(recorder, {4, 6, 5});
  const BitVector expected = BitVector::fromNumber(0xA, 4);
  BitVector in;
  ASSERT_TRUE(recorded.scanData(1, {.out = BitVector::fromNumber(0x5, 4), .in = &in, .expected = &expected}));
  EXPECT_EQ(recorder.out.binary(), "001010");
  EXPECT_EQ(recorder.expected->binary(), "010100");
  EXPECT_EQ(recorder.mask->binary(), "011110");
  EXPECT_EQ(in, BitVector(4));
  const BitVector mask = BitVector::fromNumber(0x9, 4);
  ASSERT_TRUE(recorded.scanData(0, {.out = BitVector(4), .expected = &expected, .mask = &mask}));
  EXPECT_EQ(recorder.mask->binary(), "100100");
  BitVector captured;
  ASSERT_TRUE(recorded.loadInstruction(0, BitVector(4), &captured));
  EXPECT_EQ(recorder.out.binary(), "000011111111111");
  EXPECT_EQ(captured, BitVector(4));
}

}  // namespace
