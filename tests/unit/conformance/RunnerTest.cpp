// Whole cases, run in processes of their own, that must pass or fail.

#include <gtest/gtest.h>

#include "tests/conformance/runner/CaseFile.h"
#include "tests/conformance/runner/CaseProcess.h"
#include "tests/conformance/runner/Verdict.h"

namespace conformance {
namespace {

Verdict verdictOf(const std::string& lines) {
  const Case script = parseCases("test.case", "case \"c\"\n" + lines).at(0);
  return judge(script, runCase(script));
}

void expectPass(const std::string& lines) {
  const Verdict verdict = verdictOf(lines);
  EXPECT_TRUE(verdict.passed) << verdict.details;
}

TEST(Runner, ComparesAWholeSession) {
  expectPass(
      "given getMode -> 0\n"
      "> setMode -bscan\n"
      "> quit\n"
      "expect\n"
      "call setMode(0, true) -> true\n"
      "call writeBatchCommand(\"quit\") -> true\n"
      "result true\n"
      "teardown\n"
      "call unlockCable() -> true\n"
      "call closeCable(true) -> true\n"
      "call removeDeviceManager()\n"
      "flag modeSet true\n"
      "flag quitRequested true\n"
      "transcript \"setMode -bscan\\nquit\\n\"\n"
      "text session.cmd\n"
      "| setMode -bscan\n"
      "| quit\n");
}

TEST(Runner, EveryKindOfWrongExpectationFails) {
  const std::string setUp = "> setMode -bscan\n> quit\nexpect\n";
  const std::string trace = "call setMode(0, true) -> true\ncall writeBatchCommand(\"quit\") -> true\nresult true\n";
  expectPass(setUp + trace);
  for (const char* wrong :
       {"flag modeSet false\n", "transcript \"\"\n", "environment HOME_OF_NOBODY \"x\"\n", "absent session.cmd\n",
        "text nothing\n", "text session.cmd\n| quit\n", "teardown\ncall unlockCable() -> true\n"}) {
    EXPECT_FALSE(verdictOf(setUp + trace + wrong).passed) << wrong;
  }
}

TEST(Runner, ConsoleInputEndsWithItsRun) {
  expectPass(
      "< setMode -bscan\n"
      "run\n"
      "< setMode -pff\n"
      "expect\n"
      "stdout \">\"\n"
      "call setMode(0, true) -> true\n"
      "stdout \">\"\n"
      "result true\n"
      "result true\n");
}

TEST(Runner, PrintedTextStandsBeforeTheAbort) {
  expectPass("invoke signalHandler SIGSEGV\nexpect\nstdout \"sigsegv.\\n\"\nabort\n");
  EXPECT_FALSE(verdictOf("invoke signalHandler SIGSEGV\nexpect\nabort\n").passed);
  EXPECT_FALSE(verdictOf("invoke signalHandler SIGSEGV\nexpect\nstdout \"sigsegv.\\n\"\n").passed);
  EXPECT_FALSE(verdictOf("expect\nabort\n").passed);
}

TEST(Runner, ThingsHappenDuringACall) {
  expectPass(
      "env ZOR_TESSEL_ALLOWBATCHMODECALLBACK=\n"
      "during setMode@2 progress 2 5 10\n"
      "during setMode@2 console-event 0\n"
      "during setMode@2 console-event 1\n"
      "> setMode -bscan\n"
      "> setMode -bscan\n"
      "> quit\n"
      "expect\n"
      "call setMode(0, true) -> true\n"
      "call setCallbackFunction()\n"
      "call setMode(0, true) -> true\n"
      "status \" 50%\\r\\f\"\n"
      "status *\n"
      "handled true\n"
      "handled false\n"
      "result false\n"
      "flag interruptRequested true\n");
}

TEST(Runner, AnExceptionThatLeavesTheSessionIsAFailure) {
  const Verdict verdict = verdictOf(
      "given setMode -> throw InvalidArgumentException\n"
      "> setMode -bscan\n"
      "expect\n"
      "call setMode(0, true) -> throw InvalidArgumentException\n"
      "call removeDeviceManager()\n");
  EXPECT_FALSE(verdict.passed);
  EXPECT_EQ("# test.case:1\n# an exception ended the case: setMode\n", verdict.details);
}

TEST(Runner, TheWorkingDirectoryIsOneCasesOwn) {
  const std::string lines =
      "dir sub\n"
      "file sub/here \"${CWD}\"\n"
      "env PLACE=${CWD}\n"
      "expect\n"
      "environment PLACE \"${CWD}\"\n"
      "text sub/here\n"
      "| *\n"
      "|\\\n"
      "absent session.cmd\n";
  expectPass(lines);
  EXPECT_FALSE(verdictOf("expect\ntext sub/here\n| *\n|\\\n").passed);
}

TEST(Runner, TheBatchLogIsOffUnlessAsked) {
  expectPass("> quit\nexpect\ncall writeBatchCommand(\"quit\") -> true\nresult true\nabsent _tesselbatch.log\n");
  expectPass(
      "batchlog on\n> quit\n"
      "expect\ncall writeBatchCommand(\"quit\") -> true\nresult true\n"
      "text _tesselbatch.log\n| *\n| \n| *\n");
}

TEST(Runner, AcceptedWordsPassTheCommandTable) {
  expectPass("accept joke\n> joke\nexpect\nerror \"Unknown operation joke\\n\"\nresult false\n");
  EXPECT_FALSE(verdictOf("> joke\nexpect\nerror \"Unknown operation joke\\n\"\nresult false\n").passed);
}

}  // namespace
}  // namespace conformance
