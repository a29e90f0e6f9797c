#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/Port_MsgManData.h"
#include "interfaces/portability/Port_MsgManDefault.h"
#include "interfaces/portability/UT_STR.h"
#include "tests/unit/support/RecordedMessages.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::ConsoleCapture;
using testsupport::Message;
using testsupport::RecordedMessages;

/// Keeps what it is given.
class Recorder : public Port_MsgManDefault {
 public:
  explicit Recorder(const char* name = nullptr) : Port_MsgManDefault(name) {}
  void msgWrite(MsgType type, const wchar_t* text) override { messages.push_back({type, UT_STR::WstrToMbstr(text)}); }
  std::vector<Message> messages;
};

Port_MsgManData message() { return Port_MsgManData::createObject("tESSEL", "../s/Test", 7, "rev"); }

void say(const char* text) { Port_MsgDispatcher::dispatch(MsgType::status, "tESSEL", text); }

class Port_MsgDispatcherTest : public testing::Test {
 protected:
  ConsoleCapture console_;
};

TEST_F(Port_MsgDispatcherTest, WithAnEmptyListMessagesAppearOnTheConsole) {
  message().issueError("Design %d does not exist.\n", 3);
  message().issueWarning("Missing %s\n", "repeatEnd");
  message().issueStatus("%s\n", StringBase("done"));
  EXPECT_EQ(console_.errors(), "ERROR:tESSEL - Design 3 does not exist.\nWARNING:tESSEL - Missing repeatEnd\n");
  EXPECT_EQ(console_.output(), "done\n");
}

TEST_F(Port_MsgDispatcherTest, AMessageKnowsWhereItComesFrom) {
  EXPECT_STREQ(message().sourceFile(), "../s/Test");
  EXPECT_EQ(message().line(), 7);
  EXPECT_STREQ(message().revision(), "rev");
}

TEST_F(Port_MsgDispatcherTest, DebugTracesAreNotShown) {
  Recorder recorder;
  Port_MsgManData::debugStub("unseen %d\n", 1);
  Port_MsgDispatcher::addMsgMan(&recorder);
  Port_MsgManData::debugStub("unseen %d\n", 2);
  Port_MsgDispatcher::dispatch(MsgType::debug, "tESSEL", "unseen 3\n");
  EXPECT_THAT(recorder.messages, IsEmpty());
  EXPECT_EQ(console_.output() + console_.errors(), "");
}

TEST_F(Port_MsgDispatcherTest, ManagersOnTheListGetTheTaggedText) {
  Recorder recorder;
  Port_MsgDispatcher::addMsgMan(&recorder);
  message().issueError("a\n");
  message().issueWarning("b\n");
  message().issueStatus("c %%\n");
  EXPECT_THAT(recorder.messages, ElementsAre(testsupport::error("tESSEL - a\n"), testsupport::warning("tESSEL - b\n"),
                                             testsupport::status("c %\n")));
  EXPECT_EQ(console_.output() + console_.errors(), "");
}

TEST_F(Port_MsgDispatcherTest, TheListCounts) {
  Recorder recorder;
  Port_MsgDispatcher::addMsgMan(&recorder);
  Port_MsgDispatcher::addMsgMan(&recorder);
  say("once\n");
  EXPECT_THAT(recorder.messages, ElementsAre(testsupport::status("once\n")));
  Port_MsgDispatcher::removeMsgMan(&recorder);
  say("still\n");
  EXPECT_EQ(recorder.messages.size(), 2U);
  Port_MsgDispatcher::removeMsgMan(&recorder);
  say("gone\n");
  EXPECT_EQ(recorder.messages.size(), 2U);
  EXPECT_EQ(console_.output(), "gone\n");
}

TEST_F(Port_MsgDispatcherTest, ForgetTakesAManagerOffHoweverOftenItWasAdded) {
  Recorder recorder;
  for (int i = 0; i < 3; ++i) Port_MsgDispatcher::addMsgMan(&recorder);
  Port_MsgDispatcher::forget(&recorder);
  say("gone\n");
  EXPECT_THAT(recorder.messages, IsEmpty());
  Port_MsgDispatcher::forget(&recorder);
  EXPECT_EQ(console_.output(), "gone\n");
}

TEST_F(Port_MsgDispatcherTest, ADestroyedManagerIsOffTheList) {
  {
    Recorder recorder;
    Port_MsgDispatcher::addMsgMan(&recorder);
    Port_MsgDispatcher::addMsgMan(&recorder);
  }
  say("alone\n");
  EXPECT_EQ(console_.output(), "alone\n");
}

TEST_F(Port_MsgDispatcherTest, TheFirstOnTheListIsInCharge) {
  Port_MsgManDefault* builtIn = Port_MsgDispatcher::getDefaultMsgMan();
  ASSERT_NE(builtIn, nullptr);
  EXPECT_EQ(builtIn->name(), "console");
  Recorder first("first");
  Recorder second("second");
  Port_MsgDispatcher::addMsgMan(&first);
  Port_MsgDispatcher::addMsgMan(&second);
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), &first);
  say("both\n");
  EXPECT_EQ(first.messages.size(), 1U);
  EXPECT_EQ(second.messages.size(), 1U);
  Port_MsgDispatcher::removeMsgMan(&first);
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), &second);
  Port_MsgDispatcher::removeMsgMan(&second);
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), builtIn);
}

TEST_F(Port_MsgDispatcherTest, AManagerCanStandInForTheOneInCharge) {
  Recorder former;
  Port_MsgDispatcher::addMsgMan(&former);
  {
    Recorder guest;
    Port_MsgManDefault* saved = Port_MsgDispatcher::getDefaultMsgMan();
    Port_MsgDispatcher::addMsgMan(&guest);
    Port_MsgDispatcher::removeMsgMan(saved);
    say("to the guest\n");
    Port_MsgDispatcher::addMsgMan(saved);
    Port_MsgDispatcher::removeMsgMan(&guest);
    EXPECT_THAT(guest.messages, ElementsAre(testsupport::status("to the guest\n")));
  }
  say("to the former\n");
  EXPECT_THAT(former.messages, ElementsAre(testsupport::status("to the former\n")));
}

TEST_F(Port_MsgDispatcherTest, TheBuiltInManagerGivenBackLeavesTheListEmpty) {
  Recorder guest;
  Port_MsgManDefault* saved = Port_MsgDispatcher::getDefaultMsgMan();
  Port_MsgDispatcher::addMsgMan(&guest);
  Port_MsgDispatcher::removeMsgMan(saved);
  Port_MsgDispatcher::addMsgMan(saved);
  Port_MsgDispatcher::removeMsgMan(&guest);
  say("shown once\n");
  EXPECT_EQ(console_.output(), "shown once\n");
  EXPECT_THAT(guest.messages, IsEmpty());
  Recorder next;
  Port_MsgDispatcher::addMsgMan(&next);
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), &next);
}

TEST_F(Port_MsgDispatcherTest, NullIsNoManager) {
  Port_MsgDispatcher::addMsgMan(nullptr);
  Port_MsgDispatcher::removeMsgMan(nullptr);
  Port_MsgDispatcher::forget(nullptr);
  say("shown\n");
  EXPECT_EQ(console_.output(), "shown\n");
}

/// Takes another manager off the list while it gets a message itself.
class Remover : public Port_MsgManDefault {
 public:
  explicit Remover(Port_MsgManDefault& other) : Port_MsgManDefault("remover"), other_(other) {}
  void msgWrite(MsgType /*type*/, const wchar_t* /*text*/) override { Port_MsgDispatcher::removeMsgMan(&other_); }

 private:
  Port_MsgManDefault& other_;
};

TEST_F(Port_MsgDispatcherTest, AManagerIsNotCalledAfterItsRemovalHasReturned) {
  Recorder victim;
  Remover remover(victim);
  Port_MsgDispatcher::addMsgMan(&remover);
  Port_MsgDispatcher::addMsgMan(&victim);
  say("too late\n");
  EXPECT_THAT(victim.messages, IsEmpty());
}

/// Answers a message with one of its own.
class Answering : public Recorder {
 public:
  void msgWrite(MsgType type, const wchar_t* text) override {
    Recorder::msgWrite(type, text);
    if (messages.size() == 1) say("answer\n");
  }
};

TEST_F(Port_MsgDispatcherTest, AManagerMayIssueMessages) {
  Answering manager;
  Port_MsgDispatcher::addMsgMan(&manager);
  say("question\n");
  EXPECT_THAT(manager.messages, ElementsAre(testsupport::status("question\n"), testsupport::status("answer\n")));
}

TEST_F(Port_MsgDispatcherTest, TheObserverSeesTheBareTextFirst) {
  std::vector<std::string> order;
  class Last : public Port_MsgManDefault {
   public:
    explicit Last(std::vector<std::string>& list) : Port_MsgManDefault(nullptr), list_(list) {}
    void msgWrite(MsgType /*type*/, const wchar_t* text) override { list_.push_back(UT_STR::WstrToMbstr(text)); }

   private:
    std::vector<std::string>& list_;
  } manager(order);
  Port_MsgDispatcher::addMsgMan(&manager);
  EXPECT_FALSE(Port_MsgDispatcher::hasObserver());
  Port_MsgDispatcher::setObserver([&order](MsgType /*type*/, const std::string& text) { order.push_back(text); });
  EXPECT_TRUE(Port_MsgDispatcher::hasObserver());
  message().issueError("text\n");
  Port_MsgDispatcher::setObserver({});
  EXPECT_FALSE(Port_MsgDispatcher::hasObserver());
  message().issueError("unobserved\n");
  EXPECT_THAT(order, ElementsAre("text\n", "tESSEL - text\n", "tESSEL - unobserved\n"));
}

TEST_F(Port_MsgDispatcherTest, TheObserverSeesEveryKind) {
  RecordedMessages messages;
  message().issueError("%s\n", "a");
  message().issueWarning("b\n");
  message().issueStatus("c");
  Port_MsgManData::debugStub("d %d\n", 4);
  EXPECT_THAT(messages.all(), ElementsAre(testsupport::error("a\n"), testsupport::warning("b\n"),
                                          testsupport::status("c"), testsupport::debug("d 4\n")));
}

}  // namespace
