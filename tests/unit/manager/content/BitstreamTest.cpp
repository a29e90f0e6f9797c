#include <gtest/gtest.h>

#include <algorithm>
#include <string>

#include "manager/content/Bitstream.h"

namespace {

using Bytes = std::vector<std::uint8_t>;

TEST(Bitstream, SumsAsEverybodyDoes) {
  const std::string text = "123456789";
  EXPECT_EQ(Bitstream::crc32(Bytes(text.begin(), text.end())), 0xCBF43926U);
  EXPECT_EQ(Bitstream::crc32({}), 0U);
}

TEST(Bitstream, IsLaidOutLowestByteFirst) {
  const Bytes bytes = Bitstream::make(0x11223344, 24, 0xA0B0C0D0, Bytes{1, 2, 3, 4, 5, 6});
  const Bytes head = {'T', 'S', 'L', 'B', 0x44, 0x33, 0x22, 0x11, 24, 0, 0, 0, 0xD0, 0xC0, 0xB0, 0xA0, 1, 2, 3, 4};
  ASSERT_EQ(bytes.size(), 24U);
  EXPECT_EQ(Bytes(bytes.begin(), bytes.begin() + 20), head) << "the content is cut to the room there is";
  const std::uint32_t sum = Bitstream::crc32(head);
  EXPECT_EQ(bytes[20], sum & 0xFFU);
  EXPECT_EQ(bytes[23], sum >> 24U);
}

TEST(Bitstream, HasAHeader) {
  const Bytes bytes = Bitstream::make(0x11223344, 64, 0x55, Bytes{});
  const auto header = Bitstream::header(bytes);
  ASSERT_TRUE(header);
  EXPECT_EQ(header->idcode, 0x11223344U);
  EXPECT_EQ(header->length, 64U);
  EXPECT_EQ(header->usercode, 0x55U);
  EXPECT_FALSE(Bitstream::header(std::span(bytes).first(15)));
  EXPECT_FALSE(Bitstream::header(Bytes(64, 0xFF)));
}

TEST(Bitstream, TellsWhyAPartWouldNotStart) {
  const Bytes good = Bitstream::make(0x11223344, 64, 0, Bytes{1, 2});
  const char* why = "unset";
  EXPECT_TRUE(Bitstream::isValid(good, 0x11223344, 64, &why));
  EXPECT_TRUE(Bitstream::isValid(good, 0xF1223344, 64, nullptr)) << "the version is not compared";

  EXPECT_FALSE(Bitstream::isValid(good, 0x11223345, 64, &why));
  EXPECT_STREQ(why, "it is made for a part with another IDCODE");
  EXPECT_FALSE(Bitstream::isValid(good, 0x11223344, 128, &why));
  EXPECT_STREQ(why, "its length is not that of the part's memory");
  EXPECT_FALSE(Bitstream::isValid(std::span(good).first(63), 0x11223344, 64, &why));
  EXPECT_STREQ(why, "it is cut short");
  for (std::size_t place = 12; place < good.size(); ++place) {
    Bytes bad = good;
    bad[place] ^= 0x10U;
    EXPECT_FALSE(Bitstream::isValid(bad, 0x11223344, 64, &why)) << place;
    EXPECT_STREQ(why, "its CRC is wrong");
  }
  Bytes headless = good;
  headless[0] = 't';
  EXPECT_FALSE(Bitstream::isValid(headless, 0x11223344, 64, &why));
  EXPECT_STREQ(why, "it does not begin with a bitstream header");
}

TEST(Bitstream, AMemoryWithoutRoomForAHeaderNeverStarts) {
  const Bytes bytes = Bitstream::make(1, 4, 0, Bytes{});
  EXPECT_EQ(bytes.size(), Bitstream::headerBytes + Bitstream::crcBytes);
  EXPECT_FALSE(Bitstream::isValid(bytes, 1, 4, nullptr));
}

}  // namespace
