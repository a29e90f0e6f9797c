#pragma once

#include <string>
#include <vector>

#include "tests/conformance/runner/TraceLine.h"

namespace conformance {

/// The lines side by side in unified form; empty when all match. A line that matches through a `*` is
/// equal and shown as the case has it.
std::string unifiedDiff(const std::vector<TraceLine>& expected, const std::vector<TraceLine>& actual);

}  // namespace conformance
