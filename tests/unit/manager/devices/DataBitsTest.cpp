#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "manager/devices/DataBits.h"
#include "manager/devices/FlowVariables.h"

namespace {

using testing::ElementsAre;
using testing::Pair;
using Bytes = std::vector<std::uint8_t>;

DataImage imageOf(std::initializer_list<std::pair<std::uint64_t, Bytes>> runs) {
  DataImage image;
  for (const auto& [address, bytes] : runs) EXPECT_TRUE(image.add(address, bytes));
  return image;
}

std::vector<std::pair<std::uint64_t, std::uint64_t>> windowsOf(const DataImage& image, std::uint64_t blockSize) {
  std::vector<std::pair<std::uint64_t, std::uint64_t>> result;
  for (ImageWindows windows(image, blockSize); windows.next();) result.emplace_back(windows.first(), windows.count());
  return result;
}

TEST(ImageWindows, AreTheUsedPartsOfAlignedBlocks) {
  const DataImage image = imageOf({{3, Bytes(2)}, {7, Bytes(1)}, {14, Bytes(20)}, {100, Bytes(16)}, {130, Bytes(1)}});
  EXPECT_THAT(windowsOf(image, 16),
              ElementsAre(Pair(3, 13), Pair(16, 16), Pair(32, 2), Pair(100, 12), Pair(112, 4), Pair(130, 1)));
  EXPECT_THAT(windowsOf(image, 1000), ElementsAre(Pair(3, 128)));
  EXPECT_TRUE(windowsOf({}, 16).empty());
}

TEST(DataBits, KnowWhichBitsTheImageHas) {
  const DataBits bits = DataBits::of(imageOf({{1, Bytes{0x12}}, {3, Bytes{0x34, 0x56}}}), 28);
  EXPECT_EQ(bits.data, BitVector::fromNumber(0x4FF12FF, 28));
  EXPECT_EQ(bits.covered, BitVector::fromNumber(0xF00FF00, 28));
  EXPECT_EQ(bits.difference(BitVector(28), BitVector(28, true)), BitVector::fromNumber(0x4001200, 28));
  EXPECT_EQ(bits.difference(BitVector(28), BitVector::fromNumber(0x200, 28)), BitVector::fromNumber(0x200, 28));
}

TEST(DataCompare, ComparesOnlyWhatTheImageHas) {
  const DataImage image = imageOf({{2, Bytes{1, 2}}, {6, Bytes{3}}});
  Comparison comparison;
  DataCompare::add(comparison, &image, 1, Bytes{9, 1, 7, 9});
  DataCompare::add(comparison, &image, 5, Bytes{9, 8, 9});
  EXPECT_EQ(comparison.compared, 3U);
  EXPECT_EQ(comparison.differences, 2U);
  EXPECT_EQ(comparison.firstAddress, 3U);
  EXPECT_EQ(comparison.expected, 2);
  EXPECT_EQ(comparison.found, 7);
  EXPECT_EQ(DataCompare::failure(comparison).text,
            "the verification failed: 2 of 3 bytes differ, the first at address 0x3: expected 0x02, found 0x07");
  EXPECT_EQ(DataCompare::failure(comparison).kind, Failure::Kind::mismatch);
}

TEST(FlowVariables, AreZeroAtFirstAndCutToTheirField) {
  FlowVariables variables;
  Isc::Field field;
  field.length = 16;
  field.value.kind = Isc::Value::Kind::variable;
  field.value.variable = "a";
  EXPECT_EQ(variables.evaluate(field), BitVector(16));
  field.value.kind = Isc::Value::Kind::set;
  field.value.bits = BitVector::fromNumber(0xABCD, 16);
  EXPECT_EQ(variables.evaluate(field), BitVector::fromNumber(0xABCD, 16));
  field.value.kind = Isc::Value::Kind::variable;
  field.length = 8;
  EXPECT_EQ(variables.evaluate(field), BitVector::fromNumber(0xCD, 8));
  field.length = 20;
  EXPECT_EQ(variables.evaluate(field), BitVector::fromNumber(0xABCD, 20)) << "being looked at changes nothing";
  field.length = 4;
  field.value.kind = Isc::Value::Kind::shiftLeft;
  field.value.amount = 70;
  EXPECT_EQ(variables.evaluate(field), BitVector(4));
}

}  // namespace
