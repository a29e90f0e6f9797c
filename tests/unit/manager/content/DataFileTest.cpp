#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <fstream>
#include <random>

#include "manager/content/DataFile.h"
#include "tests/unit/support/Files.h"

namespace {

namespace fs = std::filesystem;
using DataFile::Format;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Pair;
using Bytes = std::vector<std::uint8_t>;

DataImage imageOf(std::uint64_t address, const Bytes& bytes) {
  DataImage image;
  EXPECT_TRUE(image.add(address, bytes));
  return image;
}

/// A directory of the test's own.
class DataFiles : public testing::Test {
 protected:
  std::string path(const std::string& name) const { return directory_.file(name); }
  std::size_t files() const { return testsupport::listDirectory(directory_.path()).size(); }

 private:
  testsupport::TemporaryDirectory directory_;
};

struct BadRow {
  Format format;
  const char* text;
  const char* failure;
};

TEST(DataFile, FormatsByPathAndName) {
  EXPECT_EQ(DataFile::formatOf("a/b.MCS"), Format::intelHex);
  EXPECT_EQ(DataFile::formatOf("b.exo"), Format::sRecord);
  EXPECT_EQ(DataFile::formatOf("b.Hex"), Format::hex);
  EXPECT_EQ(DataFile::formatOf("b.bit"), Format::binary);
  EXPECT_EQ(DataFile::formatOf("b.bin"), Format::binary);
  EXPECT_EQ(DataFile::formatOf("b.rbt"), Format::ascii);
  EXPECT_EQ(DataFile::formatOf("bmcs"), std::nullopt);
  EXPECT_EQ(DataFile::formatOf("b.mcs.old"), std::nullopt);
  EXPECT_EQ(DataFile::formatByName("MCS"), Format::intelHex);
  EXPECT_EQ(DataFile::formatByName("bin"), Format::binary);
  EXPECT_EQ(DataFile::formatByName("exo"), Format::sRecord);
  EXPECT_EQ(DataFile::formatByName("hex"), Format::hex);
  EXPECT_EQ(DataFile::formatByName("rbt"), std::nullopt) << "it is only read";
}

TEST(DataFile, WritesIntelHex) {
  Bytes bytes(20);
  for (std::size_t i = 0; i < bytes.size(); ++i) bytes[i] = static_cast<std::uint8_t>(i);
  DataImage image = imageOf(0xFFF8, bytes);
  EXPECT_TRUE(image.add(0x2000000, Bytes{0xAB}));
  EXPECT_EQ(DataFile::format(image, Format::intelHex),
            ":08FFF8000001020304050607E5\n"
            ":020000040001F9\n"
            ":0C00000008090A0B0C0D0E0F1011121352\n"
            ":020000040200F8\n"
            ":01000000AB54\n"
            ":00000001FF\n");
}

TEST(DataFile, WritesSRecordsWithTheAddressesThatAreNeeded) {
  EXPECT_EQ(DataFile::format(imageOf(0xFFFE, {1, 2}), Format::sRecord),
            "S009000074657373656C66\nS105FFFE0102FA\nS5030001FB\nS9030000FC\n");
  EXPECT_EQ(DataFile::format(imageOf(0x10000, {1}), Format::sRecord),
            "S009000074657373656C66\nS20501000001F8\nS5030001FB\nS804000000FB\n");
  EXPECT_EQ(DataFile::format(imageOf(0xFFFFFFFF, {1}), Format::sRecord),
            "S009000074657373656C66\nS306FFFFFFFF01FC\nS5030001FB\nS70500000000FA\n");
}

TEST(DataFile, WritesPlainHexAndBinaryFromZeroOn) {
  EXPECT_EQ(DataFile::format(imageOf(2, {0x12, 0xAB}), Format::hex), "FFFF12AB\n");
  EXPECT_EQ(DataFile::format(imageOf(0, Bytes(17, 0)), Format::hex), std::string(32, '0') + "\n00\n");
  EXPECT_EQ(DataFile::format(imageOf(1, {'a', 0}), Format::binary), std::string("\xFF"
                                                                                "a\0",
                                                                                3));
  EXPECT_EQ(DataFile::format({}, Format::hex), "");
}

TEST(DataFile, ReadsAnyOrderCaseAndLineEnd) {
  const auto image = DataFile::parse("a.mcs",
                                     "\r\n:020010000a0bd9  \r\n"
                                     ":02000004000af0\n"
                                     ":0100000001fe\r"
                                     ":0400000500000000f7\n"
                                     ":020000021000ec\n"
                                     ":02ffff000708f1\n"
                                     ":0400000300000000f9\n"
                                     ":020000040000fa\n"
                                     ":02000e00080ADE\n"
                                     ":00000001ff\n\n  \n",
                                     Format::intelHex);
  ASSERT_TRUE(image) << image.failure().text;
  EXPECT_THAT(image->runs(), ElementsAre(Pair(0x0E, Bytes{8, 10, 10, 11}), Pair(0x10000, Bytes{8}),
                                         Pair(0x1FFFF, Bytes{7}), Pair(0xA0000, Bytes{1})))
      << "the offset in a segment counts modulo 2^16";
}

TEST(DataFile, ReadsAllKindsOfSRecords) {
  const auto image = DataFile::parse("a.exo",
                                     "S0030000FC\r\n"
                                     "s30600000020aa2f\r\n"
                                     "S205010000BB3E\n"
                                     "S1040010CC1F\n"
                                     "S1040010CC1F\n"
                                     "S5030004F8\n"
                                     "S604000004F7\n"
                                     "S9030000FC\n",
                                     Format::sRecord);
  ASSERT_TRUE(image) << image.failure().text;
  EXPECT_THAT(image->runs(), ElementsAre(Pair(0x10, Bytes{0xCC}), Pair(0x20, Bytes{0xAA}), Pair(0x10000, Bytes{0xBB})));
}

TEST(DataFile, ACountStandsInForTheEndRecord) {
  EXPECT_TRUE(DataFile::parse("a.exo", "S1040000AA51\nS5030001FB\n", Format::sRecord));
  EXPECT_FALSE(DataFile::parse("a.exo", "S1040000AA51\nS5030001FB\nS1040001AA50\n", Format::sRecord));
}

TEST(DataFile, ReadsPlainDigits) {
  const auto hex = DataFile::parse("a.hex", "00fF\r\n 1a\n", Format::hex);
  ASSERT_TRUE(hex);
  EXPECT_THAT(hex->runs(), ElementsAre(Pair(0, Bytes{0x00, 0xFF, 0x1A})));
  const auto bits = DataFile::parse("a.rbt", "1000\n0000\n00000011\n", Format::ascii);
  ASSERT_TRUE(bits);
  EXPECT_THAT(bits->runs(), ElementsAre(Pair(0, Bytes{0x01, 0xC0}))) << "the lowest bit comes first";
}

TEST(DataFile, NamesThePlaceOfWhatIsWrong) {
  const BadRow rows[] = {
      {Format::intelHex, "x", "f:1:1: expected ':' before a record\n  x\n  ^"},
      {Format::intelHex, ":0100000001FE\n:01", "f:2:4: the record is shorter than its length says\n  :01\n     ^"},
      {Format::intelHex, ":01000000 1FE\n", "f:1:10: expected a hex digit\n  :01000000 1FE\n           ^"},
      {Format::intelHex, ":0100000001FE0\n",
       "f:1:14: the record is longer than its length says\n  :0100000001FE0\n               ^"},
      {Format::intelHex, ":0100000001FF\n", "f:1:12: wrong checksum, expected FE\n  :0100000001FF\n             ^"},
      {Format::intelHex, ":00000006FA\n",
       "f:1:8: unknown record type 06, expected 00 to 05\n  :00000006FA\n         ^"},
      {Format::intelHex, ":0300000400000000F9\n",
       "f:1:2: a record of type 04 has 2 bytes of data, not 3\n  :0300000400000000F9\n   ^"},
      {Format::intelHex, ":0100000001FE\n", "f:2:1: expected an end record (:00000001FF)"},
      {Format::intelHex, "", "f:1:1: expected an end record (:00000001FF)"},
      {Format::intelHex, ":00000001FF\r\n:0100000001FE\n",
       "f:2:1: expected nothing after the end record\n  :0100000001FE\n  ^"},
      {Format::intelHex, ":02000000AABB99\n:02000100BBCC76\n:01000200CD30\n:00000001FF\n",
       "f:3:10: address 0002 gets CD, an earlier record gave it CC\n  :01000200CD30\n           ^"},
      {Format::intelHex, ":01000200CD30\n:03000000AABBCCCC\n:00000001FF\n",
       "f:2:14: address 0002 gets CC, an earlier record gave it CD\n  :03000000AABBCCCC\n               ^"},
      {Format::intelHex, ":02000004FFFFFC\n:02FFFF000102FD\n:00000001FF\n",
       "f:2:10: the data go beyond address FFFFFFFF\n  :02FFFF000102FD\n           ^"},
      {Format::sRecord, "T0", "f:1:1: expected 'S' before a record\n  T0\n  ^"},
      {Format::sRecord, "S", "f:1:2: unknown record type, expected S0 to S3 or S5 to S9\n  S\n   ^"},
      {Format::sRecord, "S4030000FC", "f:1:2: unknown record type, expected S0 to S3 or S5 to S9\n  S4030000FC\n   ^"},
      {Format::sRecord, "S10200FD", "f:1:3: a record of type S1 has a length of at least 3\n  S10200FD\n    ^"},
      {Format::sRecord, "S1040000AA52", "f:1:11: wrong checksum, expected 51\n  S1040000AA52\n            ^"},
      {Format::sRecord, "S904000000FB",
       "f:1:3: a record of this type has a length of 3 and no data\n  S904000000FB\n    ^"},
      {Format::sRecord, "S1040000AA51\nS5030002FA\n",
       "f:2:5: the file has 1 data records before this one, not 2\n  S5030002FA\n      ^"},
      {Format::sRecord, "S1040000AA51\n", "f:2:1: expected an end record (S7, S8 or S9)"},
      {Format::sRecord, "S9030000FC\nS9030000FC\n", "f:2:1: expected nothing after the end record\n  S9030000FC\n  ^"},
      {Format::sRecord, "S307FFFFFFFF0102F9\n",
       "f:1:13: the data go beyond address FFFFFFFF\n  S307FFFFFFFF0102F9\n              ^"},
      {Format::hex, "00\n0g", "f:2:2: expected the second hex digit of a byte\n  0g\n   ^"},
      {Format::hex, "0", "f:1:2: expected the second hex digit of a byte\n  0\n   ^"},
      {Format::hex, "-", "f:1:1: expected a hex digit\n  -\n  ^"},
      {Format::ascii, "0102", "f:1:4: expected a digit 0 or 1\n  0102\n     ^"},
      {Format::ascii, "010101010",
       "f:1:10: the file ends inside a byte: it has 9 bits, no multiple of 8\n  010101010\n           ^"},
  };
  for (const BadRow& row : rows) {
    const auto image = DataFile::parse("f", row.text, row.format);
    ASSERT_FALSE(image) << row.text;
    EXPECT_EQ(image.failure().text, row.failure);
  }
}

TEST(DataFile, RunsThatAreFarApartTakeNoRoomBetweenThem) {
  const auto image =
      DataFile::parse("a.mcs", ":0100000001FE\n:02000004FFFFFC\n:01FFFF0002FF\n:00000001FF\n", Format::intelHex);
  ASSERT_TRUE(image) << image.failure().text;
  EXPECT_THAT(image->runs(), ElementsAre(Pair(0, Bytes{1}), Pair(0xFFFFFFFF, Bytes{2})));
}

TEST(DataFile, RecordsInDescendingOrderTakeLinearTime) {
  const auto start = std::chrono::steady_clock::now();
  const Bytes bytes(4U << 20U, 0x11);
  std::string text = DataFile::format(imageOf(0, bytes), Format::sRecord);
  std::string turned;
  std::size_t last = text.rfind("S6");
  for (std::size_t end = last; end > 0;) {
    const std::size_t begin = end < 2 ? 0 : text.rfind('\n', end - 2) + 1;
    turned.append(text, begin, end - begin);
    end = begin;
  }
  turned += text.substr(text.rfind("S8"));
  const auto image = DataFile::parse("a.exo", turned, Format::sRecord);
  ASSERT_TRUE(image) << image.failure().text;
  EXPECT_EQ(*image, imageOf(0, bytes));
  EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(10));
}

TEST_F(DataFiles, WhatIsWrittenIsReadAgain) {
  std::mt19937 random(3);
  for (const char* name : {"a.bin", "a.mcs", "a.exo", "a.hex"}) {
    Bytes bytes(70000);
    for (auto& byte : bytes) byte = static_cast<std::uint8_t>(random());
    DataImage image = imageOf(0, bytes);
    const Format format = *DataFile::formatOf(name);
    if (format == Format::intelHex || format == Format::sRecord) {
      EXPECT_TRUE(image.add(0x12345, Bytes{1, 2, 3}));
      EXPECT_TRUE(image.add(0xFFFFFFFE, Bytes{1, 2}));
    }
    ASSERT_TRUE(DataFile::write(path(name), image, format)) << name;
    const auto again = DataFile::read(path(name), format);
    ASSERT_TRUE(again) << again.failure().text;
    EXPECT_EQ(*again, image) << name;
  }
  EXPECT_EQ(files(), 4U) << "nothing is left beside them";
}

TEST_F(DataFiles, AFileIsReplacedWhole) {
  std::ofstream(path("a.hex")) << "old";
  fs::permissions(path("a.hex"), fs::perms::owner_read | fs::perms::owner_write);
  fs::create_symlink("a.hex", path("link.hex"));
  ASSERT_TRUE(DataFile::write(path("link.hex"), imageOf(0, {0xAB}), Format::hex));
  EXPECT_EQ(testsupport::readFile(path("a.hex")), "AB\n");
  EXPECT_TRUE(fs::is_symlink(path("link.hex")));
  EXPECT_EQ(fs::status(path("a.hex")).permissions(), fs::perms::owner_read | fs::perms::owner_write);
  EXPECT_EQ(files(), 2U);
}

TEST_F(DataFiles, WritingTellsWhatWentWrong) {
  const DataImage image = imageOf(0, Bytes(100000, 1));
  Status status = DataFile::write("/dev/full", image, Format::binary);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "/dev/full: can't write: No space left on device");
  EXPECT_TRUE(fs::is_character_file("/dev/full"));

  status = DataFile::write(path("none/a.bin"), image, Format::binary);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, path("none/a.bin") + ": can't create: No such file or directory");

  fs::create_directory(path("d.bin"));
  status = DataFile::write(path("d.bin"), image, Format::binary);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, path("d.bin") + ": can't write: Is a directory");

  status = DataFile::write(path("a.rbt"), image, Format::ascii);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, path("a.rbt") + ": can't write: the format rbt is only read");

  status = DataFile::write(path("a.bin"), imageOf(0xFFFFFFFF, {1}), Format::binary);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text,
            path("a.bin") + ": can't write: the data go up to byte 4294967296, expected at most 1073741824");
  status = DataFile::write(path("a.mcs"), imageOf(0x100000000, {1}), Format::intelHex);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text,
            path("a.mcs") + ": can't write: the data go up to byte 4294967297, expected at most 4294967296");
  EXPECT_EQ(files(), 1U) << "only the directory";
}

TEST_F(DataFiles, ReadingTellsWhatWentWrong) {
  auto image = DataFile::read(path("none.bin"), Format::binary);
  ASSERT_FALSE(image);
  EXPECT_EQ(image.failure().text, path("none.bin") + ": can't open: No such file or directory");
  image = DataFile::read(path(""), Format::binary);
  ASSERT_FALSE(image);
  EXPECT_EQ(image.failure().text, path("") + ": can't read: it is no regular file");
  image = DataFile::read("/dev/zero", Format::intelHex);
  ASSERT_FALSE(image);
  EXPECT_EQ(image.failure().text, "/dev/zero: can't read: it is no regular file");

  std::ofstream(path("huge.bin")).put('x');
  fs::resize_file(path("huge.bin"), (1U << 30U) + 1);
  image = DataFile::read(path("huge.bin"), Format::binary);
  ASSERT_FALSE(image);
  EXPECT_EQ(image.failure().text,
            path("huge.bin") + ": can't read: it has 1073741825 bytes, expected at most 1073741824");

  std::ofstream(path("a.hex")) << "0z";
  image = DataFile::read(path("a.hex"), Format::hex);
  ASSERT_FALSE(image);
  EXPECT_THAT(image.failure().text, HasSubstr("a.hex:1:2: expected the second hex digit of a byte"));
}

}  // namespace
