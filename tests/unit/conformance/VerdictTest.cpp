#include <gtest/gtest.h>

#include "tests/conformance/runner/CaseFile.h"
#include "tests/conformance/runner/Diff.h"
#include "tests/conformance/runner/FileChecks.h"
#include "tests/conformance/runner/Verdict.h"

namespace conformance {
namespace {

Case expecting(const std::string& lines) { return parseCases("test.case", "case \"c\"\nexpect\n" + lines).at(0); }

/// The outcome of a case that did what these lines say.
Outcome outcome(const std::string& events, std::vector<std::string> checkLines = {}) {
  return {expecting(events).events, std::move(checkLines), {}};
}

TEST(Verdict, EqualTracesPass) {
  const Verdict verdict = judge(expecting("status \"a\"\nresult true\n"), outcome("status \"a\"\nresult true\n"));
  EXPECT_TRUE(verdict.passed);
  EXPECT_EQ("", verdict.details);
}

TEST(Verdict, AStarInACheckMatchesAnyValueOfThatCheck) {
  const std::string checks = "transcript *\nenvironment A *\nflag repeatCount *\n";
  EXPECT_TRUE(
      judge(expecting(checks), outcome("", {"transcript \"x\"", "environment A null", "flag repeatCount 3"})).passed);
  EXPECT_FALSE(
      judge(expecting(checks), outcome("", {"transcript \"x\"", "environment B null", "flag repeatCount 3"})).passed);
}

TEST(Verdict, ADifferenceIsShownSideBySide) {
  const Verdict verdict = judge(expecting("status *\ncall lockCable(5) -> true\nresult true\n"),
                                outcome("status \"a\"\ncall lockCable(4) -> true\nresult true\n"));
  EXPECT_FALSE(verdict.passed);
  EXPECT_EQ(
      "# test.case:1\n"
      "--- expected\n"
      "+++ actual\n"
      "@@ -1,3 +1,3 @@\n"
      " status *\n"
      "-call lockCable(5) -> true\n"
      "+call lockCable(4) -> true\n"
      " result true\n",
      verdict.details);
}

struct Pair {
  const char* expected;
  const char* actual;
  bool passes;
};

class EventPair : public testing::TestWithParam<Pair> {};

TEST_P(EventPair, IsJudged) {
  EXPECT_EQ(GetParam().passes, judge(expecting(GetParam().expected), outcome(GetParam().actual)).passed);
}

constexpr Pair pairs[] = {
    {"", "", true},
    {"error *\n", "error \"x\"\n", true},
    {"error *\n", "warning \"x\"\n", false},
    {"error *\n", "error \"x\"\nerror \"x\"\n", false},
    {"error *\nerror *\n", "error \"x\"\n", false},
    {"error \"x\\n\"\n", "error \"x\"\n", false},
    {"result *\n", "result false\n", true},
    {"call lockCable(*) -> *\n", "call lockCable(5) -> false\n", true},
    {"call lockCable(5) -> true\n", "call lockCable(5) -> throw InvalidArgumentException\n", false},
    {"call info() -> *\n", "call runDiagnostics() -> true\n", false},
    {"stdout \"a\"\nstdout \"b\"\n", "stdout \"b\"\nstdout \"a\"\n", false},
    // What follows the teardown counts only where the case names it.
    {"result true\n", "result true\nteardown\ncall unlockCable() -> true\n", true},
    {"result true\nteardown\n", "result true\nteardown\ncall unlockCable() -> true\n", false},
    {"result true\nteardown\n", "result true\n", false},
    {"result true\n", "result true\nteardown\nabort\n", false},
    {"abort\n", "abort\n", true},
};
INSTANTIATE_TEST_SUITE_P(Verdict, EventPair, testing::ValuesIn(pairs));

TEST(Verdict, ChecksAreCompared) {
  const Case script = expecting("flag modeSet true\nabsent a\n");
  EXPECT_TRUE(judge(script, outcome("", {"flag modeSet true", "absent a"})).passed);
  EXPECT_FALSE(judge(script, outcome("", {"flag modeSet false", "absent a"})).passed);
  EXPECT_FALSE(judge(script, outcome("", {"flag modeSet true", "present a"})).passed);
  EXPECT_FALSE(judge(script, outcome("", {"absent a"})).passed);
}

TEST(Verdict, AStarStandsForAnyOneFileLine) {
  const Case script = expecting("text f\n| a\n| *\n");
  EXPECT_TRUE(judge(script, outcome("", {"text f", "| a", "| b"})).passed);
  EXPECT_FALSE(judge(script, outcome("", {"text f", "| a"})).passed);
  EXPECT_FALSE(judge(script, outcome("", {"text f", "| a", "| b", "| c"})).passed);
  EXPECT_FALSE(judge(script, outcome("", {"text f", "| a", "| b", "|\\"})).passed);
  EXPECT_FALSE(judge(script, outcome("", {"text f", "| *", "| b"})).passed);
}

TEST(Verdict, AFailureOfTheProcessIsNeverGood) {
  Outcome broken = outcome("result true\n");
  broken.failures.emplace_back("the process was ended by signal 11");
  const Verdict verdict = judge(expecting("result true\n"), broken);
  EXPECT_FALSE(verdict.passed);
  EXPECT_EQ("# test.case:1\n# the process was ended by signal 11\n", verdict.details);
}

TEST(Verdict, TheTraceIsACaseToStartFrom) {
  const std::string events = "status \"a\"\nresult true\nteardown\ncall removeDeviceManager()\n";
  EXPECT_EQ("case \"c\"\n  expect\n  status \"a\"\n  result true\n  teardown\n  call removeDeviceManager()\n",
            renderTrace(expecting(""), outcome(events)));
}

TEST(FileChecks, AFileIsItsLines) {
  using Lines = std::vector<std::string>;
  EXPECT_EQ(Lines(), renderFileText(""));
  EXPECT_EQ((Lines{"| a", "| b"}), renderFileText("a\nb\n"));
  EXPECT_EQ((Lines{"| a", "| b", "|\\"}), renderFileText("a\nb"));
  EXPECT_EQ((Lines{"| "}), renderFileText("\n"));
}

std::vector<TraceLine> numbered(int from, int to) {
  std::vector<TraceLine> lines;
  for (int i = from; i <= to; ++i) lines.push_back({std::to_string(i), std::nullopt, false});
  return lines;
}

TEST(Diff, ShowsChangesFarApartInHunksOfTheirOwn) {
  std::vector<TraceLine> actual = numbered(1, 20);
  actual[1].text = "x";
  actual.erase(actual.begin() + 17);
  EXPECT_EQ(
      "--- expected\n+++ actual\n"
      "@@ -1,5 +1,5 @@\n 1\n-2\n+x\n 3\n 4\n 5\n"
      "@@ -15,6 +15,5 @@\n 15\n 16\n 17\n-18\n 19\n 20\n",
      unifiedDiff(numbered(1, 20), actual));
}

TEST(Diff, AlignsWhatStayedEqual) {
  EXPECT_EQ("--- expected\n+++ actual\n@@ -1,3 +1,3 @@\n-1\n 2\n 3\n+4\n", unifiedDiff(numbered(1, 3), numbered(2, 4)));
}

TEST(Diff, AnEmptySideHasNoLines) {
  EXPECT_EQ("--- expected\n+++ actual\n@@ -0,0 +1,1 @@\n+1\n", unifiedDiff({}, numbered(1, 1)));
  EXPECT_EQ("", unifiedDiff({}, {}));
}

TEST(Diff, IsCutWhereNobodyWouldReadOn) {
  const std::string diff = unifiedDiff({}, numbered(1, 5000));
  EXPECT_NE(std::string::npos, diff.find("# 4003 more lines of the diff are left out\n"));
  EXPECT_LT(diff.size(), 10000U);
}

}  // namespace
}  // namespace conformance
