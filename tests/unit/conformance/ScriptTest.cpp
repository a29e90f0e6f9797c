#include <gtest/gtest.h>

#include "tests/conformance/runner/CaseFile.h"
#include "tests/conformance/runner/Script.h"

namespace conformance {
namespace {

/// A script of set-up lines.
class Scripted {
 public:
  explicit Scripted(const std::string& lines)
      : case_(parseCases("test.case", "case \"c\"\n" + lines + "expect\n").at(0)),
        script_(case_.givens, case_.durings) {}

  Script::Turn next(const std::string& call) {
    LineCursor cursor(call, {"call", 1});
    const std::string name = cursor.name("a name");
    cursor.require("(");
    return script_.next(name, cursor.valuesUpTo(")"));
  }
  /// The answer to a call, empty when the case gives none.
  std::string answer(const std::string& call) {
    const Script::Turn turn = next(call);
    return turn.answer == nullptr ? "" : render(*turn.answer);
  }

 private:
  Case case_;
  Script script_;
};

TEST(Script, ACallWithoutAGivenLineHasNoAnswer) {
  Scripted script("given getMode -> 1\n");
  EXPECT_EQ("", script.answer("getActiveMode()"));
  EXPECT_EQ("1", script.answer("getMode()"));
}

TEST(Script, TheLastMatchingGivenLineWins) {
  Scripted script(
      "given getMode -> 1\n"
      "given getMode -> 2\n"
      "given setMode -> false\n"
      "given setMode(0, *) -> true\n");
  EXPECT_EQ("2", script.answer("getMode()"));
  EXPECT_EQ("true", script.answer("setMode(0, true)"));
  EXPECT_EQ("false", script.answer("setMode(1, true)"));
}

TEST(Script, AnEarlierLineAnswersWhereTheLastDoesNotMatch) {
  Scripted script("given lockCable@2 -> false\ngiven lockCable(4) -> false\n");
  EXPECT_EQ("", script.answer("lockCable(5)"));
  EXPECT_EQ("false", script.answer("lockCable(5)"));
  EXPECT_EQ("", script.answer("lockCable(5)"));
  EXPECT_EQ("false", script.answer("lockCable(4)"));
}

TEST(Script, EachLineCountsTheCallsThatItsPatternMatches) {
  Scripted script("given setMode(1, *)@2 -> false\n");
  EXPECT_EQ("", script.answer("setMode(1, true)"));
  EXPECT_EQ("", script.answer("setMode(0, true)"));
  EXPECT_EQ("false", script.answer("setMode(1, false)"));
  EXPECT_EQ("", script.answer("setMode(1, true)"));
}

TEST(Script, ACallIsCountedAlsoWhenAnotherLineAnswersIt) {
  Scripted script("given getMode@2 -> 2\ngiven getMode@1 -> 1\n");
  EXPECT_EQ("1", script.answer("getMode()"));
  EXPECT_EQ("2", script.answer("getMode()"));
}

TEST(Script, HappeningsComeInTheOrderOfTheirLines) {
  Scripted script(
      "during info progress 0 1 2\n"
      "during getMode console-event 0\n"
      "during info@1 console-event 2\n"
      "during info progress 1 1 2\n");
  const Script::Turn first = script.next("info()");
  ASSERT_EQ(3U, first.happenings.size());
  EXPECT_EQ(0, first.happenings[0]->progress[0]);
  EXPECT_EQ(During::Kind::consoleEvent, first.happenings[1]->kind);
  EXPECT_EQ(1, first.happenings[2]->progress[0]);
  EXPECT_EQ(2U, script.next("info()").happenings.size());
}

}  // namespace
}  // namespace conformance
