#pragma once

#include <string>

#include "tests/conformance/runner/Case.h"
#include "tests/conformance/runner/LineCursor.h"

namespace conformance {

/// Reads the lines of a case that stand before `expect`. All functions throw `CaseError`.
class SetupLines {
 public:
  /// Reads the rest of a line whose first word is `word` into the case.
  void readLine(const std::string& word, Case& target, LineCursor& cursor);
  /// A line of the command file (`>`) or of console input (`<`).
  void addRunLine(char mark, std::string line);
  /// Ends the last run.
  void finish(Case& target);

 private:
  using Reader = void (SetupLines::*)(Case&, LineCursor&);
  struct Row {
    const char* word;
    Reader reader;
  };
  static const Row rows[];

  void environment(Case& target, LineCursor& cursor);
  void directory(Case& target, LineCursor& cursor);
  void file(Case& target, LineCursor& cursor);
  void batchLog(Case& target, LineCursor& cursor);
  void accept(Case& target, LineCursor& cursor);
  void given(Case& target, LineCursor& cursor);
  void during(Case& target, LineCursor& cursor);
  void run(Case& target, LineCursor& cursor);
  void runMissing(Case& target, LineCursor& cursor);
  void invoke(Case& target, LineCursor& cursor);

  std::string fixturePath(const Case& target, LineCursor& cursor) const;

  Run pending_;
};

}  // namespace conformance
