#pragma once

#include <cstddef>
#include <string>

#include "tests/conformance/runner/Event.h"
#include "tests/conformance/runner/Report.h"

namespace conformance {

/// The trace of a running case. It knows what the process printed between two events and makes it an event
/// of its own.
class Trace {
 public:
  /// `output` is the file that standard output goes to; it is borrowed, like the report.
  Trace(ReportWriter& report, int output, std::string directory)
      : report_(report), output_(output), directory_(std::move(directory)) {}

  /// Adds an event, after what was printed before it.
  void add(Event event);
  void add(Event::Kind kind, Value value = Value());
  /// Adds what was printed since the last event, if anything.
  void addOutput();

  const std::string& directory() const { return directory_; }

 private:
  ReportWriter& report_;
  int output_;
  std::string directory_;
  std::size_t outputRead_ = 0;
};

/// What stands in the file from a place on. Used by the parent, too, for a process that ended early.
std::string readFrom(int file, std::size_t place);

}  // namespace conformance
