#pragma once

#include <string_view>
#include <vector>

#include "tests/conformance/runner/Case.h"

namespace conformance {

/// What the `given` and `during` lines of a case say about each call. It counts the calls.
class Script {
 public:
  /// The lines are borrowed.
  Script(const std::vector<Given>& givens, const std::vector<During>& durings);

  struct Turn {
    const Value* answer = nullptr;  ///< null when no `given` line matches
    std::vector<const During*> happenings;
  };
  /// The turn of the next call, whose arguments hold `${CWD}` for the working directory.
  Turn next(std::string_view name, const std::vector<Value>& arguments);

 private:
  const std::vector<Given>& givens_;
  const std::vector<During>& durings_;
  std::vector<int> givenCounts_;
  std::vector<int> duringCounts_;
};

}  // namespace conformance
