#include <cstdio>
#include <exception>
#include <string>
#include <string_view>
#include <vector>

#include "tests/conformance/runner/CaseFile.h"
#include "tests/conformance/runner/CaseProcess.h"
#include "tests/conformance/runner/Verdict.h"

namespace {

using conformance::Case;
using conformance::Outcome;
using conformance::Verdict;

constexpr int exitFailed = 1;
constexpr int exitUnreadable = 2;

constexpr const char* usage =
    "usage: tessel-conformance [--trace] CASEFILE...\n"
    "Runs the cases of all files. --trace prints what each case does, in the words of a case file.\n";

struct Options {
  bool trace = false;
  bool help = false;
  bool valid = true;
  std::vector<std::string> files;
};

Options parseOptions(int count, char** words) {
  Options options;
  for (int i = 1; i < count; ++i) {
    const std::string_view word = words[i];
    if (word == "--trace")
      options.trace = true;
    else if (word == "--help")
      options.help = true;
    else if (word.starts_with("-"))
      options.valid = false;
    else
      options.files.emplace_back(word);
  }
  if (options.files.empty() && !options.help) options.valid = false;
  return options;
}

/// All cases before the first one runs, so that a bad file is found at once.
std::vector<Case> readAll(const std::vector<std::string>& files) {
  std::vector<Case> cases;
  for (const std::string& file : files)
    for (Case& each : conformance::readCaseFile(file)) cases.push_back(std::move(each));
  return cases;
}

bool perform(const Case& script, bool trace) {
  const Outcome outcome = conformance::runCase(script);
  if (trace) std::fputs(conformance::renderTrace(script, outcome).c_str(), stdout);
  const Verdict verdict = conformance::judge(script, outcome);
  std::printf("%s %s\n%s", verdict.passed ? "ok" : "not ok", script.title.c_str(), verdict.details.c_str());
  std::fflush(stdout);
  return verdict.passed;
}

int performAll(const std::vector<Case>& cases, bool trace) {
  int passed = 0;
  int failed = 0;
  for (const Case& script : cases) ++(perform(script, trace) ? passed : failed);
  std::printf("%d passed, %d failed\n", passed, failed);
  return failed == 0 ? 0 : exitFailed;
}

}  // namespace

int main(int count, char** words) {
  const Options options = parseOptions(count, words);
  if (options.help || !options.valid) {
    std::fputs(usage, options.help ? stdout : stderr);
    return options.help ? 0 : exitUnreadable;
  }
  try {
    return performAll(readAll(options.files), options.trace);
  } catch (const conformance::CaseError& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return exitUnreadable;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "tessel-conformance: %s\n", error.what());
    return exitFailed;
  }
}
