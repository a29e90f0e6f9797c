#pragma once

#include <optional>
#include <string>
#include <vector>

#include "tests/conformance/runner/Case.h"

namespace conformance {

/// A line to compare: an event, or a line of a check.
struct TraceLine {
  std::string text;
  std::optional<Event> event;
  bool anyEnd = false;  ///< its last character is a `*` that stands for any text
};

/// True when the actual line is what is expected.
bool matches(const TraceLine& expected, const TraceLine& actual);

/// What a case expects, line by line.
std::vector<TraceLine> expectedLines(const Case& script);

/// What happened. Without a `teardown` among the expected events, the events from there on are left out.
std::vector<TraceLine> actualLines(const Case& script, const std::vector<Event>& events,
                                   const std::vector<std::string>& checkLines);

/// True when the case says what the end of the session looks like.
bool expectsTeardown(const Case& script);

}  // namespace conformance
