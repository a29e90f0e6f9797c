#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "interfaces/devicemanager/AttributeNames.h"
#include "manager/chain/Attributes.h"

namespace {

using testing::ElementsAre;
using testing::Optional;

std::vector<std::string> texts(const std::vector<StringBase>& words) {
  std::vector<std::string> result;
  for (const StringBase& word : words) result.emplace_back(word.view());
  return result;
}

TEST(Attributes, ADeviceBeginsUnknown) {
  const ChainDevice device;
  EXPECT_THAT(Attributes::get(device, DeviceNS::NAME), Optional(std::string("unknown")));
  EXPECT_THAT(Attributes::get(device, DeviceNS::STATE), Optional(std::string("unknown")));
  for (const auto& row : AttributeNames::device) {
    if (row.attribute == DeviceNS::NAME || row.attribute == DeviceNS::STATE) continue;
    EXPECT_EQ(Attributes::get(device, row.attribute), std::nullopt) << row.name;
  }
}

TEST(Attributes, TellTheAttachedFlashOfEachKind) {
  ChainDevice device;
  device.spiFlash.emplace().partName = "w25q64";
  device.bpiFlash.emplace().partName = "28f128";
  EXPECT_THAT(Attributes::get(device, DeviceNS::SPI_PART), Optional(std::string("w25q64")));
  EXPECT_THAT(Attributes::get(device, DeviceNS::BPI_PART), Optional(std::string("28f128")));
  EXPECT_EQ(Attributes::get(device, DeviceNS::SPI_FILE), std::nullopt) << "no file is assigned yet";
  device.spiFlash->file = "a.mcs";
  device.bpiFlash->file = "b.mcs";
  EXPECT_THAT(Attributes::get(device, DeviceNS::SPI_FILE), Optional(std::string("a.mcs")));
  EXPECT_THAT(Attributes::get(device, DeviceNS::BPI_FILE), Optional(std::string("b.mcs")));
}

TEST(Attributes, TheKeyIsKeptAndNeverGivenAway) {
  ChainDevice device;
  EXPECT_TRUE(Attributes::set(device, DeviceNS::KEY, "00112233").ok());
  EXPECT_EQ(Attributes::get(device, DeviceNS::KEY), std::nullopt);
  DeviceOptionsMgr options;
  device.stored.give(options, {});
  EXPECT_THAT(texts(options.getProgramOptions()), ElementsAre("-key", "00112233"));
  EXPECT_TRUE(options.getVerifyOptions().empty());
}

TEST(Attributes, StoredOptionsComeBackAsWordsInOrder) {
  ChainDevice device;
  for (const auto& [attribute, value] : std::map<DeviceNS::ATTRIBUTE, const char*>{{DeviceNS::REVISION, "2"},
                                                                                   {DeviceNS::UES, "LOT 7"},
                                                                                   {DeviceNS::USERCODE, "CAFE"},
                                                                                   {DeviceNS::VERIFY_AFTER, "true"},
                                                                                   {DeviceNS::ERASE_FIRST, "true"}})
    EXPECT_TRUE(Attributes::set(device, attribute, value).ok()) << attribute;
  DeviceOptionsMgr options;
  device.stored.give(options, {});
  EXPECT_THAT(texts(options.getProgramOptions()),
              ElementsAre("-e", "-v", "-usercode", "CAFE", "-ues", "LOT 7", "-revision", "2"));
  EXPECT_THAT(texts(options.getVerifyOptions()), ElementsAre("-revision", "2"));
  EXPECT_THAT(texts(options.getEraseOptions()), ElementsAre("-revision", "2"));
  EXPECT_FALSE(options.isOptionSet(U_OptionsMgr::onlyFpga));
}

TEST(Attributes, ADefaultCountsUntilTheDeviceHasItsOwnValue) {
  ChainDevice device;
  DeviceOptionsMgr options;
  device.stored.give(options, {{DeviceNS::ERASE_FIRST, "true"}, {DeviceNS::VERIFY_AFTER, "false"}});
  EXPECT_THAT(texts(options.getProgramOptions()), ElementsAre("-e"));
  EXPECT_TRUE(Attributes::set(device, DeviceNS::ERASE_FIRST, "false").ok());
  device.stored.give(options, {{DeviceNS::ERASE_FIRST, "true"}});
  EXPECT_TRUE(options.getProgramOptions().empty());
}

TEST(Attributes, OnlyFpgaIsOptionSeventeen) {
  ChainDevice device;
  DeviceOptionsMgr options;
  EXPECT_TRUE(Attributes::set(device, DeviceNS::ONLY_FPGA, "true").ok());
  device.stored.give(options, {});
  EXPECT_TRUE(options.isOptionSet(17));
  EXPECT_TRUE(Attributes::set(device, DeviceNS::ONLY_FPGA, "false").ok());
  device.stored.give(options, {});
  EXPECT_FALSE(options.isOptionSet(17));
}

struct RefusalRow {
  DeviceNS::ATTRIBUTE attribute;
  const char* value;
  const char* text;
};
constexpr RefusalRow refusals[] = {
    {DeviceNS::NAME, "", "The name of a device can't be empty."},
    {DeviceNS::IR_LENGTH, "1", "The length of an instruction register can't be \"1\", expected 2 to 256 bits."},
    {DeviceNS::IR_LENGTH, "257", "The length of an instruction register can't be \"257\", expected 2 to 256 bits."},
    {DeviceNS::IR_LENGTH, "6x", "The length of an instruction register can't be \"6x\", expected 2 to 256 bits."},
    {DeviceNS::ERASE_FIRST, "yes", "The attribute eraseFirst can't be \"yes\", expected true or false."},
    {DeviceNS::USERCODE, "123456789", "The attribute usercode can't be \"123456789\", expected up to 8 hex digits."},
    {DeviceNS::REVISION, "-1", "The attribute revision can't be \"-1\", expected a number from 0 to 999."},
    {DeviceNS::SPI_PART, "w25q64", "The attribute spiPart of a device can't be set."},
    {DeviceNS::BPI_WIDTH, "8", "The attribute bpiWidth of a device can't be set."},
    {DeviceNS::UNKNOWN, "1", "There is no such attribute of a device."},
};

TEST(Attributes, WhatADeviceDoesNotTakeIsRefusedWithTheReason) {
  for (const RefusalRow& row : refusals) {
    ChainDevice device;
    const Status status = Attributes::set(device, row.attribute, row.value);
    ASSERT_FALSE(status.ok()) << row.text;
    EXPECT_EQ(status.failure().text, row.text);
    EXPECT_EQ(device.irLength, 0U);
    EXPECT_EQ(device.name, "unknown");
  }
}

TEST(Attributes, TheIrLengthOfAKnownPartIsThePartsOwn) {
  ChainDevice device;
  auto part = std::make_shared<Part>();
  part->name = "minnow8";
  part->irLength = 8;
  device.part = part;
  EXPECT_EQ(Attributes::set(device, DeviceNS::IR_LENGTH, "6").failure().text,
            "The instruction register of minnow8 has 8 bits, not 6.");
  EXPECT_TRUE(Attributes::set(device, DeviceNS::IR_LENGTH, "8").ok());
  EXPECT_THAT(Attributes::get(device, DeviceNS::IR_LENGTH), Optional(std::string("8")));
}

TEST(Attributes, AnAttachedFlashHasItsOwnOptions) {
  AttachedFlash flash;
  EXPECT_TRUE(Attributes::set(flash, DeviceNS::VERIFY_AFTER, "true").ok());
  EXPECT_TRUE(Attributes::set(flash, DeviceNS::BPI_WIDTH, "8").ok());
  EXPECT_EQ(Attributes::set(flash, DeviceNS::BPI_WIDTH, "32").failure().text,
            "The attribute bpiWidth can't be \"32\", expected 8 or 16.");
  EXPECT_EQ(Attributes::set(flash, DeviceNS::USERCODE, "1").failure().text,
            "The attribute usercode of an attached flash can't be set.");
  DeviceOptionsMgr options;
  flash.stored.give(options, {});
  EXPECT_THAT(texts(options.getProgramOptions()), ElementsAre("-v"));
}

}  // namespace
