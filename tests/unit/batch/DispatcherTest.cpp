#include "interfaces/utility/TesselCmdargs.h"
#include "tests/unit/batch/BatchTest.h"
#include "tests/unit/support/ChildProcess.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;
using testsupport::error;

class DispatcherTest : public BatchTest {
 protected:
  bool dispatch(const char* text) {
    CommandSet line(0);
    EXPECT_TRUE(CommandSet::string2CommandSet(text, line)) << text;
    return session_.dispatch(line);
  }

  CmdParser session_;
};

TEST_F(DispatcherTest, EveryWordOfTheTableHasAHandler) {
  std::vector<std::string> unknown;
  for (const StringBase& word : TesselCmdargs::findAllCommands()) {
    SCOPED_TRACE(word.c_str());
    const bool result = dispatch(word.c_str());
    const auto messages = messages_.take();
    EXPECT_TRUE(result || !messages.empty()) << "a command that fails tells why";
    if (messages == std::vector{error(std::string("Unknown operation ") + word.c_str() + "\n")})
      unknown.emplace_back(word.c_str());
  }
  // These two are words of the line processor.
  EXPECT_THAT(unknown, ElementsAre("repeatEnd", "repeatStart"));
}

TEST_F(DispatcherTest, LetterCaseDoesNotCount) {
  EXPECT_TRUE(dispatch("CLEARCMD"));
  EXPECT_TRUE(dispatch("SETENV -ENV TESSEL_TEST_VARIABLE -VALUE x"));
  EXPECT_TRUE(dispatch("unsetenv -env TESSEL_TEST_VARIABLE"));
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(DispatcherTest, WordsOfTheHostAreUnknownOperations) {
  const auto dispatchAll = [this] {
    for (const char* word : {"gTestWord", "kTestWord", "zTestWord", "_testWord", "9TestWord"}) {
      TesselCmdargs::accept(word);
      EXPECT_FALSE(dispatch(word));
      EXPECT_THAT(messages_.take(), ElementsAre(error(std::string("Unknown operation ") + word + "\n")));
    }
  };
  EXPECT_EQ(testsupport::runInChild(dispatchAll), "exit 0");  // the words stay with the process
}

TEST_F(DispatcherTest, AnUnknownWordThatBeginsWithFIsSilent) {
  const auto dispatchAll = [this] {
    for (const char* word : {"fTestWord", "FTestWord2"}) {
      TesselCmdargs::accept(word);
      EXPECT_FALSE(dispatch(word));
    }
    EXPECT_THAT(messages_.all(), IsEmpty());
  };
  EXPECT_EQ(testsupport::runInChild(dispatchAll), "exit 0");
}

TEST_F(DispatcherTest, AWordThatTheTableDoesNotHoldIsInvalid) {
  EXPECT_FALSE(dispatch("frobnicate -p 1"));
  EXPECT_THAT(messages_.all(), ElementsAre(error("Invalid command, frobnicate.\n")));
}

TEST_F(DispatcherTest, ShortFormsOfExitQuit) {
  EXPECT_TRUE(dispatch("ex"));
  EXPECT_TRUE(session_.quitRequested);
  EXPECT_EQ(testsupport::readFile("_tesselbatch.cmd"), "repeatEnd\n");
}

TEST_F(DispatcherTest, PositionsCountFromZeroButForPorts) {
  EXPECT_FALSE(dispatch("setTargetDevice -p 99999999999"));
  EXPECT_THAT(messages_.take(), ElementsAre(error("Position 99999999999 is out of range, positions start at 1.\n")));
  session_.modeSet = true;
  EXPECT_FALSE(dispatch("SETCABLE -p 99999999999"));
  const auto messages = messages_.take();
  ASSERT_EQ(messages.size(), 1U);
  EXPECT_THAT(messages.front().text, testing::StartsWith("The port word names no cable. "));
}

TEST_F(DispatcherTest, WithoutADeviceManagerACommandThatNeedsItSaysSo) {
  session_.deviceManager = nullptr;
  EXPECT_FALSE(dispatch("setMode -bscan"));
  EXPECT_THAT(messages_.take(), ElementsAre(error("There is no device manager for setMode.\n")));
  session_.modeSet = true;
  EXPECT_FALSE(dispatch("play -showprogress"));
  EXPECT_THAT(messages_.take(), ElementsAre(error("There is no device manager for play.\n")));
}

TEST_F(DispatcherTest, WithoutADeviceManagerCommandsThatNeedNoneWork) {
  session_.deviceManager = nullptr;
  for (const char* line : {"clearCmd", "help -m quit", "setEnv -env TESSEL_TEST_VARIABLE -value x",
                           "unsetEnv -env TESSEL_TEST_VARIABLE", "saveCmd -file x.cmd", "setLog", "ex"})
    EXPECT_TRUE(dispatch(line)) << line;
  EXPECT_TRUE(session_.quitRequested);
}

TEST_F(DispatcherTest, WithoutADeviceManagerAnUnknownWordThatBeginsWithFIsSilent) {
  session_.deviceManager = nullptr;
  const auto dispatchWord = [this] {
    TesselCmdargs::accept("fWithoutManager");
    EXPECT_FALSE(dispatch("fWithoutManager"));
    EXPECT_THAT(messages_.all(), IsEmpty());
  };
  EXPECT_EQ(testsupport::runInChild(dispatchWord), "exit 0");
}

TEST_F(DispatcherTest, InfoIsNotedWhileItRuns) {
  EXPECT_TRUE(dispatch("in"));
  EXPECT_THAT(messages_.all(), Not(IsEmpty()));
  EXPECT_FALSE(session_.infoRunning);
  EXPECT_FALSE(session_.checkRunning);
}

}  // namespace
