#pragma once

#include <span>
#include <string_view>

#include "tests/conformance/runner/Value.h"

namespace conformance {

/// What an operation answers.
enum class Answer { none, boolean, number, text, options, target, object };

/// A call that cases may name. Overloads are rows of their own.
struct Operation {
  std::string_view name;
  int arguments;
  Answer answer;
  /// What it answers when the case does not say, in the words of a case; empty for `Answer::none`.
  std::string_view fallback;
};

/// All operations: of the device manager, of `ModeInterface`, of the external utilities, and the questions
/// about a device's stored options.
std::span<const Operation> operations();

bool isOperation(std::string_view name);
/// The operation of that name and number of arguments, the first of that name when `arguments` is negative;
/// null when there is none.
const Operation* findOperation(std::string_view name, int arguments);

/// True when the call stands in the trace: it does more than answer a question.
bool isTraced(std::string_view name);

/// True when the operation can answer the value; every one can throw.
bool fits(Answer answer, const Value& value);

}  // namespace conformance
