// The session's operations on the output file that no command word leads to.

#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/utility/TesselCmdargs.h"
#include "tests/unit/batch/BatchTest.h"

namespace {

using testing::ElementsAre;
using testsupport::error;
using testsupport::readFile;

/// The bundled device manager has no configuration device: it refuses the attribute with this error.
const testsupport::Message refusal = error("Setting a configuration-device attribute is not built yet.\n");

class OutputFileTest : public BatchTest {
 protected:
  std::string recorded() const { return readFile("_tesselbatch.cmd"); }

  CmdParser session_;
};

struct Rename {
  bool (CmdParser::*handler)(UT_CMDARGS&);
  const char* missing;
  const char* line;
};
constexpr Rename renames[] = {
    {&CmdParser::renamePromFile, "Prom file name is required.\n", "renamePromFile -file \"a b.mcs\"\n"},
    {&CmdParser::renameMpmFile, "Mpm file name is required.\n", "renameMpmFile -file \"a b.mcs\"\n"},
};

TEST_F(OutputFileTest, ARenameNeedsTheFile) {
  const char* words[] = {"rename"};
  UT_CMDARGS args(1, words);
  for (const Rename& rename : renames) {
    EXPECT_FALSE((session_.*rename.handler)(args));
    EXPECT_THAT(messages_.take(), ElementsAre(error(rename.missing)));
  }
  EXPECT_FALSE(testsupport::exists("_tesselbatch.cmd"));
}

TEST_F(OutputFileTest, ARenameRecordsItsLineInQuotesAndGivesTheManagersResult) {
  const char* words[] = {"rename", "-file", "a b.mcs"};
  UT_CMDARGS args(3, words);
  std::string expected;
  for (const Rename& rename : renames) {
    EXPECT_FALSE((session_.*rename.handler)(args));
    EXPECT_THAT(messages_.take(), ElementsAre(refusal));
    expected += rename.line;
    EXPECT_EQ(recorded(), expected);
  }
}

TEST_F(OutputFileTest, AQuietAttributeSuspendsRecordingForTheCallEvenWhenItFails) {
  for (const bool quiet : {true, false}) {
    // The refusal is issued inside the call: a step taken there shows whether recording is on.
    const int speed = quiet ? 1 : 2;
    Port_MsgDispatcher::setObserver(
        [this, speed](MsgType, const std::string&) { session_.deviceManager->setCableSpeed(speed); });
    EXPECT_FALSE(session_.setConfigDeviceAttribute(ConfigDeviceNS::FILE_NAME, "x", quiet));
    Port_MsgDispatcher::setObserver({});
    session_.deviceManager->setCableSpeed(speed + 10);
  }
  EXPECT_EQ(recorded(), "setCableSpeed -speed 11\nsetCableSpeed -speed 2\nsetCableSpeed -speed 12\n");
}

TEST_F(OutputFileTest, AnOperationReportsItsTimeAlsoWhenItFails) {
  session_.modeSet = session_.cableSet = true;
  CommandSet line(0);
  ASSERT_TRUE(CommandSet::string2CommandSet("play -file x.svf", line));
  EXPECT_FALSE(session_.dispatch(line));
  const auto messages = messages_.take();
  ASSERT_EQ(messages.size(), 2U);
  EXPECT_EQ(messages[1].type, MsgType::status);
  EXPECT_THAT(messages[1].text, testing::AnyOf("Elapsed time =      0 sec.\n", "Elapsed time =      1 sec.\n"));
}

}  // namespace
