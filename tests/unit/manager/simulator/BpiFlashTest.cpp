#include <gtest/gtest.h>

#include "manager/parts/FlashParts.h"
#include "tests/unit/manager/simulator/Jtag.h"

namespace {

std::string nameOf(BpiFlashPart::Commands commands) {
  for (const BpiFlashPart& part : FlashParts::bpi())
    if (part.commands == commands && part.bufferSize > 0) return part.name;
  return "none";
}

/// Bus cycles on the flash behind the first of two devices.
class BpiFlashBoard : public testing::Test {
 protected:
  explicit BpiFlashBoard(BpiFlashPart::Commands commands)
      : part_(*FlashParts::findBpi(nameOf(commands))),
        test_(R"({"chain": [{"part": "marlin3-1", "bpi": {"part": ")" + std::string(part_.name) +
              R"(", "times": {"program": 0.0005}}}, {"part": "mullet-32"}]})"),
        jtag_(*test_.board, findParts(test_.parts, {"marlin3-1", "mullet-32"})) {
    jtag_.load(0, "USER2");
  }

  void write(std::uint32_t address, std::uint16_t data) {
    jtag_.data(0, address | std::uint64_t{data} << 32 | std::uint64_t{1} << 48, 64);
  }
  std::uint16_t read(std::uint32_t address) {
    jtag_.data(0, address | std::uint64_t{1} << 49, 64);
    const std::uint64_t bits = jtag_.data(0, 0, 64);
    EXPECT_NE(bits & std::uint64_t{1} << 50, 0U) << "ready";
    return static_cast<std::uint16_t>(bits >> 32);
  }
  BitVector stream(std::uint32_t address, std::size_t words) {
    jtag_.data(0, address | std::uint64_t{1} << 51, 64);
    return jtag_.data(0, BitVector(words * 16));
  }
  std::uint16_t word(std::uint32_t address) {
    const std::vector<std::uint8_t> bytes = test_.board->bpiMemory(0);
    return static_cast<std::uint16_t>(bytes[std::size_t{address} * 2] | bytes[std::size_t{address} * 2 + 1] << 8);
  }
  std::uint32_t sectorWords() const { return part_.sectorSize / 2; }

  const BpiFlashPart& part_;
  TestBoard test_;
  Jtag jtag_;
};

struct Amd : BpiFlashBoard {
  Amd() : BpiFlashBoard(BpiFlashPart::Commands::amd) {}
  void command(std::uint16_t data) {
    write(0x555, 0xAA);
    write(0x2AA, 0x55);
    write(0x555, data);
  }
};

struct Intel : BpiFlashBoard {
  Intel() : BpiFlashBoard(BpiFlashPart::Commands::intel) {}
};

}  // namespace

TEST_F(Amd, TellsWhatItIs) {
  command(0x90);
  EXPECT_EQ(read(0), part_.maker);
  EXPECT_EQ(read(1), part_.device);
  write(0, 0xF0);
  EXPECT_EQ(read(0), 0xFFFF);
  write(0x55, 0x98);
  EXPECT_EQ(read(0x10), 'Q');
  EXPECT_EQ(read(0x12), 'Y');
  EXPECT_EQ(read(0x13), 2);
  EXPECT_EQ(1U << read(0x27), part_.size);
}

TEST_F(Amd, ProgramsWordsAndTogglesMeanwhile) {
  command(0xA0);
  write(0x1234, 0x0FF0);
  const std::uint16_t first = read(0x1234);
  EXPECT_EQ((first ^ read(0x1234)) & 0x40, 0x40) << "bit 6 toggles";
  EXPECT_EQ(first & 0x80, 0x00) << "bit 7 is the inverse of the data's, which is 1";
  jtag_.wait(0.001);
  EXPECT_EQ(read(0x1234), 0x0FF0);
  command(0xA0);
  write(0x1234, 0xF0FF);
  jtag_.wait(0.001);
  EXPECT_EQ(word(0x1234), 0x00F0);
}

TEST_F(Amd, NeedsItsUnlockCycles) {
  write(0x555, 0xA0);
  write(0, 0);
  write(0x555, 0xAA);
  write(0x2AB, 0x55);
  write(0x555, 0xA0);
  write(0, 0);
  EXPECT_EQ(word(0), 0xFFFF);
}

TEST_F(Amd, ErasesOneSectorOrAll) {
  for (const std::uint32_t address : {0U, sectorWords() - 1, sectorWords()}) {
    command(0xA0);
    write(address, 0);
    jtag_.wait(0.001);
  }
  command(0x80);
  write(0x555, 0xAA);
  write(0x2AA, 0x55);
  write(7, 0x30);
  jtag_.wait(1);
  EXPECT_EQ(word(0), 0xFFFF);
  EXPECT_EQ(word(sectorWords() - 1), 0xFFFF);
  EXPECT_EQ(word(sectorWords()), 0);
  command(0x80);
  command(0x10);
  jtag_.wait(1);
  EXPECT_EQ(word(sectorWords()), 0xFFFF);
}

TEST_F(Amd, WritesItsBufferWithinOnePage) {
  const std::uint32_t sector = sectorWords();
  const auto fill = [&](std::uint16_t lastCommand) {
    write(0x555, 0xAA);
    write(0x2AA, 0x55);
    write(sector, 0x25);
    write(sector, 3);
    for (std::uint16_t i = 0; i < 4; ++i) write(sector + i, static_cast<std::uint16_t>(0x1000 + i));
    write(sector, lastCommand);
    jtag_.wait(0.01);
  };
  fill(0x28);
  EXPECT_EQ(word(sector), 0xFFFF) << "a wrong confirmation aborts";
  EXPECT_EQ(read(sector) & 0x02, 0x02);
  command(0xF0);
  fill(0x29);
  for (std::uint16_t i = 0; i < 4; ++i) EXPECT_EQ(word(sector + i), 0x1000 + i);
}

TEST_F(Amd, ABufferForAnotherSectorIsAborted) {
  write(0x555, 0xAA);
  write(0x2AA, 0x55);
  write(0, 0x25);
  write(0, 0);
  write(sectorWords(), 0x1234);
  write(0, 0x29);
  jtag_.wait(0.01);
  EXPECT_EQ(word(sectorWords()), 0xFFFF);
}

TEST_F(Amd, StreamsWordsFromAnAddressOn) {
  for (std::uint32_t i = 0; i < 3; ++i) {
    command(0xA0);
    write(100 + i, static_cast<std::uint16_t>(0xABC0 + i));
    jtag_.wait(0.001);
  }
  BitVector expected;
  for (std::uint32_t i = 0; i < 3; ++i) expected.appendNumber(0xABC0 + i, 16);
  expected.appendNumber(0xFFFF, 16);
  EXPECT_EQ(stream(100, 4), expected);
  EXPECT_EQ(read(101), 0xABC1) << "after a stream it is the 64-bit register again";
}

TEST_F(Intel, TellsWhatItIs) {
  write(0, 0x90);
  EXPECT_EQ(read(0), part_.maker);
  EXPECT_EQ(read(1), part_.device);
  write(0, 0x98);
  EXPECT_EQ(read(0x11), 'R');
  EXPECT_EQ(read(0x13), 1);
  EXPECT_EQ(1U << read(0x2A), part_.bufferSize);
  write(0, 0xFF);
  EXPECT_EQ(read(0), 0xFFFF);
}

TEST_F(Intel, ProgramsAndErasesWithAStatusRegister) {
  write(0x40, 0x40);
  write(0x40, 0x1234);
  EXPECT_EQ(read(0) & 0x80, 0);
  jtag_.wait(0.001);
  EXPECT_EQ(read(0), 0x80);
  EXPECT_EQ(word(0x40), 0x1234);
  write(0x40, 0x20);
  write(0x40, 0xD0);
  jtag_.wait(1);
  EXPECT_EQ(read(0), 0x80);
  EXPECT_EQ(word(0x40), 0xFFFF);
  write(0, 0x20);
  write(0, 0x00);
  EXPECT_EQ(read(0), 0xB0) << "a sequence that is wrong";
  write(0, 0x50);
  EXPECT_EQ(read(0), 0x80);
}

TEST_F(Intel, WhileBusyItTakesNoCommands) {
  write(0, 0x40);
  write(0, 0x1234);
  write(1, 0x40);
  write(1, 0x5678);
  jtag_.wait(0.01);
  EXPECT_EQ(word(0), 0x1234);
  EXPECT_EQ(word(1), 0xFFFF);
}

TEST_F(Intel, ALockedSectorRefuses) {
  write(0, 0x60);
  write(0, 0x01);
  write(0, 0x40);
  write(0, 0x0000);
  EXPECT_EQ(read(0), 0x92);
  EXPECT_EQ(word(0), 0xFFFF);
  write(0, 0x60);
  write(0, 0xD0);
  write(0, 0x50);
  write(0, 0x40);
  write(0, 0x0000);
  jtag_.wait(0.001);
  EXPECT_EQ(read(0), 0x80);
  EXPECT_EQ(word(0), 0);
}

TEST_F(Intel, WritesItsBuffer) {
  write(0, 0xE8);
  EXPECT_EQ(read(0), 0x80);
  write(0, 1);
  write(0, 0x1111);
  write(1, 0x2222);
  write(0, 0xD0);
  jtag_.wait(0.01);
  EXPECT_EQ(read(0), 0x80);
  EXPECT_EQ(word(0), 0x1111);
  EXPECT_EQ(word(1), 0x2222);
}
