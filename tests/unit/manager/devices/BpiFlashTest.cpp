#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "manager/devices/Memory.h"
#include "tests/unit/manager/devices/BoardBench.h"

namespace {

using testing::HasSubstr;
using Bytes = BoardBench::Bytes;

const Memory::ProgramOptions everything{.erase = true, .verify = true, .onlyFpga = false, .key = ""};

/// The smallest flash of a command set.
const BpiFlashPart& smallest(BpiFlashPart::Commands commands) {
  const BpiFlashPart* found = nullptr;
  for (const BpiFlashPart& part : FlashParts::bpi())
    if (part.commands == commands && (found == nullptr || part.size < found->size)) found = &part;
  return *found;
}

class BpiFlashes : public testing::TestWithParam<BpiFlashPart::Commands> {
 protected:
  void board(const std::string& more = "") {
    bench.make(R"({"part": "zp18v01"}, {"part": "marlin3-1", "bpi": {"part": ")" + std::string(part.name) + R"("})" +
               more + R"(}, {"part": "mullet-32"})");
  }
  std::unique_ptr<Memory> make(const BpiFlashPart* flash, int width = 16) {
    return bench.memory(makeBpiFlash(*bench.chain, 1, bench.part("marlin3-1"), flash, width));
  }

  BoardBench bench;
  const BpiFlashPart& part = smallest(GetParam());
};

TEST_P(BpiFlashes, AreFoundOutErasedProgrammedVerifiedAndRead) {
  board();
  for (const BpiFlashPart* wanted : {&part, static_cast<const BpiFlashPart*>(nullptr)}) {
    const auto memory = make(wanted);
    ASSERT_EQ(failureText(memory->open()), "(no failure)");
    EXPECT_EQ(memory->size(), part.size);
    const Bytes data = BoardBench::random(20001, wanted == nullptr ? 1 : 2);
    const std::uint64_t address = part.sectorSize - 5001;
    ASSERT_EQ(failureText(memory->program(BoardBench::image(data, address), everything, {})), "(no failure)");
    const Bytes flash = bench.board->bpiMemory(1);
    const auto first = flash.begin() + static_cast<std::ptrdiff_t>(address);
    EXPECT_EQ(Bytes(first, first + 20001), data);
    EXPECT_EQ(*(first - 1), 0xFF);
    const auto read = memory->read(address - 1, 20003, {});
    ASSERT_TRUE(read) << read.failure().text;
    EXPECT_EQ(*read, Bytes(first - 1, first + 20002));
  }
}

TEST_P(BpiFlashes, AreErasedAsAWhole) {
  board();
  const auto memory = make(&part);
  ASSERT_EQ(failureText(memory->open()), "(no failure)");
  ASSERT_EQ(failureText(memory->program(BoardBench::image(Bytes(3, 0), part.size - 3), everything, {})),
            "(no failure)");
  auto blank = memory->blankCheck({});
  ASSERT_TRUE(blank);
  EXPECT_EQ(blank->differences, 3U);
  EXPECT_EQ(blank->firstAddress, part.size - 3U);
  ASSERT_EQ(failureText(memory->erase(nullptr, {})), "(no failure)");
  blank = memory->blankCheck({});
  ASSERT_TRUE(blank);
  EXPECT_TRUE(blank->equal());
}

TEST_P(BpiFlashes, WithoutEraseImpossibleDataAreRefused) {
  board();
  const auto memory = make(&part);
  ASSERT_EQ(failureText(memory->open()), "(no failure)");
  ASSERT_EQ(failureText(memory->program(BoardBench::image(Bytes(100, 0xF0), 0x31), {}, {})), "(no failure)");
  const Bytes before = bench.board->bpiMemory(1);
  EXPECT_EQ(failureText(memory->program(BoardBench::image(Bytes(200, 0xE1)), {}, {})),
            "address 0x31 holds 0xF0, which can't become 0xE1 without an erase");
  EXPECT_EQ(bench.board->bpiMemory(1), before);
  Memory::ProgramOptions verify;
  verify.verify = true;
  EXPECT_EQ(failureText(memory->program(BoardBench::image(Bytes(100, 0xE0), 0x31), verify, {})), "(no failure)");
}

TEST_P(BpiFlashes, AFlashThatIsBusyForeverIsAFailure) {
  board(R"(, "faults": {"busyForever": true})");
  const auto memory = make(&part);
  ASSERT_EQ(failureText(memory->open()), "(no failure)");
  EXPECT_THAT(failureText(memory->program(BoardBench::image(Bytes(10, 0)), everything, {})),
              HasSubstr("the BPI flash is still busy with the sector erase after "));
}

TEST_P(BpiFlashes, AnotherFlashIsAFailure) {
  board();
  for (const BpiFlashPart& other : FlashParts::bpi()) {
    if (other.maker == part.maker && other.device == part.device) continue;
    EXPECT_THAT(failureText(make(&other)->open()), HasSubstr("the BPI flash has the id ")) << other.name;
  }
}

TEST_P(BpiFlashes, NoFlashIsAFailure) {
  bench.make(R"({"part": "marlin3-1"}, {"part": "marlin3-1"})");
  EXPECT_EQ(failureText(make(nullptr)->open()),
            "there is no BPI flash that is known: its id reads as FFFF FFFF or FFFF FFFF");
  EXPECT_EQ(failureText(makeBpiFlash(*bench.chain, 1, bench.part("zp18v01"), nullptr, 16)),
            "zp18v01 has no bridge to a BPI flash");
  EXPECT_EQ(failureText(makeBpiFlash(*bench.chain, 1, bench.part("marlin3-1"), nullptr, 32)),
            "a BPI flash has 8 or 16 data lines, not 32");
}

INSTANTIATE_TEST_SUITE_P(CommandSets, BpiFlashes,
                         testing::Values(BpiFlashPart::Commands::amd, BpiFlashPart::Commands::intel),
                         [](const auto& set) { return set.param == BpiFlashPart::Commands::amd ? "Amd" : "Intel"; });

}  // namespace
