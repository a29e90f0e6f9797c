#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "tests/conformance/runner/LineCursor.h"
#include "tests/conformance/runner/Value.h"

namespace conformance {

/// One event of a trace, or of the trace that a case expects.
struct Event {
  enum class Kind { call, error, warning, status, debug, standardOutput, handled, abort, result, teardown };

  Kind kind = Kind::call;
  std::string name;              ///< of the call
  std::vector<Value> arguments;  ///< of the call
  /// What a call answered, the text of a message or of an output, or the bool of `handled` and `result`.
  Value value;
};

/// True when an event line can begin with the word.
bool isEventWord(std::string_view word);

/// Reads the rest of an event line whose first word is `word`. Throws `CaseError`.
Event parseEvent(const std::string& word, LineCursor& cursor);

/// The event as a line of a case file.
std::string render(const Event& event);

/// True when the event is what is expected, `*` matching anything.
bool matches(const Event& expected, const Event& actual);

}  // namespace conformance
