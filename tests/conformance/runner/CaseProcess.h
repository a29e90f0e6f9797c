#pragma once

#include <string>
#include <vector>

#include "tests/conformance/runner/Case.h"
#include "tests/conformance/runner/Report.h"

namespace conformance {

/// What came of a case.
struct Outcome {
  std::vector<Event> events;
  std::vector<std::string> checkLines;  ///< the actual form of the case's checks, in their order
  std::vector<std::string> failures;    ///< what no expectation can make good
};

/// Runs a case in a process of its own. The calling process must have one thread only.
/// Throws `std::system_error` when the system does not give what a process needs.
Outcome runCase(const Case& script);

}  // namespace conformance
