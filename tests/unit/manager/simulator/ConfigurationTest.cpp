// The configuration of FPGAs, the flash inside some of them, their fuses and monitors.

#include <gtest/gtest.h>

#include "manager/content/Bitstream.h"
#include "tests/unit/manager/simulator/Jtag.h"

namespace {

constexpr std::size_t memoryBits = std::size_t{1} << 20;
constexpr std::uint64_t busy = 1, done = 2, error = 4, enabled = 8;

std::uint32_t idcodeOf(const Part& part) {
  return static_cast<std::uint32_t>(part.idcodes.front().value.number(0, 32));
}

BitVector number(std::uint64_t value, std::size_t size) {
  BitVector bits = BitVector::fromNumber(value, BitVector::wordBits);
  bits.resize(size);
  return bits;
}

/// A chain of an FPGA between two others.
class Fpga : public testing::TestWithParam<const char*> {
 protected:
  Fpga()
      : name_(GetParam()),
        test_(R"({"chain": [{"part": "mullet-32"}, {"part": ")" + name_ + R"("}, {"part": "zp18v01"}]})"),
        jtag_(*test_.board, findParts(test_.parts, {"mullet-32", name_, "zp18v01"})) {}

  std::vector<std::uint8_t> bitstream(std::uint32_t usercode) {
    return Bitstream::make(idcodeOf(**test_.parts.find(name_)), memoryBits / 8, usercode,
                           randomBits(memoryBits, usercode).bytes());
  }
  std::uint64_t status() { return jtag_.access(1, "ISC_STATUS", 0, 8); }
  void enable() { jtag_.access(1, "ISC_ENABLE", 0xD0, 8); }
  void configure(const std::vector<std::uint8_t>& bytes) {
    jtag_.load(1, "CFG_IN");
    jtag_.data(1, BitVector::fromBytes(bytes));
  }
  void start() {
    jtag_.load(1, "CFG_START");
    jtag_.idle(24);
  }
  BitVector readBack() {
    jtag_.load(1, "CFG_OUT");
    return jtag_.data(1, BitVector(memoryBits));
  }
  std::uint64_t usercode() { return jtag_.access(1, "USERCODE", 0, 32); }

  std::string name_;
  TestBoard test_;
  Jtag jtag_;
};

}  // namespace

TEST_P(Fpga, StartsUpOnAValidBitstreamAndGoesOnRunning) {
  enable();
  configure(bitstream(0xBEEF0001));
  EXPECT_EQ(status(), enabled);
  EXPECT_EQ(usercode(), 0xFFFFFFFFU);
  start();
  EXPECT_EQ(status(), enabled | done);
  EXPECT_EQ(usercode(), 0xBEEF0001U);
  EXPECT_EQ(readBack(), BitVector::fromBytes(bitstream(0xBEEF0001)));
  jtag_.load(1, "ISC_DISABLE");
  jtag_.reset();
  EXPECT_EQ(status(), done);
}

TEST_P(Fpga, RefusesEveryDamage) {
  const std::vector<std::uint8_t> good = bitstream(1);
  for (const std::size_t place :
       {std::size_t{0}, std::size_t{5}, std::size_t{9}, std::size_t{70000}, good.size() - 1}) {
    std::vector<std::uint8_t> bad = good;
    bad[place] ^= 0x10;
    enable();
    configure(bad);
    start();
    EXPECT_EQ(status(), enabled | error) << place;
    EXPECT_EQ(usercode(), 0xFFFFFFFFU) << place;
  }
}

TEST_P(Fpga, TakesNoDataBeforeItIsEnabled) {
  configure(bitstream(2));
  start();
  EXPECT_EQ(status(), error);
}

TEST_P(Fpga, AStartNeedsItsClocks) {
  enable();
  configure(bitstream(3));
  jtag_.load(1, "CFG_START");
  jtag_.idle(4);
  EXPECT_EQ(status(), enabled);
  jtag_.idle(100);
  EXPECT_EQ(status(), enabled) << "another instruction ended the start";
}

TEST_P(Fpga, FusesCanOnlyBeBlown) {
  EXPECT_EQ(jtag_.access(1, "READ_EFUSE_KEY", 0, 64), 0U);
  jtag_.load(1, "EFUSE_KEY");
  jtag_.data(1, number(0xF0, 256));
  jtag_.data(1, number(0x0F00, 256));
  jtag_.load(1, "READ_EFUSE_KEY");
  EXPECT_EQ(jtag_.data(1, BitVector(256)), number(0x0FF0, 256));
  jtag_.access(1, "EFUSE_CONTROL", 0b010, 32);
  jtag_.load(1, "EFUSE_KEY");
  jtag_.data(1, BitVector(256, true));
  EXPECT_EQ(jtag_.access(1, "READ_EFUSE_KEY", 0, 64), 0x0FF0U) << "writing is disabled";
  jtag_.access(1, "EFUSE_CONTROL", 0b001, 32);
  EXPECT_EQ(jtag_.access(1, "READ_EFUSE_CONTROL", 0, 32), 0b011U);
  EXPECT_EQ(jtag_.access(1, "READ_EFUSE_KEY", 0, 64), 0U) << "reading is disabled";
  jtag_.access(1, "EFUSE_CONTROL", 0b100, 32);
  jtag_.access(1, "EFUSE_CONTROL", 0b1000, 32);
  EXPECT_EQ(jtag_.access(1, "READ_EFUSE_CONTROL", 0, 32), 0b111U) << "writing the control is disabled";
}

INSTANTIATE_TEST_SUITE_P(Families, Fpga, testing::Values("marlin3-1", "marlin3an-1"),
                         [](const auto& test) { return std::string(test.param).substr(0, test.index == 0 ? 7 : 9); });

TEST(FpgaFamily, AnErasureEndsTheDesign) {
  TestBoard test(R"({"chain": [{"part": "marlin3-1"}]})");
  Jtag jtag(*test.board, findParts(test.parts, {"marlin3-1"}));
  const auto bytes = Bitstream::make(idcodeOf(**test.parts.find("marlin3-1")), memoryBits / 8, 7, {});
  jtag.access(0, "ISC_ENABLE", 0xD0, 8);
  jtag.load(0, "CFG_IN");
  jtag.data(0, BitVector::fromBytes(bytes));
  jtag.load(0, "CFG_START");
  jtag.idle(24);
  ASSERT_EQ(jtag.access(0, "ISC_STATUS", 0, 8), enabled | done);
  jtag.access(0, "ISC_ERASE", 0xA5, 8);
  jtag.wait(0.01);
  EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8), enabled);
  EXPECT_EQ(test.board->memory(0), std::vector<std::uint8_t>(memoryBits / 8, 0xFF));
}

TEST(FpgaFamily, FlashInsideIsLoadedOnDemandAndHasAnErasureOfItsOwn) {
  TestBoard test(R"({"chain": [{"part": "marlin3an-1"}]})");
  Jtag jtag(*test.board, findParts(test.parts, {"marlin3an-1"}));
  const auto status = [&] { return jtag.access(0, "ISC_STATUS", 0, 8); };
  const BitVector bits =
      BitVector::fromBytes(Bitstream::make(idcodeOf(**test.parts.find("marlin3an-1")), memoryBits / 8, 0x99, {}));
  jtag.load(0, "CFG_LOAD");
  EXPECT_EQ(status(), error) << "an empty flash starts nothing";
  jtag.access(0, "ISC_ENABLE", 0xD0, 8);
  for (std::size_t page = 0; page < 512; ++page) {
    jtag.access(0, "ISC_ADDRESS_SHIFT", page, 16);
    jtag.load(0, "ISC_DATA_SHIFT");
    jtag.data(0, bits.slice(page * 2048, 2048));
    jtag.load(0, "ISC_PROGRAM");
    jtag.wait(0.001);
  }
  jtag.load(0, "ISC_DISABLE");
  jtag.load(0, "CFG_LOAD");
  EXPECT_EQ(status(), done);
  EXPECT_EQ(jtag.access(0, "USERCODE", 0, 32), 0x99U);
  jtag.access(0, "ISC_ENABLE", 0xD0, 8);
  jtag.access(0, "CFG_CLEAR", 0xA5, 8);
  EXPECT_EQ(status() & busy, busy);
  jtag.wait(0.001);
  EXPECT_EQ(status(), enabled);
  EXPECT_EQ(BitVector::fromBytes(test.board->memory(0)), bits) << "the flash is not erased with the configuration";
}

TEST(FpgaFamily, MonitorsAndSerialNumbersComeFromTheBoardFile) {
  TestBoard test(R"({"chain": [{"part": "marlin3-1", "dna": "0123456789ABCDEF", "registers": {"mfg_code": "1A2B3C4D"},
                                "monitors": {"temperature": 41.5, "vccint": 0.95}}, {"part": "marlin3-1"}]})");
  ASSERT_NE(test.board, nullptr) << test.failure;
  Jtag jtag(*test.board, findParts(test.parts, {"marlin3-1", "marlin3-1"}));
  EXPECT_EQ(jtag.access(0, "READ_DNA", 0, 64), 0x0123456789ABCDEFU);
  EXPECT_EQ(jtag.access(0, "READ_MFG_CODE", 0, 32), 0x1A2B3C4DU);
  const std::uint64_t monitor = jtag.access(0, "READ_MONITOR", 0, 48);
  EXPECT_NEAR(static_cast<double>(monitor & 0xFFFFU) * 0.01 - 273.15, 41.5, 0.01);
  EXPECT_NEAR(static_cast<double>(monitor >> 16 & 0xFFFFU) * 0.0001, 0.95, 0.0001);
  EXPECT_NE(jtag.access(1, "READ_DNA", 0, 64), 0U) << "each device has a number when none is given";
}
