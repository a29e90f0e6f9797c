#include "batch/CmdParser.h"
#include "interfaces/portability/Port_MsgDispatcher.h"
#include "tests/unit/batch/BatchTest.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::error;
using testsupport::exists;
using testsupport::writeFile;

class CmdParserTest : public BatchTest {};

TEST_F(CmdParserTest, BeginsWithEveryFieldAsPromised) {
  const CmdParser session;
  EXPECT_EQ(session.commandFile, nullptr);
  EXPECT_EQ(session.recordStream, nullptr);
  for (const bool flag : {session.recordOn, session.modeSet, session.subModeSet, session.cableSet, session.infoRunning,
                          session.checkRunning, session.archiveSaving, session.inRepeat, session.quitRequested})
    EXPECT_FALSE(flag);
  EXPECT_TRUE(session.lastIdentifyOk);
  EXPECT_TRUE(session.useBatchLog);
  EXPECT_EQ(session.repeatCount, 0);
  EXPECT_TRUE(session.repeatBuffer.empty());
  EXPECT_TRUE(session.commandText.empty());
  EXPECT_TRUE(session.auxText.empty());
  EXPECT_EQ(session.deviceManager, DeviceManagerInterface::getDeviceManager());
  EXPECT_EQ(int{CmdParser::cableLock}, 5);
  EXPECT_EQ(allowBatchCallback, 0);
}

TEST_F(CmdParserTest, AnEnvironmentVariableAllowsTheCallback) {
  const testsupport::ScopedVariable variable("ZOR_TESSEL_ALLOWBATCHMODECALLBACK", "");
  const CmdParser session;
  EXPECT_EQ(allowBatchCallback, 1);
}

TEST_F(CmdParserTest, SetMsgWriteDecidesOnTheLog) {
  writeFile("session.cmd", "quit\n");
  {
    CmdParser session;
    session.setMsgWrite(false);
    EXPECT_FALSE(session.useBatchLog);
    EXPECT_TRUE(session.runCommandFile("session.cmd"));
    EXPECT_FALSE(exists("_tesselbatch.log"));
    session.setMsgWrite(true);
    EXPECT_TRUE(session.useBatchLog);
  }
  Port_MsgManDefault* before = Port_MsgDispatcher::getDefaultMsgMan();
  {
    CmdParser session;
    EXPECT_TRUE(session.runCommandFile("session.cmd"));
    EXPECT_TRUE(exists("_tesselbatch.log"));
    EXPECT_NE(Port_MsgDispatcher::getDefaultMsgMan(), before);
  }
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), before);
}

TEST_F(CmdParserTest, AFileThatCantBeOpenedFails) {
  CmdParser session;
  session.setMsgWrite(false);
  EXPECT_FALSE(session.runCommandFile("missing.cmd"));
  EXPECT_FALSE(session.runCommandFile("."));
  EXPECT_FALSE(session.runCommandFile(""));
  EXPECT_FALSE(session.runCommandFile(nullptr));
  EXPECT_THAT(messages_.all(), ElementsAre(error("File missing.cmd may not exist\n"), error("File . may not exist\n"),
                                           error("File  may not exist\n"), error("File  may not exist\n")));
}

TEST_F(CmdParserTest, AFileRunsUpToTheFirstLineThatFails) {
  writeFile("session.cmd", "clearCmd\n# comment\n\nfrobnicate\nhelp\nquit\n");
  CmdParser session;
  session.setMsgWrite(false);
  EXPECT_FALSE(session.runCommandFile("session.cmd"));
  EXPECT_THAT(messages_.all(), ElementsAre(error("Invalid command, frobnicate.\n")));
  EXPECT_EQ(session.commandText, StringBase("# comment\n\nfrobnicate\n"));
  EXPECT_FALSE(session.quitRequested);
}

TEST_F(CmdParserTest, ALongLineComesInPieces) {
  writeFile("session.cmd", "# " + std::string(1020, 'x') + "clearCmd\nquit\n");
  CmdParser session;
  session.setMsgWrite(false);
  EXPECT_TRUE(session.runCommandFile("session.cmd"));
  EXPECT_EQ(session.commandText, StringBase("quit\n")) << "the second piece of the comment is a command";
}

TEST_F(CmdParserTest, AFileWithoutQuitGoesOnAtThePrompt) {
  writeFile("session.cmd", "setEnv -env TESSEL_TEST_VARIABLE -value 1");
  const testsupport::ScopedVariable variable("TESSEL_TEST_VARIABLE", nullptr);
  const testsupport::StandardInput input("clearCmd\nfrobnicate\nquit\nnever read\n");
  testsupport::StandardOutputCapture output;
  CmdParser session;
  session.setMsgWrite(false);
  const bool result = session.runCommandFile("session.cmd");
  EXPECT_EQ(output.text(), ">>>");
  EXPECT_FALSE(result) << "it is that of the line before quit";
  EXPECT_STREQ(std::getenv("TESSEL_TEST_VARIABLE"), "1");
  EXPECT_THAT(messages_.all(), ElementsAre(error("Invalid command, frobnicate.\n")));
  EXPECT_EQ(interactive, 1);
  EXPECT_EQ(interruptRequested, 0);
}

TEST_F(CmdParserTest, TheEndOfInputEndsTheSession) {
  const testsupport::StandardInput input("clearCmd\n");
  testsupport::StandardOutputCapture output;
  CmdParser session;
  const bool result = session.runCommandLine();
  EXPECT_EQ(output.text(), ">>");
  EXPECT_TRUE(result);
  EXPECT_TRUE(session.quitRequested);
  EXPECT_EQ(interruptRequested, 1);
}

TEST_F(CmdParserTest, AnInterruptAtThePromptQuits) {
  const testsupport::StandardInput input("help\n");
  testsupport::StandardOutputCapture output;
  CmdParser session;
  interruptRequested = 1;
  const bool result = session.runCommandLine();
  EXPECT_EQ(output.text(), ">QUIT.\n");
  EXPECT_TRUE(result);
  EXPECT_TRUE(session.commandText.empty());
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(CmdParserTest, ASessionThatHasQuitRunsNothing) {
  writeFile("session.cmd", "frobnicate\n");
  testsupport::StandardOutputCapture output;
  CmdParser session;
  session.setMsgWrite(false);
  session.quitRequested = true;
  const bool result = session.runCommandFile("session.cmd") && session.runCommandLine();
  EXPECT_EQ(output.text(), "");
  EXPECT_TRUE(result);
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(CmdParserTest, TheEndOfASessionGivesTheCableBack) {
  {
    CmdParser session;
    session.deviceManager->setMode(tESSELNS::BOUNDARY_SCAN, true);
    EXPECT_TRUE(session.deviceManager->lockCable(CmdParser::cableLock));
  }
  EXPECT_FALSE(exists(runtime_.file("tessel/cable.lock")));
  EXPECT_EQ(DeviceManagerInterface::getDeviceManager()->getMode(), tESSELNS::NO_MODE);
}

}  // namespace
