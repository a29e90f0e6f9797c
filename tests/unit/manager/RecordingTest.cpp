#include <algorithm>
#include <sstream>

#include "interfaces/constraints/ModeKeywords.h"
#include "interfaces/portability/UT_STR.h"
#include "interfaces/utility/CommandSet.h"
#include "interfaces/utility/TesselCmdargs.h"
#include "tests/unit/manager/ManagerTest.h"

namespace {

using tESSELNS::MODE_TYPE;
using testing::IsEmpty;
using testsupport::readFile;

class RecordingTest : public ManagerTest {};

TEST_F(RecordingTest, AStepIsALineThatRepeatsIt) {
  manager().setMode(tESSELNS::PROM_FILE_FORMATTER, true);
  manager().setSubmode(tESSELNS::PFF_MULTIBOOT_BPI);
  manager().setTargetDevice(tESSELNS::PROM_FILE_FORMATTER, 0, false);
  manager().setTargetDevice(tESSELNS::PROM_FILE_FORMATTER, 1, true);
  manager().setMbBpiDevice("28F256");
  manager().setMbBpiType("up and down");
  manager().setMbBpiChain("serial");
  manager().setBpiWidth(tESSELNS::PROM_FILE_FORMATTER, "16");
  manager().setBpiWidth(tESSELNS::PROM_FILE_FORMATTER, "");
  manager().setCable("null", 0, 9600, true, nullptr, false);
  manager().setCableSpeed(6000000);
  manager().setPreference(TesselPreference::lineWidth, "100");
  EXPECT_EQ(recorded(),
            "setMode -promfile\n"
            "setSubmode -pffmbbpi\n"
            "setTargetDevice -p 1\n"
            "setTargetDevice -p 2 -attached\n"
            "setMbBpiDevice -device 28F256\n"
            "setMbBpiType -type \"up and down\"\n"
            "SetMbBpiChain -serial\n"
            "SetBpiWidth -width 16\n"
            "SetBpiWidth -width \"\"\n"
            "setCable -port null\n"
            "setCableSpeed -speed 6000000\n"
            "setPreference -pref lineWidth:100\n");
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(RecordingTest, EveryRecordedLineIsACommand) {
  for (int mode = 0; mode <= 8; ++mode) {
    manager().setMode(static_cast<MODE_TYPE>(mode), true);
    for (int submode = 0; submode <= 6; ++submode) manager().setSubmode(static_cast<tESSELNS::SUBMODE_TYPE>(submode));
  }
  manager().setTargetDevice(tESSELNS::SPI, 4, true);
  manager().setMbBpiType("a b");
  manager().setCableSpeed(-1);
  messages_.take();
  std::istringstream lines(recorded());
  int count = 0;
  for (std::string text; std::getline(lines, text); ++count) {
    SCOPED_TRACE(text);
    const auto line = CommandSet::string2CommandSet(text.c_str());
    ASSERT_NE(line, nullptr);
    EXPECT_NO_THROW(TesselCmdargs::getCmdargs(line->getNumberCommands(), line->getCommands(), true));
  }
  EXPECT_EQ(count, 9 + 2 + 7 + 3);
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(RecordingTest, ARecordedModeIsTheModeThatWasSet) {
  for (int mode = 0; mode <= 8; ++mode) {
    manager().setBatchCommandFile(("mode" + std::to_string(mode)).c_str());
    manager().setMode(static_cast<MODE_TYPE>(mode), true);
    const std::string line = readFile("mode" + std::to_string(mode));
    int found = -1;
    for (const auto& row : ModeKeywords::modes)
      if (line == std::string("setMode -") + row.keyword + "\n") found = row.mode;
    EXPECT_EQ(found, mode) << line;
  }
}

TEST_F(RecordingTest, WhatChangesNothingIsNoStep) {
  const auto setAll = [this] {
    manager().setMode(tESSELNS::SPI, true);
    manager().setTargetDevice(tESSELNS::SPI, 2, false);
    manager().setMbBpiDevice("28F256");
    manager().setMbBpiType("up");
    manager().setMbBpiChain("serial");
    manager().setBpiWidth(tESSELNS::PROM_FILE_FORMATTER, "8");
    manager().setCable("null", 0, 9600, true, nullptr, false);
    manager().setCableSpeed(100);
  };
  setAll();
  const std::string once = recorded();
  EXPECT_EQ(std::count(once.begin(), once.end(), '\n'), 8);
  setAll();
  EXPECT_EQ(recorded(), once);
}

TEST_F(RecordingTest, AModeThatOnlyBecomesActiveIsAStep) {
  manager().setMode(tESSELNS::SPI, false);
  manager().setMode(tESSELNS::SPI, false);
  EXPECT_EQ(recorded(), "setMode -spi\n");
  manager().setMode(tESSELNS::SPI, true);
  EXPECT_EQ(recorded(), "setMode -spi\nsetMode -spi\n");
}

TEST_F(RecordingTest, TheSameSubmodeAgainIsNoStep) {
  manager().setMode(tESSELNS::PROM_FILE_FORMATTER, true);
  manager().setSubmode(tESSELNS::PFF_SPI);
  manager().setSubmode(tESSELNS::PFF_SPI);
  EXPECT_EQ(recorded(), "setMode -promfile\nsetSubmode -pffspi\n");
}

TEST_F(RecordingTest, TheSamePreferenceAgainIsNoStep) {
  manager().setPreference(TesselPreference::cableLockTries, "2");
  manager().setPreference(TesselPreference::cableLockTries, "2");
  EXPECT_EQ(recorded(), "setPreference -pref cableLockTries:2\n");
}

TEST_F(RecordingTest, WhatFailsIsNoStep) {
  manager().setMode(tESSELNS::NO_MODE, true);
  manager().setSubmode(tESSELNS::PFF_SPI);
  manager().setPreference(TesselPreference::lineWidth, "wide");
  manager().setCable("usb", 0, -1, true, nullptr, false);
  EXPECT_EQ(recorded(), nothing);
}

TEST_F(RecordingTest, SuspendedOnlyLinesThatAreHandedInAreWritten) {
  ModeInterface::setBatchCommandOff();
  manager().setMode(tESSELNS::SPI, true);
  EXPECT_EQ(recorded(), nothing);
  EXPECT_TRUE(manager().writeBatchCommand("repeatEnd"));
  EXPECT_EQ(recorded(), "repeatEnd\n");
  ModeInterface::setBatchCommandOn();
  manager().setMode(tESSELNS::BOUNDARY_SCAN, true);
  EXPECT_EQ(recorded(), "repeatEnd\nsetMode -bscan\n");
}

TEST_F(RecordingTest, APreferenceTurnsStepsOff) {
  manager().setPreference(TesselPreference::recordSteps, "FALSE");
  manager().setMode(tESSELNS::SPI, true);
  EXPECT_EQ(recorded(), nothing);
  EXPECT_TRUE(manager().writeBatchCommand("quit"));
  manager().setPreference(TesselPreference::recordSteps, "true");
  manager().setMode(tESSELNS::BOUNDARY_SCAN, true);
  EXPECT_EQ(recorded(), "quit\nsetPreference -pref recordSteps:true\nsetMode -bscan\n");
}

TEST_F(RecordingTest, TheFileIsAddedToAndRenamed) {
  testsupport::writeFile("_tesselbatch.cmd", "before\n");
  manager().setMode(tESSELNS::SPI, true);
  manager().setBatchCommandFile("steps.cmd");
  manager().setMode(tESSELNS::BOUNDARY_SCAN, true);
  EXPECT_EQ(recorded(), "before\nsetMode -spi\n");
  EXPECT_EQ(readFile("steps.cmd"), "setMode -bscan\n");
}

TEST_F(RecordingTest, AnUnwritableFileGivesOneErrorAndStopsNothing) {
  manager().setBatchCommandFile("missing/steps.cmd");
  EXPECT_TRUE(manager().setMode(tESSELNS::SPI, true));
  EXPECT_TRUE(manager().setMode(tESSELNS::BOUNDARY_SCAN, true));
  EXPECT_FALSE(manager().writeBatchCommand("quit"));
  EXPECT_THAT(messages_.all(),
              testing::ElementsAre(testsupport::error(
                  "Batch-command file missing/steps.cmd can't be written: No such file or directory. Steps are not "
                  "recorded; name another file with renameBatchCmdFile.\n")));
}

}  // namespace
