#include <signal.h>

#include "batch/Interrupts.h"
#include "tests/unit/batch/BatchTest.h"
#include "tests/unit/support/ChildProcess.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::ChildProcess;
using testsupport::status;

class InterruptsTest : public BatchTest {
 protected:
  /// How a process ends that handles a signal, and what it prints.
  static std::string outcome(int signal, bool atPrompt, bool modeSet) {
    ChildProcess child([=] {
      interactive = atPrompt ? 1 : 0;
      if (modeSet) DeviceManagerInterface::getDeviceManager()->setMode(tESSELNS::SPI, true);
      signalHandler(signal);
      return interruptRequested != 0 ? 10 : 11;
    });
    const std::string printed = child.readAll();
    return printed + child.wait();
  }

  const testsupport::Message promise_ =
      status("Ctrl-C detected. Please wait while the current batch command is being completed.\n");
};

TEST_F(InterruptsTest, CtrlCPromisesToStopAndAsksForIt) {
  EXPECT_EQ(consoleCtrlHandler(0), TRUE);
  EXPECT_EQ(interruptRequested, 1);
  EXPECT_THAT(messages_.take(), ElementsAre(promise_));
  EXPECT_EQ(consoleCtrlHandler(0), TRUE);
  EXPECT_THAT(messages_.take(), ElementsAre(promise_));
}

TEST_F(InterruptsTest, CtrlCAtThePromptIsSilent) {
  interactive = 1;
  EXPECT_EQ(consoleCtrlHandler(0), TRUE);
  EXPECT_EQ(interruptRequested, 1);
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(InterruptsTest, TheClosingConsoleIsToldAndStopsNothing) {
  EXPECT_EQ(consoleCtrlHandler(2), TRUE);
  EXPECT_EQ(interruptRequested, 0);
  EXPECT_THAT(messages_.all(), ElementsAre(status("close handler.\n")));
}

TEST_F(InterruptsTest, OtherEventsAreLeftToOthers) {
  for (const DWORD event : {1U, 3U, 4U, 5U, 6U, 7U, 0xFFFFFFFFU}) EXPECT_EQ(consoleCtrlHandler(event), FALSE) << event;
  EXPECT_EQ(interruptRequested, 0);
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(InterruptsTest, TheInterruptSignalDoesAsCtrlC) {
  signalHandler(SIGINT);
  EXPECT_EQ(interruptRequested, 1);
  EXPECT_THAT(messages_.all(), ElementsAre(promise_));
}

TEST_F(InterruptsTest, AnySignalAsksToStop) {
  for (const int signal : {SIGUSR1, SIGHUP, 0, 12345}) {
    interruptRequested = 0;
    signalHandler(signal);
    EXPECT_EQ(interruptRequested, 1) << signal;
  }
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(InterruptsTest, SomeSignalsEndTheProcess) {
  const std::string aborted = "signal " + std::to_string(SIGABRT);
  EXPECT_EQ(outcome(SIGINT, true, false), aborted);
  EXPECT_EQ(outcome(SIGSEGV, false, false), "sigsegv.\n" + aborted);
  EXPECT_EQ(outcome(SIGTERM, false, true), "sigterm.\n" + aborted);
}

TEST_F(InterruptsTest, AnAbortGivesTheCableBack) {
  EXPECT_EQ(outcome(SIGABRT, false, true), "Force-unlocking cable.\nexit 10");
  EXPECT_EQ(outcome(SIGABRT, false, false), "Force-unlocking cable.\nMODE IS NONE IN SIGABORT\nexit 10");
}

TEST_F(InterruptsTest, ForceUnlockGivesTheLockBack) {
  ASSERT_TRUE(DeviceManagerInterface::getDeviceManager()->lockCable(5));
  EXPECT_TRUE(testsupport::exists(runtime_.file("tessel/cable.lock")));
  testsupport::StandardOutputCapture output;
  forceUnlockCable();
  EXPECT_EQ(output.text(), "Force-unlocking cable.\n");
  EXPECT_FALSE(testsupport::exists(runtime_.file("tessel/cable.lock")));
}

}  // namespace
