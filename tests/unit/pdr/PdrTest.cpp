#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "interfaces/pdr/Pdr.h"
#include "tests/unit/support/Files.h"
#include "tests/unit/support/RecordedMessages.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::RecordedMessages;
using Texts = std::vector<std::string>;

class PdrTest : public testing::Test {
 protected:
  /// The result of reading a file of that content.
  bool read(const std::string& content) {
    testsupport::writeFile(path_, content);
    pdr_ = Pdr(path_.c_str());
    return pdr_.read();
  }

  Texts proms() const {
    Texts texts;
    for (int i = 0; i < pdr_.getNumberPromDevices(); ++i) texts.emplace_back(pdr_.getPromDevice(i));
    return texts;
  }
  Texts devices(int design) const {
    Texts texts;
    for (int i = 0; i < pdr_.getNumberDevices(design); ++i) texts.emplace_back(pdr_.getDevice(design, i));
    return texts;
  }

  testsupport::TemporaryDirectory directory_;
  RecordedMessages messages_;
  std::string path_ = directory_.file("board.pdr");
  Pdr pdr_{""};
};

TEST_F(PdrTest, ReadsAWholeFile) {
  EXPECT_TRUE(
      read("# a board\n"
           "MODE pffparallel\n"
           "FILE_FORMAT mcs\n"
           "SWAP_BIT off\n"
           "FILL_VALUE FF\n"
           "DIRECTION UP\n"
           "PROM 4M\n"
           "PROM zp18v01\n"
           "\n"
           "DESIGN 0\n"
           "DEVICE marlin3-1\n"
           "DEVICE marlin3-2\n"
           "DESIGN 10000\n"
           "DESIGN 20000\n"
           "DEVICE finch\n"));
  EXPECT_THAT(messages_.all(), IsEmpty());
  EXPECT_EQ(pdr_.getMode(), tESSELNS::PFF_PARALLEL);
  EXPECT_STREQ(pdr_.getFileFormat(), "mcs");
  EXPECT_STREQ(pdr_.getSwapBit(), "off");
  EXPECT_STREQ(pdr_.getFillValue(), "FF");
  EXPECT_STREQ(pdr_.getDirection(), "UP");
  EXPECT_THAT(proms(), ElementsAre("4M", "zp18v01"));
  ASSERT_EQ(pdr_.getNumberDesignRecords(), 3);
  EXPECT_STREQ(pdr_.getStartAddress(0), "0");
  EXPECT_STREQ(pdr_.getStartAddress(1), "10000");
  EXPECT_STREQ(pdr_.getStartAddress(2), "20000");
  EXPECT_THAT(devices(0), ElementsAre("marlin3-1", "marlin3-2"));
  EXPECT_THAT(devices(1), IsEmpty());
  EXPECT_THAT(devices(2), ElementsAre("finch"));
}

TEST_F(PdrTest, TheModeAloneIsEnough) {
  EXPECT_TRUE(read("MODE pffserial"));
  EXPECT_EQ(pdr_.getMode(), tESSELNS::PFF_SERIAL);
  EXPECT_STREQ(pdr_.getFileFormat(), "");
  EXPECT_STREQ(pdr_.getSwapBit(), "");
  EXPECT_STREQ(pdr_.getFillValue(), "");
  EXPECT_STREQ(pdr_.getDirection(), "");
  EXPECT_EQ(pdr_.getNumberPromDevices(), 0);
  EXPECT_EQ(pdr_.getNumberDesignRecords(), 0);
}

TEST_F(PdrTest, WhatIsNotThereIsNullOrNone) {
  EXPECT_TRUE(read("MODE pffserial\nPROM a\nDESIGN 0\nDEVICE d\n"));
  for (const int index : {1, 2, -1, 1000}) {
    EXPECT_EQ(pdr_.getPromDevice(index), nullptr) << index;
    EXPECT_EQ(pdr_.getStartAddress(index), nullptr) << index;
    EXPECT_EQ(pdr_.getNumberDevices(index), 0) << index;
    EXPECT_EQ(pdr_.getDevice(index, 0), nullptr) << index;
    EXPECT_EQ(pdr_.getDevice(0, index), nullptr) << index;
  }
}

struct ModeRow {
  const char* keyword;
  tESSELNS::SUBMODE_TYPE mode;
};

TEST_F(PdrTest, KnowsEveryLayoutInAnyLetterCase) {
  constexpr ModeRow rows[] = {{"pffserial", tESSELNS::PFF_SERIAL},
                              {"pffparallel", tESSELNS::PFF_PARALLEL},
                              {"pffversion", tESSELNS::PFF_VERSION},
                              {"pffspi", tESSELNS::PFF_SPI},
                              {"pffbpi", tESSELNS::PFF_BPI},
                              {"pffmbspi", tESSELNS::PFF_MULTIBOOT_SPI},
                              {"PFFMBBPI", tESSELNS::PFF_MULTIBOOT_BPI}};
  for (const ModeRow& row : rows) {
    EXPECT_TRUE(read(std::string("mode ") + row.keyword + "\n"));
    EXPECT_EQ(pdr_.getMode(), row.mode) << row.keyword;
  }
}

TEST_F(PdrTest, LinesMayBeWrittenLoosely) {
  EXPECT_TRUE(
      read("  # comment\r\n\t\r\n \tMoDe \t pffspi \t\r\nfile_format  i hex  \r\n#\r\n  prom\ta b\r\n"
           "Design x#y\nDEVICE  # no comment\n   "));
  EXPECT_EQ(pdr_.getMode(), tESSELNS::PFF_SPI);
  EXPECT_STREQ(pdr_.getFileFormat(), "i hex");
  EXPECT_THAT(proms(), ElementsAre("a b"));
  EXPECT_STREQ(pdr_.getStartAddress(0), "x#y");
  EXPECT_THAT(devices(0), ElementsAre("# no comment"));
}

TEST_F(PdrTest, AZeroByteInALineIsAReadError) {
  EXPECT_FALSE(read(std::string("MODE pffserial\nPROM \0\n", 22)));
  EXPECT_THAT(messages_.all(), ElementsAre(testsupport::error(path_ + ":2: a zero byte in the line\n")));
}

TEST_F(PdrTest, TheLastValueOfAKeywordCounts) {
  EXPECT_TRUE(read("MODE pffserial\nFILL_VALUE 00\nFILL_VALUE FF\nMODE pffbpi\n"));
  EXPECT_STREQ(pdr_.getFillValue(), "FF");
  EXPECT_EQ(pdr_.getMode(), tESSELNS::PFF_BPI);
}

TEST_F(PdrTest, LongLinesAndManyLinesAreRead) {
  std::string content = "MODE pffserial\n";
  for (int i = 0; i < 1000; ++i) content += "PROM " + std::string(2000, 'x') + "\n";
  EXPECT_TRUE(read(content));
  EXPECT_EQ(pdr_.getNumberPromDevices(), 1000);
  EXPECT_EQ(std::string(pdr_.getPromDevice(999)), std::string(2000, 'x'));
}

struct ErrorRow {
  const char* content;
  const char* error;  ///< behind the path
};
constexpr ErrorRow errorRows[] = {
    {"", ": no MODE line, expected one such as MODE pffserial\n"},
    {"# MODE pffserial\n\n", ": no MODE line, expected one such as MODE pffserial\n"},
    {"PROM a\n", ": no MODE line, expected one such as MODE pffserial\n"},
    {"MODE\n", ":1: MODE has no value\n"},
    {"\n\nmode  \t\r\n", ":3: mode has no value\n"},
    {"MODE pffserial\nPROM\n", ":2: PROM has no value\n"},
    {"MODE pffserial\nDESIGN\n", ":2: DESIGN has no value\n"},
    {"MODE pffserial\nDESIGN 0\nDEVICE\n", ":3: DEVICE has no value\n"},
    {"MODE pffserial\nFILE_FORMAT\n", ":2: FILE_FORMAT has no value\n"},
    {"MODE pffserial\nSwap_Bit\n", ":2: Swap_Bit has no value\n"},
    {"MODE pffserial\nFILL_VALUE\n", ":2: FILL_VALUE has no value\n"},
    {"MODE pffserial\nDIRECTION\n", ":2: DIRECTION has no value\n"},
    {"MODE pff\n", ":1: unknown MODE pff, expected a layout such as pffserial or pffparallel\n"},
    {"MODE mpmss\n", ":1: unknown MODE mpmss, expected a layout such as pffserial or pffparallel\n"},
    {"MODE pffserial x\n", ":1: unknown MODE pffserial x, expected a layout such as pffserial or pffparallel\n"},
    {"MODE pffserial\nDEVICE d\nDESIGN 0\n", ":2: DEVICE d stands before any DESIGN\n"},
    {"MODE pffserial\nCOLOUR red\n",
     ":2: unknown keyword COLOUR, expected MODE, FILE_FORMAT, SWAP_BIT, FILL_VALUE, DIRECTION, PROM, DESIGN or "
     "DEVICE\n"},
    {"colour\n",
     ":1: unknown keyword colour, expected MODE, FILE_FORMAT, SWAP_BIT, FILL_VALUE, DIRECTION, PROM, DESIGN or "
     "DEVICE\n"},
    {"// MODE pffserial\n",
     ":1: unknown keyword //, expected MODE, FILE_FORMAT, SWAP_BIT, FILL_VALUE, DIRECTION, PROM, DESIGN or DEVICE\n"},
};

TEST_F(PdrTest, AMistakeIsOneErrorWithItsPlace) {
  for (const ErrorRow& row : errorRows) {
    EXPECT_FALSE(read(row.content)) << row.content;
    EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error(path_ + row.error)));
  }
}

TEST_F(PdrTest, OnlyTheFirstMistakeIsTold) {
  EXPECT_FALSE(read("MODE\nMODE\nx\n"));
  EXPECT_THAT(messages_.all(), ElementsAre(testsupport::error(path_ + ":1: MODE has no value\n")));
}

TEST_F(PdrTest, AFileThatCantBeOpenedIsTold) {
  const std::string missing = directory_.file("missing.pdr");
  EXPECT_FALSE(Pdr(missing.c_str()).read());
  EXPECT_THAT(messages_.all(), ElementsAre(testsupport::error(missing + ": No such file or directory\n")));
}

TEST_F(PdrTest, AFileThatCantBeReadIsTold) {
  EXPECT_FALSE(Pdr(directory_.path().c_str()).read());
  ASSERT_EQ(messages_.all().size(), 1U);
  EXPECT_THAT(messages_.all().front().text, testing::StartsWith(directory_.path() + ": "));
  EXPECT_THAT(messages_.all().front().text, testing::Not(testing::HasSubstr("MODE")));
}

}  // namespace
