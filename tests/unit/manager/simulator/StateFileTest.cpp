#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>

#include "manager/content/Bitstream.h"
#include "manager/simulator/BoardLock.h"
#include "manager/simulator/StateFile.h"
#include "tests/unit/manager/simulator/Jtag.h"
#include "tests/unit/support/Files.h"
#include "tests/unit/support/ScopedVariable.h"

namespace {

const std::string board =
    R"({"chain": [{"part": "zp18v01"}, {"part": "marlin3-1", "spi": {"part": "w25q80"}}], "state": "board.state"})";

/// A board whose state stands in a directory of the test's own.
class StateFileTest : public testing::Test {
 protected:
  std::string path() const { return directory_.file("board.state"); }
  std::string readState() const { return testsupport::readFile(path()); }
  /// Makes a state file by programming something.
  std::string makeState() {
    std::filesystem::remove(path());
    TestBoard test(board, directory_.path());
    Jtag jtag(*test.board, findParts(test.parts, {"zp18v01", "marlin3-1"}));
    jtag.access(0, "ISC_PROGRAM_USERCODE", 0x12345678, 32);
    jtag.access(0, "ISC_PROGRAM_SECURITY", 1, 8);
    EXPECT_TRUE(test.board->save().ok());
    return readState();
  }
  std::string failureOf(const std::string& state) {
    testsupport::writeFile(path(), state);
    const TestBoard test(board, directory_.path());
    EXPECT_EQ(test.board, nullptr);
    EXPECT_EQ(readState(), state) << "a state that can't be read stays as it is";
    return test.failure;
  }

  testsupport::TemporaryDirectory directory_;
};

}  // namespace

TEST_F(StateFileTest, KeepsMemoriesBetweenRuns) {
  const BitVector page = randomBits(2048, 1);
  std::vector<std::uint8_t> bitstream;
  {
    TestBoard test(board, directory_.path());
    ASSERT_NE(test.board, nullptr) << test.failure;
    Jtag jtag(*test.board, findParts(test.parts, {"zp18v01", "marlin3-1"}));
    bitstream = Bitstream::make(static_cast<std::uint32_t>((*test.parts.find("marlin3-1"))->idcodes[0].value.number()),
                                std::size_t{1} << 17, 0xABCD, {});
    jtag.access(0, "ISC_ENABLE", 0xD0, 8);
    jtag.access(0, "ISC_ADDRESS_SHIFT", 9, 16);
    jtag.load(0, "ISC_DATA_SHIFT");
    jtag.data(0, page);
    jtag.load(0, "ISC_PROGRAM");
    jtag.access(0, "ISC_PROGRAM_SECURITY", 2, 8);
    jtag.access(1, "ISC_ENABLE", 0xD0, 8);
    jtag.load(1, "CFG_IN");
    jtag.data(1, BitVector::fromBytes(bitstream));
    jtag.load(1, "CFG_START");
    jtag.idle(24);
    jtag.load(1, "EFUSE_KEY");
    jtag.data(1, BitVector(256, true));
  }
  TestBoard test(board, directory_.path());
  ASSERT_NE(test.board, nullptr) << test.failure;
  Jtag jtag(*test.board, findParts(test.parts, {"zp18v01", "marlin3-1"}));
  EXPECT_EQ(BitVector::fromBytes(test.board->memory(0)).slice(std::size_t{9} * 2048, 2048), page);
  EXPECT_EQ(test.board->memory(1), bitstream);
  EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8), 32U) << "write-protected";
  EXPECT_EQ(jtag.access(1, "ISC_STATUS", 0, 8), 2U) << "running";
  EXPECT_EQ(jtag.access(1, "USERCODE", 0, 32), 0xABCDU);
  jtag.load(1, "READ_EFUSE_KEY");
  EXPECT_EQ(jtag.data(1, BitVector(256)), BitVector(256, true));
}

TEST_F(StateFileTest, ABoardThatIsOnlyLookedAtWritesNone) {
  { const TestBoard test(board, directory_.path()); }
  EXPECT_FALSE(testsupport::exists(path()));
}

TEST_F(StateFileTest, LeavesNothingBesideTheFile) {
  makeState();
  EXPECT_EQ(testsupport::listDirectory(directory_.path()), std::vector<std::string>{"board.state"});
}

TEST_F(StateFileTest, EveryTruncationIsAFailure) {
  const std::string whole = makeState();
  for (const std::size_t size : {std::size_t{0}, std::size_t{3}, std::size_t{8}, std::size_t{15}, std::size_t{19},
                                 whole.size() / 2, whole.size() - 1}) {
    const std::string failure = failureOf(whole.substr(0, size));
    EXPECT_TRUE(failure.starts_with(path() + ": ")) << failure;
  }
}

TEST_F(StateFileTest, EveryDamagedByteIsAFailure) {
  const std::string whole = makeState();
  for (const std::size_t place : {std::size_t{0}, std::size_t{8}, std::size_t{12}, std::size_t{17}, std::size_t{30},
                                  std::size_t{5000}, whole.size() - 1}) {
    std::string damaged = whole;
    damaged[place] = static_cast<char>(damaged[place] ^ 0x40);
    failureOf(damaged);
  }
}

TEST_F(StateFileTest, ForeignFilesAreNamedAsSuch) {
  EXPECT_EQ(failureOf("hello"), path() +
                                    ": not a state file of a simulated board; delete it to begin with the "
                                    "board's initial content");
  std::string whole = makeState();
  whole[8] = 9;
  EXPECT_NE(failureOf(whole).find("a state file of version 9, expected version 1"), std::string::npos);
  makeState();
  const TestBoard other(R"({"chain": [{"part": "zp18v02"}], "state": "board.state"})", directory_.path());
  EXPECT_EQ(other.board, nullptr);
  EXPECT_NE(other.failure.find("the state file is of another board: it has nothing for \"0 zp18v02 pages\""),
            std::string::npos)
      << other.failure;
}

TEST_F(StateFileTest, SectionsWithSizesBeyondTheFileAreRefused) {
  std::string text = "TSLSTATE";
  const auto put = [&text](std::uint64_t number, int bytes) {
    for (int i = 0; i < bytes; ++i) text += static_cast<char>(number >> 8 * i);
  };
  put(1, 4);
  put(0xFFFFFFFF, 4);
  put(1, 2);
  text += "x";
  put(~std::uint64_t{0}, 8);
  const std::vector<std::uint8_t> bytes(text.begin(), text.end());
  put(Bitstream::crc32(bytes), 4);
  EXPECT_NE(failureOf(text).find("section x reaches beyond its end"), std::string::npos);
}

TEST_F(StateFileTest, BytesBehindTheLastSectionAreRefused) {
  std::string text = makeState();
  text.resize(text.size() - 4);
  text += "more";
  const std::uint32_t sum = Bitstream::crc32(std::vector<std::uint8_t>(text.begin(), text.end()));
  for (int i = 0; i < 4; ++i) text += static_cast<char>(sum >> 8 * i & 0xFFU);
  EXPECT_NE(failureOf(text).find("bytes behind its last section"), std::string::npos);
}

TEST_F(StateFileTest, TheLockIsThatOfTheStateFileHoweverItIsNamed) {
  const testsupport::ScopedVariable runtime("XDG_RUNTIME_DIR", directory_.path().c_str());
  const TestBoard test(board, directory_.path() + "/.");
  EXPECT_EQ(test.board->lockName(), path());
  BoardLock first;
  EXPECT_TRUE(first.take(test.board->lockName()).ok());
  BoardLock second;
  const Status refused = second.take(test.board->lockName());
  ASSERT_FALSE(refused.ok());
  EXPECT_NE(refused.failure().text.find(path() + " is in use by process " + std::to_string(::getpid())),
            std::string::npos)
      << refused.failure().text;
  BoardLock none;
  EXPECT_TRUE(none.take("").ok());
  testsupport::writeFile(BoardLock::pathOf("stale"), "4194305");
  BoardLock stale;
  EXPECT_TRUE(stale.take("stale").ok()) << "a lock whose owner has ended is taken over";
}
