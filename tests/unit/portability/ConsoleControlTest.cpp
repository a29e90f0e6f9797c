#include <gtest/gtest.h>
#include <signal.h>

#include "interfaces/portability/ConsoleControl.h"
#include "tests/unit/support/ChildProcess.h"

namespace {

using testsupport::ChildProcess;

/// Signals as a program gets them that is started from a terminal, whatever this one was started from.
void defaultSignals() {
  for (const int signal : {SIGINT, SIGQUIT, SIGHUP, SIGTERM}) ::signal(signal, SIG_DFL);
  sigset_t none;
  sigemptyset(&none);
  ::sigprocmask(SIG_SETMASK, &none, nullptr);
}

std::vector<std::string> helper(std::vector<std::string> words) {
  words.insert(words.begin(), CONSOLE_CONTROL_HELPER);
  return words;
}

/// The helper program, with a test's words.
class Helper : public ChildProcess {
 public:
  explicit Helper(const std::vector<std::string>& words, const std::function<void()>& prepare = defaultSignals)
      : ChildProcess(helper(words), prepare) {}
};

struct EventRow {
  int signal;
  int event;
};
constexpr EventRow eventRows[] = {{SIGINT, 0}, {SIGQUIT, 1}, {SIGHUP, 2}, {SIGTERM, 6}};

TEST(ConsoleControl, SignalsBecomeEvents) {
  Helper child({"+taking"});
  ASSERT_EQ(child.readLine(), "ready");
  for (int round = 0; round < 3; ++round)
    for (const EventRow& row : eventRows) {
      child.send(row.signal);
      EXPECT_EQ(child.readLine(), "taking " + std::to_string(row.event));
    }
  child.closeInput();
  EXPECT_EQ(child.readAll(), "");
  EXPECT_EQ(child.wait(), "exit 0");
}

TEST(ConsoleControl, TheLastHandlerIsAskedFirst) {
  Helper child({"+taking", "+passing", "+passing2"});
  ASSERT_EQ(child.readLine(), "ready");
  child.send(SIGINT);
  EXPECT_EQ(child.readLine(), "passing2 0");
  EXPECT_EQ(child.readLine(), "passing 0");
  EXPECT_EQ(child.readLine(), "taking 0");
  EXPECT_EQ(child.wait(), "exit 0");
}

TEST(ConsoleControl, TheFirstThatTakesAnEventEndsTheSearch) {
  Helper child({"+passing", "+taking", "+taking2"});
  ASSERT_EQ(child.readLine(), "ready");
  child.send(SIGTERM);
  EXPECT_EQ(child.readLine(), "taking2 6");
  child.closeInput();
  EXPECT_EQ(child.readAll(), "");
}

TEST(ConsoleControl, AnEventThatNobodyTakesGetsTheSignalsDefaultAction) {
  for (const EventRow& row : eventRows) {
    Helper child({"+passing"});
    ASSERT_EQ(child.readLine(), "ready");
    child.send(row.signal);
    EXPECT_EQ(child.readLine(), "passing " + std::to_string(row.event));
    EXPECT_EQ(child.readLine(), "(end)");
    EXPECT_EQ(child.wait(), "signal " + std::to_string(row.signal));
  }
}

TEST(ConsoleControl, WithoutAnyHandlerLeftSignalsEndTheProcess) {
  Helper child({"+taking", "-taking"});
  ASSERT_EQ(child.readLine(), "ready");
  child.send(SIGINT);
  EXPECT_EQ(child.readLine(), "(end)");
  EXPECT_EQ(child.wait(), "signal " + std::to_string(SIGINT));
}

TEST(ConsoleControl, AHandlerIsCalledAsOftenAsItIsRegistered) {
  Helper child({"+taking", "+passing", "+passing", "+passing2", "-passing"});
  ASSERT_EQ(child.readLine(), "ready");
  child.send(SIGINT);
  EXPECT_EQ(child.readLine(), "passing2 0");
  EXPECT_EQ(child.readLine(), "passing 0");
  EXPECT_EQ(child.readLine(), "taking 0");
}

TEST(ConsoleControl, OnlyARegisteredHandlerCanBeRemoved) {
  Helper child({"-taking", "+taking", "-taking", "-taking", "-passing"});
  EXPECT_EQ(child.readLine(), "-taking failed");
  EXPECT_EQ(child.readLine(), "-taking failed");
  EXPECT_EQ(child.readLine(), "-passing failed");
  EXPECT_EQ(child.readLine(), "ready");
}

TEST(ConsoleControl, AnIgnoredSignalStaysIgnored) {
  for (const EventRow& ignored : eventRows) {
    Helper child({"+taking"}, [&ignored] {
      defaultSignals();
      ::signal(ignored.signal, SIG_IGN);
    });
    ASSERT_EQ(child.readLine(), "ready");
    child.send(ignored.signal);
    const EventRow& other = ignored.signal == SIGINT ? eventRows[3] : eventRows[0];
    child.send(other.signal);
    EXPECT_EQ(child.readLine(), "taking " + std::to_string(other.event));
    child.closeInput();
    EXPECT_EQ(child.readAll(), "");
    EXPECT_EQ(child.wait(), "exit 0");
  }
}

TEST(ConsoleControl, HandlersRunOnAThreadOfTheirOwn) {
  Helper child({"+telling"});
  ASSERT_EQ(child.readLine(), "ready");
  child.send(SIGHUP);
  EXPECT_EQ(child.readLine(), "telling 2 on its own thread");
}

TEST(ConsoleControl, DeliverCallsHandlersOnTheCallingThread) {
  Helper child(
      {"deliver:0", "+telling", "deliver:5", "-telling", "+taking", "+passing", "deliver:6", "-taking", "deliver:1"});
  for (const char* line : {"not taken", "telling 5 on the main thread", "taken", "passing 6", "taking 6", "taken",
                           "passing 1", "not taken", "ready"})
    EXPECT_EQ(child.readLine(), line);
  EXPECT_EQ(child.wait(), "exit 0");
}

TEST(ConsoleControl, AHandlerIssuesMessagesWhileTheMainThreadDoes) {
  constexpr int count = 2000;
  constexpr int presses = 20;
  Helper child({"+talking", "talk:" + std::to_string(count)});
  ASSERT_EQ(child.readLine(), "ready");
  int spoken = 0;
  int answered = 0;
  child.send(SIGINT);
  for (std::string line = child.readLine(); line != "ready"; line = child.readLine()) {
    if (line == "talking 0") {
      if (++answered < presses) child.send(SIGINT);
    } else {
      ASSERT_EQ(line, "main " + std::to_string(spoken++));
    }
  }
  for (; answered < presses; ++answered) {
    EXPECT_EQ(child.readLine(), "talking 0");
    if (answered + 1 < presses) child.send(SIGINT);
  }
  EXPECT_EQ(spoken, count);
  EXPECT_EQ(child.wait(), "exit 0");
}

}  // namespace
