// The ISC memory, the security bits and the named registers of a PROM.

#include <gtest/gtest.h>

#include "tests/unit/manager/simulator/Jtag.h"

namespace {

constexpr std::size_t pageBits = 2048;
constexpr std::uint64_t busy = 1, error = 4, enabled = 8, readProtected = 16, writeProtected = 32;

class IscDevice : public testing::Test {
 protected:
  void SetUp() override { ASSERT_NE(test_.board, nullptr) << test_.failure; }

  std::uint64_t status() { return jtag_.access(0, "ISC_STATUS", 0, 8); }
  void enable() { jtag_.access(0, "ISC_ENABLE", 0xD0, 8); }
  void erase() {
    jtag_.access(0, "ISC_ERASE", 0xA5, 8);
    jtag_.wait(0.06);
  }
  void program(std::uint64_t page, const BitVector& bits) {
    jtag_.access(0, "ISC_ADDRESS_SHIFT", page, 16);
    jtag_.load(0, "ISC_DATA_SHIFT");
    jtag_.data(0, bits);
    jtag_.load(0, "ISC_PROGRAM");
    jtag_.wait(0.001);
  }
  BitVector read(std::uint64_t page) {
    jtag_.access(0, "ISC_ADDRESS_SHIFT", page, 16);
    jtag_.load(0, "ISC_READ");
    return jtag_.data(0, BitVector(pageBits));
  }

  TestBoard test_{R"({"chain": [{"part": "zp18v01"}, {"part": "mullet-32"}]})"};
  Jtag jtag_{*test_.board, findParts(test_.parts, {"zp18v01", "mullet-32"})};
};

}  // namespace

TEST_F(IscDevice, CapturesItsPatternAndCodes) {
  const BitVector captured = jtag_.load(0, "IDCODE");
  EXPECT_EQ(captured.number(0, 2), 0b01U);
  EXPECT_TRUE((*test_.parts.find("zp18v01"))->matchesIdcode(jtag_.data(0, BitVector(32))));
  EXPECT_EQ(jtag_.access(0, "USERCODE", 0, 32), 0xFFFFFFFFU);
  // Two bypass bits, its own and that of the device behind it.
  EXPECT_EQ(jtag_.access(0, "BYPASS", 0b1011, 4), 0b1100U);
  jtag_.loadOpcode(0, BitVector::fromNumber(0xEE, 8));
  EXPECT_EQ(jtag_.data(0, 0b1011, 4), 0b1100U) << "an unknown opcode selects BYPASS";
}

TEST_F(IscDevice, ProgramsReadsAndErasesPages) {
  const BitVector bits = randomBits(pageBits, 1);
  enable();
  program(5, bits);
  EXPECT_EQ(status(), enabled);
  EXPECT_EQ(read(5), bits);
  EXPECT_EQ(read(4), BitVector(pageBits, true));
  EXPECT_EQ(BitVector::fromBytes(test_.board->memory(0)).slice(5 * pageBits, pageBits), bits);
  erase();
  EXPECT_EQ(read(5), BitVector(pageBits, true));
}

TEST_F(IscDevice, ProgrammingOnlyClearsBits) {
  enable();
  BitVector first(pageBits, true);
  first.setNumber(0, 4, 0b0011);
  BitVector second(pageBits, true);
  second.setNumber(0, 4, 0b0101);
  program(0, first);
  program(0, second);
  EXPECT_EQ(read(0).number(0, 8), 0b11110001U);
}

TEST_F(IscDevice, NeedsToBeEnabledWithTheRightCode) {
  program(1, BitVector(pageBits));
  EXPECT_EQ(status(), error);
  jtag_.access(0, "ISC_ENABLE", 0xD1, 8);
  EXPECT_EQ(status(), error);
  program(1, BitVector(pageBits));
  enable();
  EXPECT_EQ(status(), enabled);
  EXPECT_EQ(read(1), BitVector(pageBits, true));
  jtag_.load(0, "ISC_DISABLE");
  EXPECT_EQ(status(), 0U);
}

TEST_F(IscDevice, ErasesOnlyWithTheRightCode) {
  enable();
  program(1, BitVector(pageBits));
  jtag_.access(0, "ISC_ERASE", 0xA4, 8);
  jtag_.wait(0.1);
  EXPECT_EQ(status(), enabled | error);
  EXPECT_EQ(read(1), BitVector(pageBits));
}

TEST_F(IscDevice, IsBusyForItsTimes) {
  enable();
  jtag_.access(0, "ISC_ERASE", 0xA5, 8);
  EXPECT_EQ(status(), enabled | busy);
  jtag_.wait(0.04);
  EXPECT_EQ(status(), enabled | busy);
  EXPECT_EQ(read(0), BitVector(pageBits)) << "a read while busy is refused";
  jtag_.wait(0.01);
  EXPECT_EQ(status(), enabled | error);
}

TEST_F(IscDevice, AnAddressBeyondTheEndIsAnError) {
  enable();
  program(512, BitVector(pageBits));
  EXPECT_EQ(status(), enabled | error);
}

TEST_F(IscDevice, SecurityBitsProtectUntilTheErasure) {
  enable();
  const BitVector bits = randomBits(pageBits, 2);
  program(3, bits);
  jtag_.access(0, "ISC_PROGRAM_SECURITY", 0b11, 8);
  EXPECT_EQ(status(), enabled | readProtected | writeProtected);
  EXPECT_EQ(jtag_.access(0, "READ_SECURITY", 0, 8), 0b11U);
  EXPECT_EQ(read(3), BitVector(pageBits));
  program(4, BitVector(pageBits));
  jtag_.access(0, "ISC_PROGRAM_USERCODE", 1, 32);
  EXPECT_EQ(status() & error, error);
  EXPECT_EQ(BitVector::fromBytes(test_.board->memory(0)).slice(3 * pageBits, 2 * pageBits).count(),
            bits.count() + pageBits);
  jtag_.access(0, "ISC_PROGRAM_SECURITY", 0, 8);
  EXPECT_EQ(status() & readProtected, readProtected) << "security bits are cleared by an erasure only";
  erase();
  EXPECT_EQ(status(), enabled);
  EXPECT_EQ(jtag_.access(0, "USERCODE", 0, 32), 0xFFFFFFFFU);
}

TEST_F(IscDevice, NamedRegistersKeepWhatIsWritten) {
  jtag_.access(0, "ISC_PROGRAM_USERCODE", 0xCAFE1234, 32);
  EXPECT_EQ(jtag_.access(0, "USERCODE", 0, 32), 0xCAFE1234U);
  jtag_.access(0, "ISC_PROGRAM_UES", 0x123456789ABCDEF0, 64);
  EXPECT_EQ(jtag_.access(0, "READ_UES", 0, 64), 0x123456789ABCDEF0U);
  const std::uint64_t code = jtag_.access(0, "READ_MFG_CODE", 0, 32);
  EXPECT_EQ(jtag_.access(0, "READ_MFG_CODE", 0, 32), code) << "reading must not write";
}

TEST_F(IscDevice, TestLogicResetEndsTheIscMode) {
  enable();
  jtag_.reset();
  EXPECT_EQ(status(), 0U);
}
