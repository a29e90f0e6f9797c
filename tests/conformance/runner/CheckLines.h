#pragma once

#include <string>

#include "tests/conformance/runner/Case.h"
#include "tests/conformance/runner/LineCursor.h"

namespace conformance {

/// Reads the lines of a case that stand after `expect`: events and checks. All functions throw `CaseError`.
class CheckLines {
 public:
  /// Reads the rest of a line whose first word is `word` into the case.
  void readLine(const std::string& word, Case& target, LineCursor& cursor);
  /// A `| LINE` of the text check above it.
  void addFileLine(Case& target, std::string line, LineCursor& cursor);
  /// The `|\` after the last line of a text check.
  void openEnd(Case& target, LineCursor& cursor);

 private:
  static void addEvent(const std::string& word, Case& target, LineCursor& cursor);

  bool inText_ = false;
};

}  // namespace conformance
