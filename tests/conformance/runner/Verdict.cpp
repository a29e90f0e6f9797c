#include "tests/conformance/runner/Verdict.h"

#include <algorithm>

#include "tests/conformance/runner/Diff.h"
#include "tests/conformance/runner/TraceLine.h"

namespace conformance {
namespace {

std::string comment(const std::string& text) { return "# " + text + "\n"; }

/// An abort past the compared part of the trace must not go unseen.
bool abortsUnseen(const Case& script, const std::vector<Event>& events) {
  return !expectsTeardown(script) && !events.empty() && events.back().kind == Event::Kind::abort &&
         std::any_of(events.begin(), events.end(), [](const Event& e) { return e.kind == Event::Kind::teardown; });
}

}  // namespace

Verdict judge(const Case& script, const Outcome& outcome) {
  std::string findings;
  for (const std::string& failure : outcome.failures) findings += comment(failure);
  if (abortsUnseen(script, outcome.events)) findings += comment("the process aborted during the teardown");
  findings += unifiedDiff(expectedLines(script), actualLines(script, outcome.events, outcome.checkLines));
  if (findings.empty()) return {true, ""};
  return {false, comment(script.file + ":" + std::to_string(script.line)) + findings};
}

std::string renderTrace(const Case& script, const Outcome& outcome) {
  std::string lines = "case " + quote(script.title) + "\n  expect\n";
  for (const Event& event : outcome.events) lines += "  " + render(event) + "\n";
  return lines;
}

}  // namespace conformance
