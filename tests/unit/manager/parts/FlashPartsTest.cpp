#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <bit>
#include <cctype>
#include <set>
#include <tuple>

#include "manager/parts/FlashParts.h"
#include "manager/parts/Sfdp.h"

namespace {

/// What the lowest byte of a JEDEC id says: the exponent of the size; some makers go on at 20 with 64 MiB.
std::uint32_t sizeOfCapacity(std::uint32_t capacity) {
  if (capacity >= 0x20 && capacity < 0x30) return 1U << (26 + capacity - 0x20);
  return 1U << (capacity & 0x1FU);
}

bool isPlainName(const std::string& name) {
  for (const char character : name)
    if (std::isdigit(static_cast<unsigned char>(character)) == 0 &&
        std::islower(static_cast<unsigned char>(character)) == 0)
      return false;
  return !name.empty();
}

TEST(FlashPartsTest, spiRowsAreConsistent) {
  EXPECT_GE(FlashParts::spi().size(), 48U);
  std::set<std::string> names;
  std::set<std::uint32_t> ids;
  for (const SpiFlashPart& part : FlashParts::spi()) {
    SCOPED_TRACE(part.name);
    EXPECT_TRUE(isPlainName(part.name));
    EXPECT_TRUE(names.insert(part.name).second) << "the name stands twice";
    EXPECT_TRUE(ids.insert(part.jedecId).second) << "the id stands twice";
    EXPECT_LE(part.jedecId, 0xFFFFFFU);
    EXPECT_TRUE(std::has_single_bit(part.size));
    EXPECT_EQ(part.size, sizeOfCapacity(part.jedecId & 0xFFU)) << "the lowest byte of the id says another size";
    EXPECT_TRUE(std::has_single_bit(part.pageSize));
    EXPECT_TRUE(std::has_single_bit(part.sectorSize));
    EXPECT_LE(part.sectorSize, part.size);
    EXPECT_EQ(part.sectorSize % part.pageSize, 0U);
    EXPECT_EQ(part.fourByteAddress, part.size > 16U * 1024 * 1024);
    EXPECT_EQ(part.eraseCommand, part.sectorSize == 4096 ? 0x20 : 0xD8);
  }
}

TEST(FlashPartsTest, bpiRowsAreConsistent) {
  EXPECT_GE(FlashParts::bpi().size(), 12U);
  std::set<std::string> names;
  std::set<std::tuple<int, int, int, std::uint32_t>> ids;
  for (const BpiFlashPart& part : FlashParts::bpi()) {
    SCOPED_TRACE(part.name);
    EXPECT_TRUE(isPlainName(part.name));
    EXPECT_TRUE(names.insert(part.name).second) << "the name stands twice";
    EXPECT_TRUE(ids.insert({part.maker, part.device, part.extendedDevice, part.bufferSize}).second)
        << "the same codes and the same buffer stand twice";
    EXPECT_TRUE(std::has_single_bit(part.size));
    EXPECT_TRUE(std::has_single_bit(part.sectorSize));
    EXPECT_LT(part.sectorSize, part.size);
    EXPECT_TRUE(std::has_single_bit(part.bufferSize));
    EXPECT_LE(part.bufferSize, part.sectorSize);
    EXPECT_EQ(part.commands == BpiFlashPart::Commands::amd, part.extendedDevice != 0);
  }
}

TEST(FlashPartsTest, findsByNameInAnyLetterCaseAndById) {
  const SpiFlashPart* part = FlashParts::findSpi("W25Q64");
  ASSERT_NE(part, nullptr);
  EXPECT_EQ(part->jedecId, 0xEF4017U);
  EXPECT_EQ(part->size, 8U << 20U);
  EXPECT_EQ(FlashParts::findSpiById(0xEF4017), part);
  EXPECT_EQ(FlashParts::findSpi("w25q6"), nullptr);
  EXPECT_EQ(FlashParts::findSpiById(0xFFFFFF), nullptr);
  const BpiFlashPart* bpi = FlashParts::findBpi("28F128j3");
  ASSERT_NE(bpi, nullptr);
  EXPECT_EQ(bpi->device, 0x18);
  EXPECT_EQ(FlashParts::findBpi("w25q64"), nullptr);
}

TEST(SfdpTest, everyPartDescribesItself) {
  for (const SpiFlashPart& part : FlashParts::spi()) {
    SCOPED_TRACE(part.name);
    const std::vector<std::uint8_t> content = Sfdp::build(part);
    EXPECT_EQ(content.size(), Sfdp::bytes);
    const auto geometry = Sfdp::decode(content);
    ASSERT_TRUE(geometry.has_value());
    EXPECT_EQ(geometry->size, part.size);
    EXPECT_EQ(geometry->pageSize, part.pageSize);
    EXPECT_EQ(geometry->sectorSize, part.sectorSize);
    EXPECT_EQ(geometry->eraseCommand, part.eraseCommand);
    EXPECT_EQ(geometry->fourByteAddress, part.fourByteAddress);
  }
}

TEST(SfdpTest, aLargePartGivesTheExponentOfItsSize) {
  const SpiFlashPart part{"large", 0x123456, 512U << 20U, 512, 4096, 0x20, true};
  const auto geometry = Sfdp::decode(Sfdp::build(part));
  ASSERT_TRUE(geometry.has_value());
  EXPECT_EQ(geometry->size, 512U << 20U);
  EXPECT_EQ(geometry->pageSize, 512U);
  EXPECT_EQ(geometry->sectorSize, 4096U);
  EXPECT_EQ(geometry->eraseCommand, 0x20);
}

TEST(SfdpTest, layoutIsThatOfTheStandard) {
  const std::vector<std::uint8_t> content = Sfdp::build(*FlashParts::findSpi("w25q64"));
  EXPECT_EQ(std::string(content.begin(), content.begin() + 4), "SFDP");
  EXPECT_EQ(content[6], 0U) << "one table";
  EXPECT_EQ(content[8], 0x00) << "the basic one";
  EXPECT_EQ(content[15], 0xFF);
  EXPECT_EQ(content[11], 16U) << "words";
  const std::size_t table = content[12];
  EXPECT_EQ(content[table + 4], 0xFF) << "64 Mbit - 1";
  EXPECT_EQ(content[table + 7], 0x03);
  EXPECT_EQ(content[table + 28], 16U) << "64 KiB";
  EXPECT_EQ(content[table + 29], 0xD8);
}

/// A table of nine words, as the first parts have it, with the erase commands 4 KiB, 32 KiB, 64 KiB and 256 KiB.
std::vector<std::uint8_t> oldTable() {
  std::vector<std::uint8_t> content = {'S',  'F', 'D', 'P', 0,    1, 1, 0xFF,  // two tables
                                       0xC2, 0,   1,   4,   0x60, 0, 0, 0xFF,  // a maker's own
                                       0x00, 0,   1,   9,   0x18, 0, 0, 0xFF};
  content.resize(24 + 36, 0);
  const auto set = [&](std::size_t number, std::initializer_list<std::uint8_t> bytes) {
    std::copy(bytes.begin(), bytes.end(), content.begin() + static_cast<std::ptrdiff_t>(24 + 4 * (number - 1)));
  };
  set(1, {0xE5, 0x20, 0xF1, 0xFF});
  set(2, {0xFF, 0xFF, 0xFF, 0x01});
  set(8, {12, 0x20, 15, 0x52});
  set(9, {16, 0xD8, 18, 0xDC});
  return content;
}

TEST(SfdpTest, readsAnOldTableBehindAMakersOwn) {
  const auto geometry = Sfdp::decode(oldTable());
  ASSERT_TRUE(geometry.has_value());
  EXPECT_EQ(geometry->size, 4U << 20U);
  EXPECT_EQ(geometry->pageSize, 256U);
  EXPECT_EQ(geometry->sectorSize, 64U << 10U);
  EXPECT_EQ(geometry->eraseCommand, 0xD8);
  EXPECT_FALSE(geometry->fourByteAddress);
}

TEST(SfdpTest, choosesTheSameEraseCommandInAnyOrder) {
  struct Row {
    std::array<std::uint8_t, 8> kinds;  ///< exponent of the size, command; four times
    std::uint8_t command;
  };
  const Row rows[] = {{{18, 0xDC, 16, 0xD8, 15, 0x52, 12, 0x20}, 0xD8},
                      {{18, 0xDC, 0, 0xFF, 12, 0x20, 0, 0xFF}, 0x20},
                      {{20, 0xC1, 18, 0xDC, 19, 0xC2, 0, 0xFF}, 0xDC},
                      {{0, 0xFF, 0, 0xFF, 0, 0xFF, 15, 0x52}, 0x52}};
  for (const Row& row : rows) {
    std::vector<std::uint8_t> content = oldTable();
    std::copy(row.kinds.begin(), row.kinds.end(), content.begin() + 24 + 28);
    const auto geometry = Sfdp::decode(content);
    ASSERT_TRUE(geometry.has_value());
    EXPECT_EQ(geometry->eraseCommand, row.command);
  }
}

TEST(SfdpTest, refusesWhatMakesNoSense) {
  EXPECT_FALSE(Sfdp::decode({})) << "nothing";
  EXPECT_FALSE(Sfdp::decode(std::vector<std::uint8_t>(Sfdp::bytes, 0xFF))) << "no answer";
  EXPECT_FALSE(Sfdp::decode(std::vector<std::uint8_t>(Sfdp::bytes, 0x00))) << "no answer";
  const auto withByte = [](std::size_t place, std::uint8_t value) {
    std::vector<std::uint8_t> content = oldTable();
    content[place] = value;
    return Sfdp::decode(content).has_value();
  };
  EXPECT_TRUE(withByte(7, 0xFF));
  EXPECT_FALSE(withByte(0, 's')) << "no signature";
  EXPECT_FALSE(withByte(20, 0x19)) << "the table ends beyond the content";
  EXPECT_FALSE(withByte(19, 8)) << "a table that is too short";
  EXPECT_FALSE(withByte(24 + 7, 0xFF)) << "a size of 2 to the power of 33554431";
  EXPECT_FALSE(withByte(24 + 6, 0xFE)) << "a size that is no power of two";
  std::vector<std::uint8_t> content = oldTable();
  std::fill(content.begin() + 24 + 28, content.end(), std::uint8_t{0});
  EXPECT_FALSE(Sfdp::decode(content)) << "no erase command";
  for (std::size_t size = 0; size < 60; ++size) {
    content = oldTable();
    content.resize(size);
    EXPECT_FALSE(Sfdp::decode(content)) << size << " bytes";
  }
}

}  // namespace
