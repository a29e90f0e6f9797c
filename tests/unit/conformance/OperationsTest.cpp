#include <gtest/gtest.h>

#include "tests/conformance/runner/LineCursor.h"
#include "tests/conformance/runner/Operations.h"

namespace conformance {
namespace {

TEST(Operations, EveryFallbackFitsItsOperation) {
  for (const Operation& operation : operations()) {
    SCOPED_TRACE(operation.name);
    if (operation.answer == Answer::none) {
      EXPECT_EQ("", operation.fallback);
      continue;
    }
    LineCursor cursor(operation.fallback, {"fallback", 1});
    EXPECT_TRUE(fits(operation.answer, cursor.value()));
  }
}

TEST(Operations, EveryRowCanBeFound) {
  for (const Operation& operation : operations())
    EXPECT_EQ(&operation, findOperation(operation.name, operation.arguments)) << operation.name;
}

TEST(Operations, OverloadsAnswerTheSame) {
  for (const Operation& operation : operations())
    EXPECT_EQ(operation.answer, findOperation(operation.name, -1)->answer) << operation.name;
}

TEST(Operations, QuestionsAreLeftOutOfTheTrace) {
  EXPECT_FALSE(isTraced("getDeviceChainCount"));
  EXPECT_FALSE(isTraced("isOptionSet"));
  EXPECT_FALSE(isTraced("string2Attribute"));
  EXPECT_TRUE(isTraced("generate"));
  EXPECT_TRUE(isTraced("setCallbackFunction"));
}

}  // namespace
}  // namespace conformance
