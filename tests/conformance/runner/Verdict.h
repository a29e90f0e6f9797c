#pragma once

#include <string>

#include "tests/conformance/runner/Case.h"
#include "tests/conformance/runner/CaseProcess.h"

namespace conformance {

/// Whether a case came out as it says, and if not, what the reader needs to see.
struct Verdict {
  bool passed = false;
  std::string details;  ///< whole lines
};

Verdict judge(const Case& script, const Outcome& outcome);

/// The actual trace in the words of a case file: `case "TITLE"`, `expect`, and the events.
std::string renderTrace(const Case& script, const Outcome& outcome);

}  // namespace conformance
