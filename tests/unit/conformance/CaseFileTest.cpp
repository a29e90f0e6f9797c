#include <gtest/gtest.h>

#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "tests/conformance/runner/CaseFile.h"

namespace conformance {
namespace {

/// The only case of a text that holds one.
Case only(const std::string& text) {
  std::vector<Case> cases = parseCases("test.case", text);
  EXPECT_EQ(1U, cases.size());
  return cases.at(0);
}

std::string errorOf(const std::string& text) {
  try {
    parseCases("test.case", text);
  } catch (const CaseError& error) {
    return error.what();
  }
  return "no error";
}

TEST(CaseFile, ReadsSeveralCases) {
  const std::vector<Case> cases = parseCases("test.case",
                                             "# a comment\n"
                                             "case \"one\"\n"
                                             "  expect\n"
                                             "\n"
                                             "  result true\n"
                                             "case \"two\"\n"
                                             "  expect\n");
  ASSERT_EQ(2U, cases.size());
  EXPECT_EQ("one", cases[0].title);
  EXPECT_EQ(2, cases[0].line);
  EXPECT_EQ(1U, cases[0].events.size());
  EXPECT_EQ("two", cases[1].title);
  EXPECT_EQ("test.case", cases[1].file);
  EXPECT_TRUE(cases[1].events.empty());
}

TEST(CaseFile, AnEmptyFileHoldsNoCase) { EXPECT_TRUE(parseCases("test.case", "").empty()); }

TEST(CaseFile, ReadsSurroundings) {
  const Case script = only(
      "case \"c\"\n"
      "  env A=b c\n"
      "  env EMPTY=\n"
      "  env Q=\"x\\n\"\n"
      "  dir d/e\n"
      "  file f\n"
      "  file \"g h\" \"text\\n\"\n"
      "  batchlog on\n"
      "  accept nose\n"
      "  expect\n");
  using Pairs = std::vector<std::pair<std::string, std::string>>;
  EXPECT_EQ((Pairs{{"A", "b c"}, {"EMPTY", ""}, {"Q", "x\n"}}), script.environment);
  ASSERT_EQ(3U, script.fixtures.size());
  EXPECT_TRUE(script.fixtures[0].directory);
  EXPECT_EQ("d/e", script.fixtures[0].path);
  EXPECT_FALSE(script.fixtures[1].directory);
  EXPECT_EQ("", script.fixtures[1].text);
  EXPECT_EQ("g h", script.fixtures[2].path);
  EXPECT_EQ("text\n", script.fixtures[2].text);
  EXPECT_TRUE(script.batchLog);
  EXPECT_EQ(std::vector<std::string>{"nose"}, script.acceptedWords);
}

TEST(CaseFile, TheBatchLogIsOffUnlessAsked) { EXPECT_FALSE(only("case \"c\"\nexpect\n").batchLog); }

TEST(CaseFile, RunLinesKeepAllButOneBlank) {
  const Case script = only("case \"c\"\n  >   two blanks  \n  >\n  > # no comment\n  < in\n  expect\n");
  ASSERT_EQ(1U, script.runs.size());
  EXPECT_EQ(Run::Kind::file, script.runs[0].kind);
  EXPECT_EQ((std::vector<std::string>{"  two blanks  ", "", "# no comment"}), script.runs[0].commands);
  EXPECT_EQ(std::vector<std::string>{"in"}, script.runs[0].input);
}

TEST(CaseFile, RunsAreSeparatedAndEmptyOnesDropped) {
  const Case script = only(
      "case \"c\"\n"
      "  run\n"
      "  < console\n"
      "  run\n"
      "  run\n"
      "  > file\n"
      "  run-missing \"no file\"\n"
      "  run\n"
      "  expect\n");
  ASSERT_EQ(3U, script.runs.size());
  EXPECT_EQ(Run::Kind::console, script.runs[0].kind);
  EXPECT_EQ(Run::Kind::file, script.runs[1].kind);
  EXPECT_EQ(Run::Kind::missing, script.runs[2].kind);
  EXPECT_EQ("no file", script.runs[2].path);
}

TEST(CaseFile, ReadsCallPatterns) {
  const Case script = only(
      "case \"c\"\n"
      "  given getMode -> 7\n"
      "  given setMode(0, *)@2 -> false\n"
      "  given getProgramOptions(0, 1, false) -> [\"-e\", \"\"]\n"
      "  given getTargetDevice -> (0, 2, true)\n"
      "  given createModeInterface -> null\n"
      "  given addPromDevice2PromChain -> throw ACDEntryNotFoundException\n"
      "  during performOperation@3 progress 2 5 -10\n"
      "  during getMode console-event 2\n"
      "  expect\n");
  ASSERT_EQ(6U, script.givens.size());
  EXPECT_FALSE(script.givens[0].call.arguments.has_value());
  EXPECT_EQ(0, script.givens[0].call.occurrence);
  EXPECT_EQ("7", render(script.givens[0].answer));
  EXPECT_EQ("0, *", renderList(script.givens[1].call.arguments.value()));
  EXPECT_EQ(2, script.givens[1].call.occurrence);
  EXPECT_EQ("[\"-e\", \"\"]", render(script.givens[2].answer));
  EXPECT_EQ("(0, 2, true)", render(script.givens[3].answer));
  EXPECT_EQ("throw ACDEntryNotFoundException", render(script.givens[5].answer));
  ASSERT_EQ(2U, script.durings.size());
  EXPECT_EQ((std::array<std::int32_t, 3>{2, 5, -10}), script.durings[0].progress);
  EXPECT_EQ(3, script.durings[0].call.occurrence);
  EXPECT_EQ(During::Kind::consoleEvent, script.durings[1].kind);
  EXPECT_EQ(2U, script.durings[1].consoleEvent);
}

TEST(CaseFile, ReadsInvocations) {
  const Case script = only(
      "case \"c\"\n invoke forceUnlockCable\n invoke signalHandler SIGTERM\n"
      " invoke signalHandler 99\n expect\n");
  ASSERT_EQ(3U, script.invocations.size());
  EXPECT_EQ(Invocation::Function::forceUnlockCable, script.invocations[0].function);
  EXPECT_EQ(SIGTERM, script.invocations[1].signal);
  EXPECT_EQ(99, script.invocations[2].signal);
}

TEST(CaseFile, ReadsChecks) {
  const Case script = only(
      "case \"c\"\n"
      "  expect\n"
      "  result true\n"
      "  flag modeSet true\n"
      "  flag repeatCount -3\n"
      "  transcript \"a\\n\"\n"
      "  environment A null\n"
      "  environment B \"b\"\n"
      "  absent gone\n"
      "  text empty\n"
      "  text file.log\n"
      "  | first\n"
      "\n"
      "  | *\n"
      "  |\n"
      "  |   last\n"
      "  |\\\n");
  ASSERT_EQ(8U, script.checks.size());
  EXPECT_EQ("flag modeSet true", renderCheck(script.checks[0], script.checks[0].value));
  EXPECT_EQ("flag repeatCount -3", renderCheck(script.checks[1], script.checks[1].value));
  EXPECT_EQ("transcript \"a\\n\"", renderCheck(script.checks[2], script.checks[2].value));
  EXPECT_EQ("environment A null", renderCheck(script.checks[3], script.checks[3].value));
  EXPECT_EQ("environment B \"b\"", renderCheck(script.checks[4], script.checks[4].value));
  EXPECT_EQ("absent gone", renderCheck(script.checks[5], script.checks[5].value));
  EXPECT_TRUE(script.checks[6].lines.empty());
  EXPECT_EQ((std::vector<std::string>{"first", "*", "", "  last"}), script.checks[7].lines);
  EXPECT_TRUE(script.checks[7].openEnd);
}

struct BadCase {
  const char* text;
  const char* error;
};

class BadCaseFile : public testing::TestWithParam<BadCase> {};

TEST_P(BadCaseFile, IsRefusedWithItsLine) { EXPECT_EQ(GetParam().error, errorOf(GetParam().text)); }

constexpr BadCase badStructure[] = {
    {"given getMode -> 1\n", "test.case:1: expected 'case' first"},
    {"> quit\n", "test.case:1: expected 'case' first"},
    {"case title\n", "test.case:1: expected '\"' at 'title'"},
    {"case \"c\n", "test.case:1: the quoted text is not closed"},
    {"case \"c\" d\n", "test.case:1: unexpected 'd' at the end of the line"},
    {"\n# x\ncase \"c\"\n> quit\n", "test.case:3: the case has no 'expect'"},
    {"case \"c\"\ncase \"d\"\nexpect\n", "test.case:1: the case has no 'expect'"},
    {"case \"c\"\nexpect\nexpect\n", "test.case:3: unknown event or check 'expect'"},
    {"case \"c\"\nexpect\ngiven getMode -> 1\n", "test.case:3: unknown event or check 'given'"},
    {"case \"c\"\nexpect\n> quit\n", "test.case:3: a '>' line cannot stand here"},
    {"case \"c\"\n| x\n", "test.case:2: a '|' line cannot stand here"},
    {"case \"c\"\n>quit\n", "test.case:2: a blank must follow '>'"},
    {"case \"c\"\nresult true\n", "test.case:2: unknown set-up word 'result'"},
};
INSTANTIATE_TEST_SUITE_P(Structure, BadCaseFile, testing::ValuesIn(badStructure));

constexpr BadCase badSetup[] = {
    {"case \"c\"\ngivn getMode -> 1\n", "test.case:2: unknown set-up word 'givn'"},
    {"case \"c\"\ngiven getMod -> 1\n", "test.case:2: unknown call 'getMod'"},
    {"case \"c\"\ngiven getMode\n", "test.case:2: expected '->' at ''"},
    {"case \"c\"\ngiven getMode -> true\n", "test.case:2: 'getMode' cannot answer 'true'"},
    {"case \"c\"\ngiven setMode -> 1\n", "test.case:2: 'setMode' cannot answer '1'"},
    {"case \"c\"\ngiven setMode -> *\n", "test.case:2: 'setMode' cannot answer '*'"},
    {"case \"c\"\ngiven setTargetDevice -> true\n", "test.case:2: 'setTargetDevice' cannot answer 'true'"},
    {"case \"c\"\ngiven getTargetDevice -> (9, -1)\n", "test.case:2: 'getTargetDevice' cannot answer '(9, -1)'"},
    {"case \"c\"\ngiven getEraseOptions -> [1]\n", "test.case:2: 'getEraseOptions' cannot answer '[1]'"},
    {"case \"c\"\ngiven setMode -> throw Nothing\n", "test.case:2: unknown exception 'Nothing'"},
    {"case \"c\"\ngiven setMode(0) -> true\n", "test.case:2: wrong number of arguments for 'setMode'"},
    {"case \"c\"\ngiven setMode@0 -> true\n", "test.case:2: calls are counted from 1"},
    {"case \"c\"\ngiven getMode -> 1 2\n", "test.case:2: unexpected '2' at the end of the line"},
    {"case \"c\"\nduring setMode progress 1 2\n", "test.case:2: expected a number"},
    {"case \"c\"\nduring setMode progress 1 2 2147483648\n", "test.case:2: the number 2147483648 is out of range"},
    {"case \"c\"\nduring setMode event 1\n", "test.case:2: expected 'progress' or 'console-event' instead of 'event'"},
    {"case \"c\"\nbatchlog off\n", "test.case:2: expected 'on' at 'off'"},
    {"case \"c\"\nenv A\n", "test.case:2: expected '=' at ''"},
    {"case \"c\"\nfile ../x\n", "test.case:2: '../x' is no path inside the working directory"},
    {"case \"c\"\ndir /x\n", "test.case:2: '/x' is no path inside the working directory"},
    {"case \"c\"\n> quit\nrun\nfile x\n", "test.case:4: files and directories must stand before the first 'run'"},
    {"case \"c\"\ninvoke abort\n", "test.case:2: unknown function 'abort'"},
    {"case \"c\"\ninvoke signalHandler SIGFOO\n", "test.case:2: unknown signal 'SIGFOO'"},
};
INSTANTIATE_TEST_SUITE_P(Setup, BadCaseFile, testing::ValuesIn(badSetup));

constexpr BadCase badExpectations[] = {
    {"case \"c\"\nexpect\nfoo\n", "test.case:3: unknown event or check 'foo'"},
    {"case \"c\"\nexpect\ncall setMod(0) -> true\n", "test.case:3: unknown call 'setMod'"},
    {"case \"c\"\nexpect\ncall getMode() -> 9\n", "test.case:3: the call 'getMode' is left out of the trace"},
    {"case \"c\"\nexpect\ncall setMode(*) -> true\n", "test.case:3: wrong number of arguments for 'setMode'"},
    {"case \"c\"\nexpect\ncall info()\n", "test.case:3: the result of 'info' is missing ('-> VALUE')"},
    {"case \"c\"\nexpect\ncall info() -> 1\n", "test.case:3: 'info' cannot answer '1'"},
    {"case \"c\"\nexpect\ncall setBatchCommandOn() -> true\n", "test.case:3: 'setBatchCommandOn' cannot answer 'true'"},
    {"case \"c\"\nexpect\ncall lockCable((1)) -> true\n", "test.case:3: '(1)' is no argument"},
    {"case \"c\"\nexpect\ncall lockCable(5x) -> true\n", "test.case:3: malformed number"},
    {"case \"c\"\nexpect\ncall lockCable(five) -> true\n", "test.case:3: unknown value 'five'"},
    {"case \"c\"\nexpect\nerror text\n", "test.case:3: expected '\"' at 'text'"},
    {"case \"c\"\nexpect\nerror \"a\\q\"\n", "test.case:3: unknown escape '\\q' in a quoted text"},
    {"case \"c\"\nexpect\nerror \"\\x1\"\n", "test.case:3: two hexadecimal digits must follow '\\x'"},
    {"case \"c\"\nexpect\nerror \"a\" b\n", "test.case:3: unexpected 'b' at the end of the line"},
    {"case \"c\"\nexpect\nresult yes\n", "test.case:3: expected true or false instead of 'yes'"},
    {"case \"c\"\nexpect\nabort\nresult true\n", "test.case:4: nothing can follow 'abort'"},
    {"case \"c\"\nexpect\nflag nothing true\n", "test.case:3: unknown flag 'nothing'"},
    {"case \"c\"\nexpect\nflag modeSet 1\n", "test.case:3: expected true or false instead of '1'"},
    {"case \"c\"\nexpect\nflag repeatCount true\n", "test.case:3: expected a number"},
    {"case \"c\"\nexpect\n| x\n", "test.case:3: a '|' line must follow 'text'"},
    {"case \"c\"\nexpect\ntext f\nabsent g\n| x\n", "test.case:5: a '|' line must follow 'text'"},
    {"case \"c\"\nexpect\ntext f\n|\\\n", "test.case:4: '|\\' must follow a '|' line"},
    {"case \"c\"\nexpect\ntext f\n| x\n|\\\n| y\n", "test.case:6: nothing can follow '|\\'"},
};
INSTANTIATE_TEST_SUITE_P(Expectations, BadCaseFile, testing::ValuesIn(badExpectations));

TEST(CaseFile, AFileThatCannotBeReadIsNamed) {
  EXPECT_THROW(
      try { readCaseFile("/nowhere/no.case"); } catch (const CaseError& error) {
        EXPECT_EQ("/nowhere/no.case:0: cannot be opened: No such file or directory", std::string(error.what()));
        throw;
      },
      CaseError);
  EXPECT_THROW(readCaseFile("/"), CaseError);
}

}  // namespace
}  // namespace conformance
