#include <gtest/gtest.h>

#include "interfaces/devicemanager/CallbackFunction.h"
#include "interfaces/devicemanager/DFCallbackFunction.h"
#include "interfaces/devicemanager/DebugTrace.h"

namespace {

bool first(Callback& /*progress*/) { return false; }
bool second(Callback& /*progress*/) { return true; }

TEST(ValueClasses, HaveTheSizeThatHostsCountOn) {
  EXPECT_EQ(sizeof(DebugTrace), 1U);
  EXPECT_EQ(sizeof(CallbackFunction), 2 * sizeof(void*));
  EXPECT_EQ(sizeof(DFCallbackFunction), sizeof(void*));
}

TEST(ValueClasses, BeginEmpty) {
  EXPECT_FALSE(DebugTrace().on());
  EXPECT_EQ(CallbackFunction().function(), nullptr);
  EXPECT_EQ(CallbackFunction().context(), nullptr);
  EXPECT_EQ(DFCallbackFunction().function(), nullptr);
}

TEST(ValueClasses, AssignmentCopiesEveryFieldAndGivesTheObject) {
  DebugTrace trace;
  EXPECT_EQ(&(trace = DebugTrace(true)), &trace);
  EXPECT_TRUE(trace.on());
  EXPECT_EQ(&(trace = DebugTrace(false)), &trace);
  EXPECT_FALSE(trace.on());

  int context = 0;
  CallbackFunction callback(first, nullptr);
  EXPECT_EQ(&(callback = CallbackFunction(second, &context)), &callback);
  EXPECT_EQ(callback.function(), &second);
  EXPECT_EQ(callback.context(), &context);

  DFCallbackFunction plain(first);
  EXPECT_EQ(&(plain = DFCallbackFunction(second)), &plain);
  EXPECT_EQ(plain.function(), &second);
}

TEST(ValueClasses, AssignmentToItselfChangesNothing) {
  int context = 0;
  CallbackFunction callback(first, &context);
  const CallbackFunction& itself = callback;
  callback = itself;
  EXPECT_EQ(callback.function(), &first);
  EXPECT_EQ(callback.context(), &context);
}

TEST(ValueClasses, AssignmentCanBeChained) {
  DFCallbackFunction a;
  DFCallbackFunction b;
  a = b = DFCallbackFunction(first);
  EXPECT_EQ(a.function(), &first);
  EXPECT_EQ(b.function(), &first);
}

}  // namespace
