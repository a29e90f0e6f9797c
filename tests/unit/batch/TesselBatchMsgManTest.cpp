#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <filesystem>
#include <sstream>
#include <thread>

#include "batch/log/TesselBatchMsgMan.h"
#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/Port_MsgManData.h"
#include "interfaces/portability/UT_STR.h"
#include "tests/unit/support/ChildProcess.h"
#include "tests/unit/support/ConsoleCapture.h"
#include "tests/unit/support/Files.h"

namespace {

using testing::MatchesRegex;
using testsupport::exists;
using testsupport::readFile;
using testsupport::writeFile;

constexpr const char* defaultLog = "_tesselbatch.log";
constexpr const char* banner =
    "tESSEL Version: [^\n]+\n\ntESSEL log file Started on [0-9]+-[0-9]+-[0-9]+ [0-9]+:[0-9]+:[0-9]+\n";

void say(const char* text) { Port_MsgDispatcher::dispatch(MsgType::status, "tESSEL", text); }
void complain(const char* text) { Port_MsgDispatcher::dispatch(MsgType::error, "tESSEL", text); }

class TesselBatchMsgManTest : public testing::Test {
 protected:
  ~TesselBatchMsgManTest() override {
    TesselBatchMsgMan::removeBatchLog();
    Port_MsgDispatcher::getDefaultMsgMan()->setMaxLineWidth(0);
  }

  static TesselBatchMsgMan& log() { return static_cast<TesselBatchMsgMan&>(*Port_MsgDispatcher::getDefaultMsgMan()); }
  /// What stands behind the banner of a log that is no longer written.
  static std::string body(const std::string& path = defaultLog) {
    const std::string text = readFile(path);
    std::size_t end = 0;
    for (int line = 0; line < 3; ++line) end = text.find('\n', end) + 1;
    EXPECT_THAT(text.substr(0, end), MatchesRegex(banner));
    return text.substr(end);
  }

  testsupport::WorkingDirectory directory_;
  testsupport::ConsoleCapture console_;
};

TEST_F(TesselBatchMsgManTest, BeginsWithABanner) {
  writeFile(defaultLog, "an earlier log\n");
  TesselBatchMsgMan::installBatchLog("default");
  EXPECT_THAT(readFile(defaultLog), MatchesRegex(banner));
}

TEST_F(TesselBatchMsgManTest, TheNameDefaultCountsInAnyLetterCase) {
  for (const char* name : {"default", "DEFAULT", "DeFaUlT"}) {
    TesselBatchMsgMan::installBatchLog(name);
    say("text\n");
    TesselBatchMsgMan::removeBatchLog();
    EXPECT_EQ(body(), "text\n") << name;
    EXPECT_EQ(testsupport::listDirectory(directory_.path()), std::vector<std::string>{defaultLog});
  }
}

TEST_F(TesselBatchMsgManTest, AnotherNameIsAFile) {
  for (const char* name : {"bench.log", "default.log", "my default"}) {
    TesselBatchMsgMan::installBatchLog(name);
    say("text\n");
    TesselBatchMsgMan::removeBatchLog();
    EXPECT_EQ(body(name), "text\n");
  }
  EXPECT_FALSE(exists(defaultLog));
}

TEST_F(TesselBatchMsgManTest, MessagesAreShownAndLoggedAlike) {
  TesselBatchMsgMan::installBatchLog("default");
  const auto message = Port_MsgManData::createObject("tESSEL", "../s/Test", 1, "");
  message.issueError("No %s\n", "cable");
  message.issueWarning("Loop\n");
  message.issueStatus("Caf\xC3\xA9 \xFF\n");
  Port_MsgManData::debugStub("trace\n");
  EXPECT_EQ(console_.errors(), "ERROR:tESSEL - No cable\nWARNING:tESSEL - Loop\n");
  EXPECT_EQ(console_.output(), "Caf\xC3\xA9 \xFF\n");
  EXPECT_EQ(body(), "ERROR:tESSEL - No cable\nWARNING:tESSEL - Loop\nCaf\xC3\xA9 \xFF\n");
}

struct ShapeRow {
  std::vector<const char*> messages;
  const char* logged;
};

TEST_F(TesselBatchMsgManTest, EveryShapeOfMessageEndsItsLineOnce) {
  const ShapeRow rows[] = {
      {{"one\n", "two\n"}, "one\ntwo\n"},
      {{"one", "two\n"}, "onetwo\n"},
      {{"one\n\n\n", "two\n"}, "one\ntwo\n"},
      {{"one\ntwo"}, "one\ntwo\n"},
      {{"one\n\ntwo\n"}, "one\n\ntwo\n"},
      {{"\n"}, "\n"},
      {{"\n\n\n"}, "\n"},
      {{"\none\n"}, "\none\n"},
      {{""}, ""},
      {{"one"}, "one"},
      {{" 5%\r\f", " 9%\r\f", "done\n"}, " 5%\r\f 9%\r\fdone\n"},
  };
  for (const ShapeRow& row : rows) {
    TesselBatchMsgMan::installBatchLog("default");
    for (const char* text : row.messages) say(text);
    TesselBatchMsgMan::removeBatchLog();
    EXPECT_EQ(body(), row.logged);
  }
}

TEST_F(TesselBatchMsgManTest, AWrappedMessageIsLoggedWithoutItsWrapPoints) {
  TesselBatchMsgMan::installBatchLog("default");
  log().setMaxLineWidth(8);
  say("one two three four\n");
  say("five\nsix seven eight\n");
  EXPECT_EQ(console_.output(), "one two\nthree\nfour\nfive\nsix\nseven\neight\n");
  EXPECT_EQ(body(), "one twothreefour\nfive\nsixseveneight\n");
}

TEST_F(TesselBatchMsgManTest, TheLineWidthStaysInForce) {
  Port_MsgDispatcher::getDefaultMsgMan()->setMaxLineWidth(8);
  TesselBatchMsgMan::installBatchLog("default");
  EXPECT_EQ(log().getMaxLineWidth(), 8);
  log().setMaxLineWidth(9);
  TesselBatchMsgMan::removeBatchLog();
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan()->getMaxLineWidth(), 9);
}

TEST_F(TesselBatchMsgManTest, TheLineWidthStaysInForceWhenInstalledOverItself) {
  TesselBatchMsgMan::installBatchLog("default");
  TesselBatchMsgMan::installBatchLog("default");
  log().setMaxLineWidth(9);
  TesselBatchMsgMan::removeBatchLog();
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan()->getMaxLineWidth(), 9);
}

TEST_F(TesselBatchMsgManTest, TheLogGoesByTheManagersSettings) {
  TesselBatchMsgMan::installBatchLog("default");
  log().setClean(true);
  complain("one\n");
  EXPECT_EQ(console_.errors(), "tESSEL - one\n");
  EXPECT_EQ(body(), "tESSEL - one\n");
}

TEST_F(TesselBatchMsgManTest, ALineReachesTheFileAtOnce) {
  TesselBatchMsgMan::installBatchLog("default");
  say("one\n");
  EXPECT_EQ(body(), "one\n");
}

TEST_F(TesselBatchMsgManTest, TheFreshFlagFallsWithTheFirstMessage) {
  logFreshFlag = 0;
  TesselBatchMsgMan::installBatchLog("default");
  EXPECT_EQ(logFreshFlag, 1);
  say("one\n");
  EXPECT_EQ(logFreshFlag, 0);
}

TEST_F(TesselBatchMsgManTest, StandsInForTheManagerBefore) {
  Port_MsgManDefault* builtIn = Port_MsgDispatcher::getDefaultMsgMan();
  TesselBatchMsgMan::installBatchLog("default");
  EXPECT_NE(Port_MsgDispatcher::getDefaultMsgMan(), builtIn);
  EXPECT_EQ(log().name(), "");
  TesselBatchMsgMan::removeBatchLog();
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), builtIn);
  say("one\n");
  EXPECT_EQ(console_.output(), "one\n");
  EXPECT_EQ(body(), "");
}

/// Counts what it is given.
class Counting : public Port_MsgManDefault {
 public:
  Counting() : Port_MsgManDefault("counting") {}
  void msgWrite(MsgType /*type*/, const wchar_t* /*text*/) override { ++count; }
  int count = 0;
};

TEST_F(TesselBatchMsgManTest, GivesAHostsManagerItsPlaceBack) {
  Counting host;
  Port_MsgDispatcher::addMsgMan(&host);
  TesselBatchMsgMan::installBatchLog("default");
  say("to the log\n");
  EXPECT_EQ(host.count, 0);
  TesselBatchMsgMan::removeBatchLog();
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), &host);
  say("to the host\n");
  EXPECT_EQ(host.count, 1);
  EXPECT_EQ(body(), "to the log\n");
}

TEST_F(TesselBatchMsgManTest, InstalledOverItselfItStays) {
  Port_MsgManDefault* builtIn = Port_MsgDispatcher::getDefaultMsgMan();
  TesselBatchMsgMan::installBatchLog("default");
  const TesselBatchMsgMan* first = &log();
  say("one\n");
  TesselBatchMsgMan::installBatchLog("bench.log");
  EXPECT_EQ(&log(), first);
  EXPECT_FALSE(exists("bench.log"));
  say("two\n");
  TesselBatchMsgMan::installBatchLog("default");
  say("three\n");
  EXPECT_EQ(console_.output(), "one\ntwo\nthree\n");
  TesselBatchMsgMan::removeBatchLog();
  EXPECT_EQ(body(), "one\ntwo\nthree\n");
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), builtIn);
  say("four\n");
  EXPECT_EQ(console_.output(), "one\ntwo\nthree\nfour\n");
  EXPECT_EQ(body(), "one\ntwo\nthree\n");
}

TEST_F(TesselBatchMsgManTest, RemovalOfNothingDoesNothing) {
  TesselBatchMsgMan::removeBatchLog();
  TesselBatchMsgMan::installBatchLog("default");
  TesselBatchMsgMan::removeBatchLog();
  TesselBatchMsgMan::removeBatchLog();
  say("one\n");
  EXPECT_EQ(console_.output(), "one\n");
}

TEST_F(TesselBatchMsgManTest, ALogThatWasNeverInstalledEndsQuietly) {
  EXPECT_EQ(testsupport::runInChild([] { const TesselBatchMsgMan log("bench.log"); }), "exit 0");
}

TEST_F(TesselBatchMsgManTest, ALogThatCantBeWrittenStopsNoMessage) {
  std::filesystem::create_directory("folder");
  for (const char* name : {"missing/bench.log", "folder", "/dev/full"}) {
    TesselBatchMsgMan::installBatchLog(name);
    say("one\n");
    say("two");
    TesselBatchMsgMan::removeBatchLog();
  }
  EXPECT_EQ(console_.output(), "one\ntwoone\ntwoone\ntwo");
  EXPECT_EQ(console_.errors(), "");
}

TEST_F(TesselBatchMsgManTest, TheDefaultLogStaysInTheDirectoryWhereItBegan) {
  std::filesystem::create_directory("sub");
  TesselBatchMsgMan::installBatchLog("default");
  std::filesystem::current_path("sub");
  say("one\n");
  EXPECT_EQ(body(directory_.file(defaultLog)), "one\n");
  EXPECT_FALSE(exists(defaultLog));
}

TEST_F(TesselBatchMsgManTest, ADeepDirectoryIsStillTheCurrentOne) {
  std::string deep = directory_.path();
  for (int i = 0; i < 10; ++i) deep += "/" + std::string(40, 'd');
  std::filesystem::create_directories(deep);
  std::filesystem::current_path(deep);
  TesselBatchMsgMan::installBatchLog("default");
  say("one\n");
  EXPECT_EQ(body(deep + "/" + defaultLog), "one\n");
}

TEST_F(TesselBatchMsgManTest, CopiesToTheUsersLogReplaceItOnceAndThenExtendIt) {
  writeFile(defaultLog, "old\n");
  writeFile("bench.log", "older\n");
  TesselBatchMsgMan::installBatchLog("bench.log");
  say("one\n");
  EXPECT_EQ(body("bench.log"), "one\n");
  log().copyToUserLog();
  EXPECT_EQ(readFile("bench.log"), "old\n");
  EXPECT_EQ(readFile(defaultLog), "");
  say("two\n");
  EXPECT_EQ(readFile(defaultLog), "two\n");
  log().copyToUserLog();
  EXPECT_EQ(readFile("bench.log"), "old\ntwo\n");
  EXPECT_EQ(readFile(defaultLog), "");
  say("three");
  log().copyToUserLog();
  EXPECT_EQ(readFile("bench.log"), "old\ntwo\nthree");
}

TEST_F(TesselBatchMsgManTest, MessagesOfSeveralThreadsAreWholeLines) {
  constexpr int count = 200;
  TesselBatchMsgMan::installBatchLog("default");
  std::vector<std::thread> threads;
  for (const char* text : {"one one one\n", "two two two\n", "three three three\n"})
    threads.emplace_back([text] {
      for (int i = 0; i < count; ++i) say(text);
    });
  for (std::thread& thread : threads) thread.join();
  TesselBatchMsgMan::removeBatchLog();
  std::istringstream lines(body());
  int whole = 0;
  for (std::string line; std::getline(lines, line); ++whole)
    ASSERT_TRUE(line == "one one one" || line == "two two two" || line == "three three three") << line;
  EXPECT_EQ(whole, 3 * count);
}

TEST_F(TesselBatchMsgManTest, AMessageMayComeWhileTheLogIsPutInPlaceOrRemoved) {
  // A Ctrl-C message may come at any time.
  std::atomic<bool> done = false;
  int issued = 0;
  std::thread other([&done, &issued] {
    do {
      say("interrupted\n");
      ++issued;
    } while (!done);
  });
  for (int i = 0; i < 50; ++i) {
    TesselBatchMsgMan::installBatchLog("default");
    TesselBatchMsgMan::installBatchLog("default");
    TesselBatchMsgMan::removeBatchLog();
  }
  done = true;
  other.join();
  const std::string shown = console_.output();
  EXPECT_GE(std::count(shown.begin(), shown.end(), '\n'), issued) << "no message gets lost";
}

}  // namespace
