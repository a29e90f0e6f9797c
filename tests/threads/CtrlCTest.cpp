// Ctrl-C as a user types it: into a real terminal, with the real program running.

#include <gtest/gtest.h>
#include <signal.h>
#include <unistd.h>

#include "tests/threads/TerminalSession.h"
#include "tests/unit/support/ChildProcess.h"

namespace {

namespace fs = std::filesystem;

const std::string ctrlC = "\x03";
const std::string promise = "Ctrl-C detected. Please wait while the current batch command is being completed.";

std::size_t count(const std::string& text, const std::string& part) {
  std::size_t found = 0;
  for (std::size_t place = text.find(part); place != std::string::npos; place = text.find(part, place + 1)) ++found;
  return found;
}

/// A command file whose lockcable line waits until the test gives the lock free.
class WaitingCommand {
 public:
  explicit WaitingCommand(TerminalSession& session) : session_(session) {
    session.writeFile("tessel/cable.lock", std::to_string(::getpid()) + "\n");
    fs::permissions(session.directory() / "tessel", fs::perms::owner_all);
    session.writeFile("wait.cmd",
                      "setMode -bscan\n"
                      "setPreference -pref cableLockTries:1000\n"
                      "info\n"
                      "lockcable\n"
                      "help -c setMbBpiDevice\n"
                      "quit\n");
  }

  /// Waits until the command runs: each of its tries touches the lock's directory.
  bool runs() {
    if (!session_.waitFor("Devices on the chain")) return false;
    const auto before = fs::last_write_time(session_.directory() / "tessel");
    for (int i = 0; i < 600; ++i) {
      if (fs::last_write_time(session_.directory() / "tessel") != before) return true;
      ::usleep(10000);
    }
    return false;
  }

  void letGo() { fs::remove(session_.directory() / "tessel" / "cable.lock"); }

 private:
  TerminalSession& session_;
};

TEST(CtrlC, LetsTheRunningCommandEndAndRefusesTheNextLine) {
  TerminalSession session("file");
  WaitingCommand command(session);
  session.start({"--no-log", "wait.cmd"});
  ASSERT_TRUE(command.runs()) << session.output();
  session.type(ctrlC);
  ASSERT_TRUE(session.waitFor(promise)) << session.output();
  EXPECT_TRUE(session.running());
  command.letGo();
  EXPECT_EQ(session.finish(), 1) << session.output();
  EXPECT_EQ(count(session.output(), promise), 1U);
  EXPECT_EQ(count(session.output(), "ERROR"), 0U) << "the command did not complete: " << session.output();
  EXPECT_EQ(count(session.output(), "setMbBpiDevice"), 0U) << "the next line ran: " << session.output();
  EXPECT_EQ(count(session.output(), "Sanitizer"), 0U) << session.output();
}

TEST(CtrlC, LetsAProgrammingRunComeToItsEnd) {
  TerminalSession session("program");
  testsupport::ChildProcess board({TESSEL_BOARD, "--listen", "127.0.0.1:0"});
  const std::string listening = board.readLine();
  const std::string server = listening.substr(listening.rfind(' ') + 1);
  session.writeFile("data.bin", std::string(100000, 'x'));
  session.writeFile("program.cmd", "setMode -bscan\nsetCable -port usb1 -server " + server +
                                       "\nidentify\nprogram -p 2 -e -v -file data.bin\nerase -p 2\nquit\n");
  session.start({"--no-log", "program.cmd"});
  ASSERT_TRUE(session.waitFor("Programming zp20s08")) << session.output();
  session.type(ctrlC);
  ASSERT_TRUE(session.waitFor(promise)) << session.output();
  EXPECT_EQ(count(session.output(), "Verified"), 0U) << "the run was over before the key was pressed";
  EXPECT_EQ(session.finish(), 1) << session.output();
  EXPECT_EQ(count(session.output(), "Verified 100000 bytes"), 1U) << session.output();
  EXPECT_EQ(count(session.output(), "Erasing"), 0U) << "the next line ran: " << session.output();
}

TEST(CtrlC, AnswersEveryPressAndKeepsABatchLog) {
  TerminalSession session("presses");
  WaitingCommand command(session);
  session.start({"wait.cmd"});
  ASSERT_TRUE(command.runs()) << session.output();
  for (std::size_t press = 1; press <= 3; ++press) {
    session.type(ctrlC);
    for (int i = 0; i < 600 && count(session.output(), promise) < press; ++i) session.collect();
  }
  command.letGo();
  EXPECT_EQ(session.finish(), 1);
  EXPECT_EQ(count(session.output(), promise), 3U) << session.output();
  EXPECT_EQ(count(session.output(), "Sanitizer"), 0U) << session.output();
}

/// Whether a signal reaches a session that waits at its prompt before the line does.
#if defined(__SANITIZE_THREAD__)
constexpr bool signalsReachThePrompt = false;  // the sanitizer holds them back until the C library has its line
#else
constexpr bool signalsReachThePrompt = true;
#endif

TEST(CtrlC, AtThePromptIsAnsweredAtTheNextLine) {
  if (!signalsReachThePrompt) GTEST_SKIP() << "the thread sanitizer holds signals back at the prompt";
  TerminalSession session("prompt");
  session.start({"--no-log"});
  ASSERT_TRUE(session.waitFor(">"));
  session.type(ctrlC);
  ASSERT_TRUE(session.waitFor("^C"));
  ::usleep(300000);  // the event thread has long set the flag by then
  EXPECT_TRUE(session.running());
  session.type("info\n");
  EXPECT_EQ(session.finish(), 0) << session.output();
  EXPECT_EQ(count(session.output(), "QUIT."), 1U) << session.output();
  EXPECT_EQ(count(session.output(), promise), 0U) << session.output();
  EXPECT_EQ(count(session.output(), "Devices"), 0U) << "the line ran: " << session.output();
  EXPECT_EQ(count(session.output(), "Sanitizer"), 0U) << session.output();
}

TEST(Signals, TheOnesNobodyHandlesHaveTheirDefaultAction) {
  if (!signalsReachThePrompt) GTEST_SKIP() << "the thread sanitizer holds signals back at the prompt";
  for (const int signal : {SIGTERM, SIGQUIT}) {
    TerminalSession session("signal" + std::to_string(signal));
    session.start({"--no-log"});
    ASSERT_TRUE(session.waitFor(">"));
    ::kill(session.process(), signal);
    EXPECT_EQ(session.finish(), -signal) << session.output();
  }
}

TEST(Signals, ATerminalThatGoesAwayLetsTheRunningCommandEnd) {
  TerminalSession session("hangup");
  WaitingCommand command(session);
  session.start({"wait.cmd"});
  ASSERT_TRUE(command.runs()) << session.output();
  session.hangUp();
  ::usleep(300000);
  EXPECT_TRUE(session.running());
  command.letGo();
  EXPECT_EQ(session.finish(), 0);
}

TEST(EndOfInput, EndsTheSession) {
  TerminalSession session("end");
  session.start({"--no-log"});
  ASSERT_TRUE(session.waitFor(">"));
  session.type("\x04");
  EXPECT_EQ(session.finish(), 0) << session.output();
}

}  // namespace
