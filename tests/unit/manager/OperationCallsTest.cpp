#include <filesystem>
#include <string>
#include <vector>

#include "interfaces/utility/Callback.h"
#include "interfaces/utility/DeviceOptionsMgr.h"
#include "tests/unit/manager/ManagerTest.h"

namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::error;
using testsupport::status;

/// Operations on the simulated board that port null has: marlin3-4, zp20s08, mullet-32.
class OperationCallsTest : public ManagerTest {
 protected:
  void SetUp() override {
    manager().setMode(tESSELNS::BOUNDARY_SCAN, true);
    ASSERT_TRUE(manager().setCable("null", 0, 9600, true, nullptr, false));
  }

  bool perform(const std::vector<const char*>& words) {
    return manager().performOperation(static_cast<int>(words.size()), words.data());
  }
  std::vector<std::string> errors() {
    std::vector<std::string> texts;
    for (const testsupport::Message& message : messages_.take())
      if (message.type == MsgType::error) texts.push_back(message.text);
    return texts;
  }
  void identify() {
    ASSERT_TRUE(perform({"identify"}));
    ASSERT_TRUE(perform({"identifyMPM"}));
    messages_.take();
  }
};

TEST_F(OperationCallsTest, IdentifyDescribesTheChain) {
  identify();
  ASSERT_EQ(manager().getDeviceChainCount(), 3);
  EXPECT_STREQ(manager().getDeviceAttribute(0, DeviceNS::NAME), "marlin3-4");
  EXPECT_STREQ(manager().getDeviceAttribute(1, DeviceNS::NAME), "zp20s08");
  EXPECT_STREQ(manager().getDeviceAttribute(2, DeviceNS::NAME), "mullet-32");
  EXPECT_STREQ(manager().getDeviceAttribute(2, DeviceNS::IR_LENGTH), "8");
  EXPECT_STREQ(manager().getAttribute(2), "identifyMPM succeeded");
}

TEST_F(OperationCallsTest, IdentifyKeepsFilesOfDevicesThatAreWhereTheyWere) {
  identify();
  testsupport::writeFile("data.bin", "abc");
  ASSERT_TRUE(manager().assignFile(1, "data.bin"));
  identify();
  EXPECT_STREQ(manager().getDeviceAttribute(1, DeviceNS::CONFIG_FILE_NAME), "data.bin");
}

TEST_F(OperationCallsTest, WhatIsProgrammedCanBeVerifiedAndReadBack) {
  identify();
  EXPECT_TRUE(perform({"program", "-p", "1", "-e", "-v", "-data", "00112233445566778899AABBCCDDEEFF"}));
  EXPECT_TRUE(perform({"verify", "-p", "1", "-data", "00112233445566778899AABBCCDDEEFF"}));
  EXPECT_TRUE(perform({"readbacktofile", "-p", "1", "-size", "4", "-start", "1", "-file", "four.bin"}));
  EXPECT_EQ(testsupport::readFile("four.bin"), "\x11\x22\x33\x44");
  EXPECT_THAT(errors(), IsEmpty());
}

TEST_F(OperationCallsTest, VerifyNamesTheFirstDifference) {
  identify();
  ASSERT_TRUE(perform({"program", "-p", "1", "-e", "-data", "00112233"}));
  EXPECT_FALSE(perform({"verify", "-p", "1", "-data", "00012203"}));
  EXPECT_THAT(errors(), ElementsAre("'2': Verify of zp20s08 failed: 2 of 4 bytes differ, the first at address "
                                    "0x00000001: expected 0x01, found 0x11.\n"));
}

TEST_F(OperationCallsTest, AWrongPartStopsBeforeAnythingIsErased) {
  identify();
  ASSERT_TRUE(perform({"program", "-p", "1", "-e", "-data", "00112233"}));
  ASSERT_TRUE(manager().removeDevice(1));
  ASSERT_TRUE(manager().addDeviceByPart(1, "zp20s16"));
  messages_.take();
  EXPECT_FALSE(perform({"program", "-p", "1", "-e", "-data", "FFFFFFFF"}));
  EXPECT_THAT(errors(), ElementsAre("'2': IDCODE is 0x05208FFD, which is not that of zp20s16.\n"));
  identify();
  EXPECT_TRUE(perform({"verify", "-p", "1", "-data", "00112233"}));
}

TEST_F(OperationCallsTest, AChainOfAnotherLengthIsTold) {
  ASSERT_TRUE(manager().addDeviceByPart(0, "marlin3-4"));
  EXPECT_FALSE(perform({"readusercode", "-p", "0"}));
  EXPECT_THAT(errors(), ElementsAre("The chain has 3 devices, not the 1 that were described. Try identify.\n"));
}

TEST_F(OperationCallsTest, AllPositionsAreTriedAndTheWorstCounts) {
  identify();
  EXPECT_FALSE(perform({"readdna", "-p", "1", "0"}));
  const auto messages = messages_.take();
  EXPECT_THAT(messages, Contains(error("'2': zp20s08 can't do readdna: it has no DNA.\n")));
  EXPECT_THAT(messages, Contains(status("'1': Reading DNA...\n")));
}

TEST_F(OperationCallsTest, PositionsOutsideTheChainTouchNothing) {
  identify();
  EXPECT_FALSE(perform({"erase", "-p", "0", "3"}));
  EXPECT_FALSE(perform({"erase", "-p", "-1"}));
  EXPECT_FALSE(perform({"erase"}));
  EXPECT_THAT(errors(),
              ElementsAre("erase: There is no device 4 on the chain, which has 3.\n",
                          "erase: There is no device 0 on the chain, which has 3.\n", "erase needs a position.\n"));
}

TEST_F(OperationCallsTest, WithTargetTheLastPositionCounts) {
  identify();
  EXPECT_TRUE(perform({"readidcode", "-target", "-p", "0", "-p", "2"}));
  EXPECT_THAT(messages_.all(), Contains(status("'3': IDCODE is 0x06020FFD\n")));
}

TEST_F(OperationCallsTest, AnUnknownDeviceCanBeDefinedAndPassedBy) {
  testsupport::writeFile("board.json", R"({"chain": [{"part": "zp18v01"}, {"bsdl": "dart.bsd"}]})");
  testsupport::writeFile("dart.bsd", R"bsdl(entity dart is
  generic (PHYSICAL_PIN_MAP : string := "PK");
  port (TCK, TMS, TDI : in bit; TDO : out bit);
  use STD_1149_1_2001.all;
  attribute COMPONENT_CONFORMANCE of dart : entity is "STD_1149_1_2001";
  attribute PIN_MAP of dart : entity is PHYSICAL_PIN_MAP;
  constant PK : PIN_MAP_STRING := "TCK:1, TMS:2, TDI:3, TDO:4";
  attribute TAP_SCAN_IN of TDI : signal is true;
  attribute TAP_SCAN_MODE of TMS : signal is true;
  attribute TAP_SCAN_OUT of TDO : signal is true;
  attribute TAP_SCAN_CLOCK of TCK : signal is (10.0e6, BOTH);
  attribute INSTRUCTION_LENGTH of dart : entity is 5;
  attribute INSTRUCTION_OPCODE of dart : entity is "BYPASS (11111), EXTEST (00000), SAMPLE (00001), IDCODE (00010)";
  attribute INSTRUCTION_CAPTURE of dart : entity is "XXX01";
  attribute IDCODE_REGISTER of dart : entity is "XXXX0000110100010110011011111101";
  attribute BOUNDARY_LENGTH of dart : entity is 1;
  attribute BOUNDARY_REGISTER of dart : entity is "0 (BC_1, *, internal, X)";
end dart;
)bsdl");
  ASSERT_TRUE(manager().setCableOption("board", "board.json"));
  identify();
  ASSERT_EQ(manager().getDeviceChainCount(), 2);
  EXPECT_STREQ(manager().getDeviceAttribute(1, DeviceNS::NAME), "unknown");
  EXPECT_STREQ(manager().getDeviceAttribute(1, DeviceNS::IR_LENGTH), "5");
  EXPECT_TRUE(perform({"program", "-p", "0", "-e", "-v", "-data", "42"}));
  EXPECT_TRUE(perform({"bypass", "-p", "1"}));
  EXPECT_FALSE(perform({"program", "-p", "1", "-data", "42"}));
  EXPECT_THAT(errors(), ElementsAre("'2': program needs a device whose part is known, this one is unknown.\n"));
  // The user brings the part along.
  std::filesystem::create_directory("parts");
  testsupport::writeFile("parts/dart.bsd", testsupport::readFile("dart.bsd"));
  ASSERT_TRUE(manager().setPreference(TesselPreference::partsDirectory, "parts"));
  identify();
  EXPECT_STREQ(manager().getDeviceAttribute(1, DeviceNS::NAME), "dart");
}

TEST_F(OperationCallsTest, FlashIsAttachedToWhatReachesIt) {
  identify();
  EXPECT_FALSE(manager().attachDeviceByPart(0, tESSELNS::SPI_FLASH, "nosuch"));
  EXPECT_FALSE(manager().attachDeviceByPart(1, tESSELNS::SPI_FLASH, "w25q64"));
  EXPECT_FALSE(perform({"erase", "-p", "0", "-spionly"}));
  EXPECT_THAT(errors(), ElementsAre("There is no SPI flash part nosuch.\n", "'2': zp20s08 reaches no SPI flash.\n",
                                    "'1': No SPI flash is attached to marlin3-4. Use attachFlash.\n"));
  EXPECT_TRUE(manager().attachDeviceByPart(0, tESSELNS::SPI_FLASH, "w25q64"));
  EXPECT_STREQ(manager().getDeviceAttribute(0, DeviceNS::SPI_PART), "w25q64");
  EXPECT_TRUE(perform({"program", "-p", "0", "-spionly", "-e", "-v", "-data", "0123456789"}));
  EXPECT_TRUE(manager().deleteAttachedDevice(0));
  EXPECT_EQ(manager().getDeviceAttribute(0, DeviceNS::SPI_PART), nullptr);
}

TEST_F(OperationCallsTest, AnotherFlashThanDescribedIsRefused) {
  identify();
  ASSERT_TRUE(manager().attachDeviceByPart(0, tESSELNS::SPI_FLASH, "w25q128"));
  EXPECT_FALSE(perform({"erase", "-p", "0", "-spionly"}));
  EXPECT_EQ(errors().size(), 1U);
}

TEST_F(OperationCallsTest, TheModeOfSpiFlashReachesItBehindTheBridge) {
  manager().setMode(tESSELNS::SPI, true);
  EXPECT_FALSE(manager().addDeviceByPart(0, "marlin3-4"));
  ASSERT_TRUE(manager().addDeviceByPart(0, "w25q64"));
  messages_.take();
  EXPECT_TRUE(perform({"program", "-p", "0", "-e", "-v", "-data", "CAFE"}));
  EXPECT_TRUE(perform({"verify", "-p", "0", "-data", "CAFE"}));
  EXPECT_FALSE(perform({"readidcode", "-p", "0"}));
  EXPECT_FALSE(perform({"identify"}));
  EXPECT_THAT(errors(), ElementsAre("'1': SPI flash can't do readidcode.\n",
                                    "identify finds TAPs; in this mode name the SPI flash with addDevice -part.\n"));
  EXPECT_EQ(manager().getDeviceChainCount(), 1);
}

TEST_F(OperationCallsTest, ProgressIsAPercentageThatGrows) {
  static std::vector<int> seen;
  seen.clear();
  manager().setCallbackFunction([](Callback& event) {
    seen.push_back(event.getProgressStatus() == Callback::update ? event.getCurrentCount() * 100 / event.getTotalCount()
                                                                 : -1 - event.getProgressStatus());
    return false;
  });
  identify();
  seen.clear();
  EXPECT_TRUE(perform({"program", "-p", "1", "-e", "-v", "-data", "42"}));
  manager().setCallbackFunction(nullptr);
  ASSERT_GT(seen.size(), 10U);
  EXPECT_EQ(seen.front(), -1);
  EXPECT_EQ(seen.back(), -2);
  const std::vector<int> updates(seen.begin() + 1, seen.end() - 1);
  EXPECT_EQ(updates.front(), 0);
  EXPECT_EQ(updates.back(), 100);
}

TEST_F(OperationCallsTest, TheEFuseKeyIsUsedAndShownNowhere) {
  identify();
  const std::string key = "00112233445566778899AABBCCDDEEFF";
  EXPECT_TRUE(manager().setDeviceAttribute(0, DeviceNS::KEY, key.c_str(), true));
  EXPECT_TRUE(perform({"programEFuse", "-p", "0"}));
  EXPECT_TRUE(perform({"readEFuse", "-p", "0"}));
  const auto messages = messages_.take();
  EXPECT_THAT(messages, Contains(status("'1': Programmed eFuse key\n")));
  // Reading fuses is the part's own affair: it shows them until that is forbidden by a control bit.
  EXPECT_TRUE(perform({"programEFuse", "-p", "0", "-control", "01"}));
  messages_.take();
  EXPECT_TRUE(perform({"readEFuse", "-p", "0"}));
  for (const testsupport::Message& message : messages_.take())
    EXPECT_EQ(message.text.find("AABBCCDD"), std::string::npos) << message.text;
  EXPECT_EQ(testsupport::readFile("_tesselbatch.cmd").find(key), std::string::npos);
  EXPECT_EQ(manager().getDeviceAttribute(0, DeviceNS::KEY), nullptr);
}

TEST_F(OperationCallsTest, AKeyThatCannotBeBlownIsRefused) {
  identify();
  EXPECT_TRUE(perform({"programEFuse", "-p", "0", "-key", "0F"}));
  EXPECT_FALSE(perform({"programEFuse", "-p", "0", "-key", "F0"}));
  EXPECT_TRUE(perform({"programEFuse", "-p", "0", "-control", "02"}));
  EXPECT_FALSE(perform({"programEFuse", "-p", "0", "-key", "0F"}));
  EXPECT_THAT(errors(), ElementsAre("'1': Another eFuse key has been blown into marlin3-4 already.\n",
                                    "'1': The eFuse key of marlin3-4 can't be blown any more.\n"));
}

TEST_F(OperationCallsTest, FusesAddUp) {
  identify();
  EXPECT_TRUE(perform({"setEFuseControlReg", "-p", "0", "-data", "100"}));
  EXPECT_TRUE(perform({"setEFuseControlReg", "-p", "0", "-data", "200"}));
  EXPECT_THAT(messages_.all(), Contains(status("'1': Programmed eFuse control register 0x00000300\n")));
}

TEST_F(OperationCallsTest, WorkOnOneRevisionLeavesTheOthers) {
  identify();
  testsupport::writeFile("one.bin", "\x11\x22");
  EXPECT_TRUE(perform({"program", "-p", "1", "-e", "-v", "-data", "1122"}));
  EXPECT_TRUE(perform({"program", "-p", "1", "-revision", "1", "-e", "-v", "-data", "3344"}));
  EXPECT_TRUE(perform({"verify", "-p", "1", "-file", "one.bin"}));
  EXPECT_FALSE(perform({"blankCheck", "-p", "1", "-revision", "1"}));
  EXPECT_TRUE(perform({"blankCheck", "-p", "1", "-revision", "2"}));
  EXPECT_TRUE(perform({"erase", "-p", "1", "-revision", "1"}));
  EXPECT_TRUE(perform({"blankCheck", "-p", "1", "-revision", "1"}));
  EXPECT_TRUE(perform({"verify", "-p", "1", "-file", "one.bin"}));
  EXPECT_FALSE(perform({"erase", "-p", "1", "-revision", "4"}));
  EXPECT_EQ(errors().size(), 2U);
}

TEST_F(OperationCallsTest, AnAttachedTargetIsTheFlashAndNeverTheDevice) {
  identify();
  manager().setTargetDevice(tESSELNS::BOUNDARY_SCAN, 0, true);
  EXPECT_FALSE(perform({"erase", "-target", "-p", "0"}));
  EXPECT_THAT(errors(), ElementsAre("'1': No BPI flash is attached to marlin3-4. Use attachFlash.\n"));
  ASSERT_TRUE(manager().attachDeviceByPart(0, tESSELNS::SPI_FLASH, "w25q64"));
  EXPECT_TRUE(perform({"program", "-target", "-e", "-data", "42", "-p", "0"}));
  EXPECT_THAT(messages_.all(), Contains(status("'1': Programming SPI flash w25q64 with the data of -data...\n")));
}

TEST_F(OperationCallsTest, ByHandTheTapIsClockedWithinLimits) {
  EXPECT_TRUE(perform({"bsdebug", "-reset", "-tms", "0", "-tck", "8", "-loop", "2"}));
  EXPECT_FALSE(perform({"bsdebug"}));
  EXPECT_FALSE(perform({"bsdebug", "-tms", "0", "-tck", "-5"}));
  EXPECT_FALSE(perform({"bsdebug", "-tms", "0", "-tck", "1000000", "-loop", "1000000"}));
  EXPECT_FALSE(perform({"bsdebug", "-tms", "2"}));
  EXPECT_EQ(errors().size(), 4U);
}

TEST_F(OperationCallsTest, OneFileIsReadFromOneDevice) {
  identify();
  EXPECT_FALSE(perform({"readbacktofile", "-p", "1", "2", "-file", "both.bin"}));
  EXPECT_THAT(errors(),
              testing::Each(testing::HasSubstr("readbacktofile writes one file, so it takes one position.\n")));
}

TEST_F(OperationCallsTest, WithoutACableAnOperationSaysSo) {
  identify();
  manager().closeCable(false);
  EXPECT_FALSE(perform({"readidcode", "-p", "0"}));
  EXPECT_THAT(errors(), ElementsAre("No cable is open. Use setCable.\n"));
}

TEST_F(OperationCallsTest, AfterAFailedIdentifyThereIsNothingToSearchForMpmParts) {
  testsupport::writeFile("stuck.json", R"({"chain": [{"part": "zp18v01"}], "faults": {"stuckTdo": 0}})");
  ASSERT_TRUE(manager().setCableOption("board", "stuck.json"));
  EXPECT_FALSE(perform({"identify"}));
  EXPECT_EQ(errors().size(), 1U);
  EXPECT_FALSE(perform({"identifyMPM"}));
  EXPECT_THAT(errors(), IsEmpty());
  EXPECT_STREQ(manager().getAttribute(2), "identify failed");
}

TEST_F(OperationCallsTest, PreferencesAndAttributesGiveOptionsOfTheTarget) {
  identify();
  ASSERT_TRUE(manager().setPreference(TesselPreference::eraseFirst, "true"));
  ASSERT_TRUE(manager().setDeviceAttribute(1, DeviceNS::USERCODE, "CAFE", false));
  const auto& words = manager().getDeviceOptionsMgr(tESSELNS::BOUNDARY_SCAN, 1, false)->getProgramOptions();
  std::vector<std::string> texts;
  for (const StringBase& word : words) texts.emplace_back(word.view());
  EXPECT_THAT(texts, ElementsAre("-e", "-usercode", "CAFE"));
}

TEST_F(OperationCallsTest, StepsThatWereCarriedOutAreRecorded) {
  identify();
  ASSERT_TRUE(perform({"program", "-p", "1", "-e", "-data", "42"}));
  ASSERT_FALSE(perform({"verify", "-p", "1", "-data", "43"}));
  EXPECT_EQ(testsupport::readFile("_tesselbatch.cmd"),
            "setMode -bscan\nsetCable -port null\nidentify\nprogram -p 2 -e -data 42\n");
}

}  // namespace
