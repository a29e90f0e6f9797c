#include <gtest/gtest.h>

#include <atomic>
#include <functional>
#include <map>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/Port_MsgManData.h"
#include "interfaces/portability/Port_MsgManDefault.h"
#include "tests/unit/support/ConsoleCapture.h"

namespace {

constexpr int threadCount = 4;
constexpr int messageCount = 300;

void issueMessages(int thread) {
  const auto message = Port_MsgManData::createObject("tESSEL", "../s/Test", 1, "");
  for (int i = 0; i < messageCount; ++i) {
    message.issueStatus("status of %d: number %d\n", thread, i);
    message.issueError("error of %d: number %d\n", thread, i);
    Port_MsgManData::debugStub("trace of %d\n", thread);
  }
}

void runThreads(const std::function<void(int)>& body) {
  std::vector<std::thread> threads;
  for (int i = 0; i < threadCount; ++i) threads.emplace_back(body, i);
  for (std::thread& thread : threads) thread.join();
}

/// How often each line stands in a text.
std::map<std::string, int> countLines(const std::string& text) {
  std::map<std::string, int> counts;
  std::istringstream lines(text);
  for (std::string line; std::getline(lines, line);) ++counts[line];
  return counts;
}

std::map<std::string, int> expectedLines(const std::string& start) {
  std::map<std::string, int> counts;
  for (int thread = 0; thread < threadCount; ++thread)
    for (int i = 0; i < messageCount; ++i)
      counts[start + " of " + std::to_string(thread) + ": number " + std::to_string(i)] = 1;
  return counts;
}

TEST(MessageThreads, EveryMessageIsShownWholeAndOnce) {
  const testsupport::ConsoleCapture console;
  runThreads(issueMessages);
  EXPECT_EQ(countLines(console.output()), expectedLines("status"));
  EXPECT_EQ(countLines(console.errors()), expectedLines("ERROR:tESSEL - error"));
}

TEST(MessageThreads, TheObserverIsCalledByOneThreadAtATime) {
  const testsupport::ConsoleCapture console;
  std::map<std::string, int> counts;  // unguarded: the dispatcher guards it
  Port_MsgDispatcher::setObserver([&counts](MsgType /*type*/, const std::string& text) { ++counts[text]; });
  runThreads(issueMessages);
  Port_MsgDispatcher::setObserver({});
  int total = 0;
  for (const auto& [text, count] : counts) total += count;
  EXPECT_EQ(total, threadCount * messageCount * 3);
  EXPECT_EQ(counts["trace of 0\n"], messageCount);
  EXPECT_EQ(counts["error of 3: number 299\n"], 1);
}

/// Notices a call that comes when it is not on the list.
class Watchful : public Port_MsgManDefault {
 public:
  Watchful() : Port_MsgManDefault("watchful") {}
  void msgWrite(MsgType /*type*/, const wchar_t* /*text*/) override {
    if (!onList) ++lateCalls;
    ++calls;
  }
  std::atomic<bool> onList = false;
  std::atomic<int> calls = 0;
  std::atomic<int> lateCalls = 0;
};

TEST(MessageThreads, ManagersComeAndGoWhileMessagesAreIssued) {
  const testsupport::ConsoleCapture console;
  Watchful manager;
  std::atomic<bool> done = false;
  std::thread changing([&manager, &done] {
    do {
      manager.onList = true;
      Port_MsgDispatcher::addMsgMan(&manager);
      std::this_thread::yield();
      Port_MsgDispatcher::removeMsgMan(&manager);
      manager.onList = false;
      EXPECT_NE(Port_MsgDispatcher::getDefaultMsgMan(), nullptr);
    } while (!done);
  });
  runThreads(issueMessages);
  done = true;
  changing.join();
  EXPECT_EQ(manager.lateCalls, 0);
  const auto shown = countLines(console.output()).size() + countLines(console.errors()).size();
  EXPECT_EQ(shown + static_cast<std::size_t>(manager.calls), std::size_t{threadCount} * messageCount * 2);
}

TEST(MessageThreads, ALineWidthMayBeSetWhileAnotherThreadIssuesMessages) {
  // A Ctrl-C message may come at any time, also while the session sets its line width.
  const testsupport::ConsoleCapture console;
  Port_MsgManDefault* manager = Port_MsgDispatcher::getDefaultMsgMan();
  std::thread other(issueMessages, 0);
  for (int i = 0; i < messageCount; ++i) manager->setMaxLineWidth(100 + i % 2);
  other.join();
  manager->setMaxLineWidth(0);
  EXPECT_EQ(countLines(console.output()).size(), std::size_t{messageCount});
}

}  // namespace
