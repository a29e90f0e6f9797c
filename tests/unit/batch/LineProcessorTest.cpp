#include "tests/unit/batch/BatchTest.h"

namespace {

using testing::IsEmpty;

struct NameRow {
  const char* path;
  const char* name;
};

TEST(BaseName, IsTheTextAfterTheLastSlashOrBackslash) {
  constexpr NameRow rows[] = {{"", ""},
                              {"file.bit", "file.bit"},
                              {"dir/file.bit", "file.bit"},
                              {"dir\\file.bit", "file.bit"},
                              {"dir\\sub/file.bit", "file.bit"},
                              {"dir/sub\\file.bit", "file.bit"},
                              {"/file.bit", "file.bit"},
                              {"dir/", ""},
                              {"\\", ""},
                              {"//a", "a"}};
  for (const NameRow& row : rows) EXPECT_STREQ(baseName(row.path), row.name) << row.path;
}

TEST(BaseName, PointsIntoThePath) {
  const char* path = "dir/file";
  EXPECT_EQ(baseName(path), path + 4);
}

class LineProcessorTest : public BatchTest {
 protected:
  bool process(CmdParser& session, const char* line) {
    CommandSet command(0);
    return session.recordAndTokenise(line, command) && session.processLine(command);
  }
};

TEST_F(LineProcessorTest, EveryLineReadStandsInTheTranscript) {
  CmdParser session;
  CommandSet command(0);
  EXPECT_TRUE(session.recordAndTokenise("setMode  -bscan", command));
  EXPECT_EQ(command.getNumberCommands(), 2);
  EXPECT_FALSE(session.recordAndTokenise("# comment", command));
  EXPECT_TRUE(session.recordAndTokenise("quit\n", command));
  EXPECT_EQ(session.commandText, StringBase("setMode  -bscan\n# comment\nquit\n\n"));
}

TEST_F(LineProcessorTest, AnInterruptRefusesTheLine) {
  CmdParser session;
  interruptRequested = 1;
  EXPECT_FALSE(process(session, "setEnv -env LAB_BENCH -value 7"));
  EXPECT_TRUE(session.quitRequested);
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(LineProcessorTest, ALoopRunsItsCommandsAgainAndAgain) {
  CmdParser session;
  EXPECT_TRUE(process(session, "repeatStart -loop 3"));
  EXPECT_TRUE(process(session, "help -m quit"));
  EXPECT_TRUE(process(session, "help -m clearCmd"));
  EXPECT_EQ(session.repeatBuffer.size(), 2U);
  EXPECT_THAT(messages_.take(), IsEmpty());
  EXPECT_TRUE(process(session, "repeatEnd"));
  const auto messages = messages_.take();
  ASSERT_EQ(messages.size(), 6U);
  for (std::size_t i = 0; i < messages.size(); ++i)
    EXPECT_THAT(messages[i].text, testing::StartsWith(i % 2 == 0 ? "quit: " : "clearCmd: "));
  EXPECT_TRUE(session.repeatBuffer.empty());
  EXPECT_FALSE(session.inRepeat);
  EXPECT_EQ(testsupport::readFile("_tesselbatch.cmd"), "repeatStart -loop 3\nrepeatEnd\n");
}

TEST_F(LineProcessorTest, APositionInALoopIsConvertedOnceARun) {
  CmdParser session;
  EXPECT_TRUE(process(session, "repeatStart -loop 3"));
  EXPECT_TRUE(process(session, "setTargetDevice -p 5"));
  EXPECT_TRUE(process(session, "repeatEnd"));
  tESSELNS::MODE_TYPE mode = tESSELNS::NO_MODE;
  int position = -1;
  bool attached = false;
  session.deviceManager->getTargetDevice(mode, position, attached);
  EXPECT_EQ(position, 4);
}

}  // namespace
