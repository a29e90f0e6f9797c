#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <random>

#include "manager/content/DataImage.h"

namespace {

using testing::ElementsAre;
using testing::Pair;
using Bytes = std::vector<std::uint8_t>;

TEST(DataImage, KeepsRunsThatAreApart) {
  DataImage image;
  EXPECT_TRUE(image.empty());
  EXPECT_EQ(image.end(), 0U);
  EXPECT_TRUE(image.add(0x20, Bytes{3, 4}));
  EXPECT_TRUE(image.add(0x10, Bytes{1, 2}));
  EXPECT_THAT(image.runs(), ElementsAre(Pair(0x10, Bytes{1, 2}), Pair(0x20, Bytes{3, 4})));
  EXPECT_EQ(image.end(), 0x22U);
}

TEST(DataImage, JoinsRunsThatTouch) {
  DataImage image;
  EXPECT_TRUE(image.add(4, Bytes{4}));
  EXPECT_TRUE(image.add(6, Bytes{6}));
  EXPECT_TRUE(image.add(5, Bytes{5}));
  EXPECT_TRUE(image.add(3, Bytes{3}));
  EXPECT_THAT(image.runs(), ElementsAre(Pair(3, Bytes{3, 4, 5, 6})));
}

TEST(DataImage, JoinsARunThatCoversSeveral) {
  DataImage image;
  EXPECT_TRUE(image.add(1, Bytes{1}));
  EXPECT_TRUE(image.add(3, Bytes{3}));
  EXPECT_TRUE(image.add(5, Bytes{5, 6, 7}));
  EXPECT_TRUE(image.add(0, Bytes{0, 1, 2, 3, 4, 5}));
  EXPECT_THAT(image.runs(), ElementsAre(Pair(0, Bytes{0, 1, 2, 3, 4, 5, 6, 7})));
}

TEST(DataImage, TakesTheSameBytesTwice) {
  DataImage image;
  EXPECT_TRUE(image.add(0, Bytes{1, 2, 3}));
  EXPECT_TRUE(image.add(1, Bytes{2}));
  EXPECT_TRUE(image.add(2, Bytes{3, 4}));
  EXPECT_THAT(image.runs(), ElementsAre(Pair(0, Bytes{1, 2, 3, 4})));
}

TEST(DataImage, RefusesContradictionsAndStaysAsItWas) {
  DataImage image;
  EXPECT_TRUE(image.add(0, Bytes{1, 2, 3}));
  EXPECT_TRUE(image.add(8, Bytes{8}));
  const DataImage before = image;
  EXPECT_FALSE(image.add(2, Bytes{9}));
  EXPECT_FALSE(image.add(2, Bytes{3, 4, 5, 6, 7, 7, 9}));
  EXPECT_EQ(image, before);
}

TEST(DataImage, FlattensAWindow) {
  DataImage image;
  EXPECT_TRUE(image.add(0, Bytes{1, 2, 3}));
  EXPECT_TRUE(image.add(5, Bytes{5, 6}));
  EXPECT_EQ(image.flatten(0, 7), (Bytes{1, 2, 3, 0xFF, 0xFF, 5, 6}));
  EXPECT_EQ(image.flatten(2, 4, 0), (Bytes{3, 0, 0, 5}));
  EXPECT_EQ(image.flatten(6, 3), (Bytes{6, 0xFF, 0xFF}));
  EXPECT_EQ(image.flatten(100, 2), (Bytes{0xFF, 0xFF}));
}

TEST(DataImage, AgreesWithAPlainModel) {
  std::mt19937 random(7);
  for (int round = 0; round < 300; ++round) {
    DataImage image;
    std::map<std::uint64_t, std::uint8_t> model;
    for (int i = 0; i < 30; ++i) {
      const std::uint64_t address = random() % 60;
      Bytes bytes(random() % 9);
      for (auto& byte : bytes) byte = static_cast<std::uint8_t>(random() % 20 == 0);
      bool agrees = true;
      for (std::size_t k = 0; k < bytes.size(); ++k)
        agrees = agrees && (!model.contains(address + k) || model[address + k] == bytes[k]);
      ASSERT_EQ(image.add(address, bytes), agrees);
      if (agrees)
        for (std::size_t k = 0; k < bytes.size(); ++k) model[address + k] = bytes[k];
      std::map<std::uint64_t, std::uint8_t> seen;
      std::uint64_t last = 0;
      for (const auto& [start, run] : image.runs()) {
        ASSERT_TRUE(seen.empty() || start > last) << "runs do not touch";
        for (std::size_t k = 0; k < run.size(); ++k) seen[start + k] = run[k];
        last = start + run.size();
      }
      ASSERT_EQ(seen, model);
    }
  }
}

TEST(DataImage, AscendingRecordsTakeLinearTime) {
  const auto start = std::chrono::steady_clock::now();
  DataImage image;
  const Bytes record(16, 0x5A);
  for (std::uint64_t address = 0; address < 16U << 20U; address += record.size())
    ASSERT_TRUE(image.add(address, record));
  EXPECT_EQ(image.runs().size(), 1U);
  EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(5)) << "a million records of 16 bytes";
}

}  // namespace
