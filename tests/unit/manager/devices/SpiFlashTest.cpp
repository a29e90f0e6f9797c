#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>

#include "manager/devices/Memory.h"
#include "tests/unit/manager/devices/BoardBench.h"

namespace {

using testing::HasSubstr;
using Bytes = BoardBench::Bytes;

const Memory::ProgramOptions everything{.erase = true, .verify = true, .onlyFpga = false, .key = ""};

class SpiFlashes : public testing::Test {
 protected:
  /// An FPGA between other devices, with a flash.
  void board(const std::string& flash, const std::string& more = "", const std::string& faults = "") {
    bench.make(R"({"part": "zp18v01"}, {"part": "marlin3-1", "spi": {"part": ")" + flash + R"("})" + more +
                   R"(}, {"part": "mullet-32"})",
               faults);
  }
  std::unique_ptr<Memory> make(const SpiFlashPart* flash) {
    return bench.memory(makeSpiFlash(*bench.chain, 1, bench.part("marlin3-1"), flash));
  }
  std::unique_ptr<Memory> open(const SpiFlashPart* flash = nullptr) {
    auto memory = make(flash);
    EXPECT_EQ(failureText(memory->open()), "(no failure)");
    return memory;
  }

  BoardBench bench;
};

TEST_F(SpiFlashes, AreFoundOutErasedProgrammedVerifiedAndRead) {
  board("w25q80");
  const auto memory = open();
  EXPECT_EQ(memory->name(), "SPI flash w25q80");
  EXPECT_EQ(memory->size(), 1U << 20);
  const Bytes data = BoardBench::random(200001, 1);
  ASSERT_EQ(failureText(memory->program(BoardBench::image(data, 0x1233), everything, {})), "(no failure)");
  const Bytes flash = bench.board->spiMemory(1);
  EXPECT_EQ(Bytes(flash.begin() + 0x1233, flash.begin() + 0x1233 + 200001), data);
  EXPECT_EQ(std::count(flash.begin(), flash.begin() + 0x1233, 0xFF), 0x1233);

  const auto read = memory->read(0x1230, 150000, {});
  ASSERT_TRUE(read) << read.failure().text;
  EXPECT_EQ(*read, Bytes(flash.begin() + 0x1230, flash.begin() + 0x1230 + 150000));
  const auto blank = memory->blankCheck({});
  ASSERT_TRUE(blank);
  EXPECT_EQ(blank->compared, memory->size());
  EXPECT_EQ(blank->firstAddress, data[0] == 0xFF ? 0x1234U : 0x1233U);

  ASSERT_EQ(failureText(memory->erase(nullptr, {})), "(no failure)");
  EXPECT_EQ(bench.board->spiMemory(1), Bytes(memory->size(), 0xFF));
}

TEST_F(SpiFlashes, OnlySectorsWithDataAreErased) {
  board("w25q80");
  const auto memory = open();
  ASSERT_EQ(failureText(memory->program(BoardBench::image(Bytes(1U << 20, 0)), everything, {})), "(no failure)");
  DataImage data;
  EXPECT_TRUE(data.add(0x20010, Bytes{1, 2, 3}));
  EXPECT_TRUE(data.add(0x8FFFF, Bytes{4, 5}));
  ASSERT_EQ(failureText(memory->program(data, everything, {})), "(no failure)");
  const Bytes flash = bench.board->spiMemory(1);
  for (std::size_t sector = 0; sector < 16; ++sector) {
    const bool erased = sector == 2 || sector == 8 || sector == 9;
    EXPECT_EQ(flash[sector * 0x10000 + 0x100], erased ? 0xFF : 0x00) << sector;
  }
  EXPECT_EQ(flash[0x20011], 2);
  EXPECT_EQ(flash[0x90000], 5);
}

TEST_F(SpiFlashes, BeyondSixteenMiBAddressesHaveFourBytes) {
  board("w25q256");
  const auto memory = open(FlashParts::findSpi("w25q256"));
  const Bytes data = BoardBench::random(3000, 2);
  ASSERT_EQ(failureText(memory->program(BoardBench::image(data, 0x1000100), everything, {})), "(no failure)");
  const Bytes flash = bench.board->spiMemory(1);
  EXPECT_EQ(Bytes(flash.begin() + 0x1000100, flash.begin() + 0x1000100 + 3000), data);
  EXPECT_EQ(flash[0x100], 0xFF);
}

TEST_F(SpiFlashes, WithoutEraseImpossibleDataAreRefusedBeforeAnythingIsWritten) {
  board("w25q80");
  const auto memory = open();
  const Memory::ProgramOptions plain;
  ASSERT_EQ(failureText(memory->program(BoardBench::image(Bytes(300, 0xF0), 0x100), plain, {})), "(no failure)");
  const Bytes before = bench.board->spiMemory(1);
  Bytes data(1000, 0x10);
  data[0x123] = 0x31;
  EXPECT_EQ(failureText(memory->program(BoardBench::image(data), plain, {})),
            "address 0x123 holds 0xF0, which can't become 0x31 without an erase");
  EXPECT_EQ(bench.board->spiMemory(1), before);
  data[0x123] = 0x30;
  Memory::ProgramOptions verify;
  verify.verify = true;
  EXPECT_EQ(failureText(memory->program(BoardBench::image(data), verify, {})), "(no failure)");
}

TEST_F(SpiFlashes, AnotherFlashIsAFailure) {
  board("w25q80");
  EXPECT_EQ(failureText(make(FlashParts::findSpi("w25q64"))->open()),
            "the SPI flash has the JEDEC id EF4014, expected EF4017 of w25q64");
}

TEST_F(SpiFlashes, NoFlashIsAFailure) {
  bench.make(R"({"part": "marlin3-1"}, {"part": "marlin3-1"})");
  EXPECT_EQ(failureText(make(nullptr)->open()), "there is no SPI flash: its JEDEC id reads as FFFFFF");
  EXPECT_EQ(failureText(makeSpiFlash(*bench.chain, 1, bench.part("zp18v01"), nullptr)),
            "zp18v01 has no bridge to an SPI flash");
}

TEST_F(SpiFlashes, AFlashThatIsBusyForeverIsAFailure) {
  board("w25q80", R"(, "faults": {"busyForever": true})");
  const auto memory = open();
  EXPECT_THAT(failureText(memory->program(BoardBench::image(Bytes(10, 0)), {}, {})),
              HasSubstr("the SPI flash is still busy with programming a page after "));
  EXPECT_THAT(failureText(memory->erase(nullptr, {})), HasSubstr("the SPI flash"));
}

TEST_F(SpiFlashes, FlippedBitsNeverPassForSuccess) {
  board("w25q80", "", R"(, "faults": {"flipTdi": {"rate": 0.0001, "seed": 3}})");
  const auto memory = make(FlashParts::findSpi("w25q80"));
  EXPECT_NE(failureText(memory->program(BoardBench::image(BoardBench::random(100000, 4)), everything, {})),
            "(no failure)");
}

TEST_F(SpiFlashes, DataThatDoNotFitAreRefused) {
  board("w25q80");
  const auto memory = open();
  EXPECT_EQ(failureText(memory->check(BoardBench::image(Bytes(2, 0), 0xFFFFF))),
            "the data go up to address 0x100000, the memory ends at 0xFFFFF");
}

TEST_F(SpiFlashes, EightMiBTakeSeconds) {
  board("w25q64");
  const auto memory = open();
  const Bytes data = BoardBench::random(8U << 20, 5);
  const auto start = std::chrono::steady_clock::now();
  ASSERT_EQ(failureText(memory->program(BoardBench::image(data), everything, {})), "(no failure)");
  const std::chrono::duration<double> time = std::chrono::steady_clock::now() - start;
  EXPECT_EQ(bench.board->spiMemory(1), data);
  RecordProperty("seconds", std::to_string(time.count()));
  EXPECT_LT(time.count(), 30) << "a slow machine with a debug build";
}

}  // namespace
