#include <gtest/gtest.h>

#include <algorithm>
#include <random>

#include "manager/scan/BitVector.h"

namespace {

/// The plain reference: a bit an element.
using Bits = std::vector<bool>;

BitVector vectorOf(const Bits& bits) {
  BitVector result;
  for (const bool bit : bits) result.append(bit);
  return result;
}

Bits bitsOf(const BitVector& vector) {
  Bits result(vector.size());
  for (std::size_t i = 0; i < result.size(); ++i) result[i] = vector.get(i);
  return result;
}

/// Whether the bits beyond the size are zero and there are no words too many.
bool isTidy(const BitVector& vector) {
  const std::size_t tail = vector.size() % 64;
  if (vector.words().size() != (vector.size() + 63) / 64) return false;
  return tail == 0 || vector.words().back() >> tail == 0;
}

class BitVectorRandom : public testing::Test {
 protected:
  std::size_t upTo(std::size_t most) { return std::uniform_int_distribution<std::size_t>(0, most)(random_); }

  /// Sizes near the borders of words come often.
  std::size_t size() {
    const std::size_t base = upTo(5) * 64;
    return upTo(1) == 0 ? upTo(300) : base + upTo(2) - std::min<std::size_t>(base, 1);
  }

  Bits bits(std::size_t count) {
    Bits result(count);
    for (std::size_t i = 0; i < count; ++i) result[i] = upTo(1) == 1;
    return result;
  }

  std::mt19937 random_{20};
};

constexpr int rounds = 3000;

TEST_F(BitVectorRandom, AppendsLikeTheReference) {
  for (int round = 0; round < rounds; ++round) {
    const Bits first = bits(size());
    const Bits second = bits(size());
    const std::size_t from = upTo(second.size());
    const std::size_t count = upTo(second.size() - from);
    BitVector vector = vectorOf(first);
    vector.append(vectorOf(second), from, count);
    Bits expected = first;
    for (std::size_t i = 0; i < count; ++i) expected.push_back(second[from + i]);
    ASSERT_EQ(bitsOf(vector), expected) << first.size() << " + " << from << ", " << count;
    ASSERT_TRUE(isTidy(vector));
  }
}

TEST_F(BitVectorRandom, AppendsItself) {
  for (int round = 0; round < rounds; ++round) {
    const Bits start = bits(size());
    const std::size_t from = upTo(start.size());
    const std::size_t count = upTo(start.size() - from);
    BitVector vector = vectorOf(start);
    vector.append(vector, from, count);
    Bits expected = start;
    for (std::size_t i = 0; i < count; ++i) expected.push_back(start[from + i]);
    ASSERT_EQ(bitsOf(vector), expected) << start.size() << " + " << from << ", " << count;
  }
}

TEST_F(BitVectorRandom, SlicesLikeTheReference) {
  for (int round = 0; round < rounds; ++round) {
    const Bits start = bits(size());
    const std::size_t from = upTo(start.size());
    const std::size_t count = upTo(start.size() - from);
    const BitVector slice = vectorOf(start).slice(from, count);
    const auto begin = start.begin() + static_cast<std::ptrdiff_t>(from);
    ASSERT_EQ(bitsOf(slice), Bits(begin, begin + static_cast<std::ptrdiff_t>(count))) << from << ", " << count;
    ASSERT_TRUE(isTidy(slice));
  }
}

TEST_F(BitVectorRandom, CopiesLikeTheReference) {
  for (int round = 0; round < rounds; ++round) {
    const Bits target = bits(size());
    const Bits source = bits(size());
    const std::size_t count = upTo(std::min(target.size(), source.size()));
    const std::size_t place = upTo(target.size() - count);
    const std::size_t first = upTo(source.size() - count);
    BitVector vector = vectorOf(target);
    vector.copy(place, vectorOf(source), first, count);
    Bits expected = target;
    for (std::size_t i = 0; i < count; ++i) expected[place + i] = source[first + i];
    ASSERT_EQ(bitsOf(vector), expected) << place << ", " << first << ", " << count;
    ASSERT_TRUE(isTidy(vector));
  }
}

TEST_F(BitVectorRandom, NumbersLikeTheReference) {
  for (int round = 0; round < rounds; ++round) {
    const Bits start = bits(size());
    const std::size_t count = upTo(std::min<std::size_t>(64, start.size()));
    const std::size_t first = upTo(start.size() - count);
    BitVector vector = vectorOf(start);
    BitVector::Word expected = 0;
    for (std::size_t i = 0; i < count; ++i) expected |= BitVector::Word{start[first + i]} << i;
    ASSERT_EQ(vector.number(first, count), expected) << first << ", " << count;

    const BitVector::Word number = std::uniform_int_distribution<BitVector::Word>()(random_);
    vector.setNumber(first, count, number);
    Bits changed = start;
    for (std::size_t i = 0; i < count; ++i) changed[first + i] = (number >> i & 1U) != 0;
    ASSERT_EQ(bitsOf(vector), changed) << first << ", " << count;

    vector.appendNumber(number, count);
    for (std::size_t i = 0; i < count; ++i) changed.push_back((number >> i & 1U) != 0);
    ASSERT_EQ(bitsOf(vector), changed) << first << ", " << count;
    ASSERT_TRUE(isTidy(vector));
  }
}

TEST_F(BitVectorRandom, GrowsAndShrinksLikeTheReference) {
  for (int round = 0; round < rounds; ++round) {
    Bits expected = bits(size());
    BitVector vector = vectorOf(expected);
    const std::size_t other = size();
    vector.resize(other);
    expected.resize(other, false);
    ASSERT_EQ(bitsOf(vector), expected);
    ASSERT_TRUE(isTidy(vector));
    const std::size_t count = size();
    const bool value = upTo(1) == 1;
    vector.appendFill(count, value);
    expected.resize(other + count, value);
    ASSERT_EQ(bitsOf(vector), expected) << other << " + " << count << " of " << value;
    ASSERT_TRUE(isTidy(vector));
    if (expected.empty()) continue;
    const std::size_t place = upTo(expected.size() - 1);
    vector.set(place, !expected[place]);
    expected[place] = !expected[place];
    ASSERT_EQ(bitsOf(vector), expected) << place;
  }
}

TEST_F(BitVectorRandom, FindsTheFirstDifference) {
  for (int round = 0; round < rounds; ++round) {
    const Bits left = bits(size());
    Bits right = left;
    const Bits mask = bits(left.size());
    for (std::size_t changes = upTo(3); changes > 0 && !left.empty(); --changes) {
      const std::size_t place = upTo(left.size() - 1);
      right[place] = !left[place];
    }
    std::size_t first = BitVector::npos;
    std::size_t firstMasked = BitVector::npos;
    for (std::size_t i = left.size(); i-- > 0;) {
      if (left[i] == right[i]) continue;
      first = i;
      if (mask[i]) firstMasked = i;
    }
    const BitVector maskVector = vectorOf(mask);
    ASSERT_EQ(firstDifference(vectorOf(left), vectorOf(right)), first);
    ASSERT_EQ(firstDifference(vectorOf(left), vectorOf(right), &maskVector), firstMasked);
  }
}

TEST_F(BitVectorRandom, TextsAndBytesComeBack) {
  for (int round = 0; round < 500; ++round) {
    const Bits start = bits(size());
    const BitVector vector = vectorOf(start);
    const std::string binary = vector.binary();
    ASSERT_EQ(binary.size(), start.size());
    for (std::size_t i = 0; i < start.size(); ++i) ASSERT_EQ(binary[start.size() - 1 - i], start[i] ? '1' : '0');
    ASSERT_EQ(BitVector::fromBinary(binary), vector);
    ASSERT_EQ(vector.hex().size(), (start.size() + 3) / 4);
    ASSERT_EQ(BitVector::fromHex(vector.hex(), start.size()), vector);
    BitVector padded = vector;
    padded.resize((start.size() + 7) / 8 * 8);
    ASSERT_EQ(BitVector::fromBytes(vector.bytes()), padded);
    ASSERT_EQ(vector.count(), static_cast<std::size_t>(std::count(start.begin(), start.end(), true)));
    const BitVector inverted = ~vector;
    ASSERT_EQ(inverted.count(), start.size() - vector.count());
    ASSERT_TRUE(isTidy(inverted));
    ASSERT_EQ(~inverted, vector);
  }
}

TEST(BitVector, FillsWhole) {
  BitVector vector(70);
  vector.fill(true);
  EXPECT_EQ(vector, BitVector(70, true));
  EXPECT_EQ(vector.count(), 70U);
  EXPECT_TRUE(isTidy(vector));
  vector.fill(false);
  EXPECT_EQ(vector, BitVector(70));
}

TEST(BitVector, BytesBeginWithTheLowestBit) {
  const std::vector<std::uint8_t> bytes = {0x01, 0x80};
  const BitVector vector = BitVector::fromBytes(bytes);
  EXPECT_EQ(vector.size(), 16U);
  EXPECT_TRUE(vector.get(0));
  EXPECT_TRUE(vector.get(15));
  EXPECT_EQ(vector.count(), 2U);
  EXPECT_EQ(vector.bytes(), bytes);
  EXPECT_EQ(BitVector::fromNumber(0x1FF, 9).bytes(), (std::vector<std::uint8_t>{0xFF, 0x01}));
}

TEST(BitVector, HexIsWrittenHighestFirst) {
  EXPECT_EQ(BitVector::fromHex("1aB", 12), BitVector::fromNumber(0x1AB, 12));
  EXPECT_EQ(BitVector::fromNumber(0x1AB, 9).hex(), "1AB");
  EXPECT_EQ(BitVector::fromNumber(0x1AB, 13).hex(), "01AB");
  EXPECT_EQ(BitVector().hex(), "");
}

TEST(BitVector, HexThatIsTooShortIsFilledWithZeros) {
  BitVector five(70);
  five.setNumber(0, 3, 5);
  EXPECT_EQ(BitVector::fromHex("5", 70), five);
  EXPECT_EQ(BitVector::fromHex("", 3), BitVector(3));
}

TEST(BitVector, HexWithBitsBeyondTheSizeIsRefused) {
  EXPECT_EQ(BitVector::fromHex("00001F", 5), BitVector(5, true));
  EXPECT_EQ(BitVector::fromHex("3F", 5), std::nullopt);
  EXPECT_EQ(BitVector::fromHex("100000000000000000", 64), std::nullopt);
  EXPECT_EQ(BitVector::fromHex("1", 0), std::nullopt);
  EXPECT_EQ(BitVector::fromHex("0", 0), BitVector());
}

TEST(BitVector, OtherCharactersAreRefused) {
  for (const char* text : {"g", "1 2", "0x1", "-1", "/", ":", "@", "G", "`"})
    EXPECT_EQ(BitVector::fromHex(text, 64), std::nullopt) << text;
  for (const char* text : {"2", "1 0", "x", "-"}) EXPECT_EQ(BitVector::fromBinary(text), std::nullopt) << text;
}

TEST(BitVector, VectorsOfOtherSizesDiffer) {
  EXPECT_FALSE(BitVector(3) == BitVector(4));
  EXPECT_TRUE(BitVector(3) == BitVector(3));
}

TEST(BitVector, ClearLeavesNothing) {
  BitVector vector(100, true);
  vector.clear();
  EXPECT_TRUE(vector.empty());
  vector.resize(100);
  EXPECT_EQ(vector, BitVector(100));
}

}  // namespace
