#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "tests/conformance/runner/Event.h"

namespace conformance {

/// What a case's process tells its parent, a line at a time, so that nothing is lost when it ends early.
/// Every line is a letter, a blank and a text without line ends.
class ReportWriter {
 public:
  /// The pipe is borrowed.
  explicit ReportWriter(int pipe) : pipe_(pipe) {}

  void event(const Event& event);
  /// How many bytes of standard output the events hold so far.
  void outputRead(std::size_t bytes);
  /// The actual form of the case's check of that number.
  void fact(std::size_t check, const std::string& line);
  /// Something that no case can expect.
  void failure(const std::string& what);
  /// The process has come to its end as it should.
  void finished();

 private:
  void line(char letter, const std::string& text);

  int pipe_;
};

/// The parent's side.
struct Report {
  std::vector<Event> events;
  std::size_t outputRead = 0;
  std::map<std::size_t, std::string> facts;
  std::vector<std::string> failures;
  bool finished = false;
};

/// Reads all complete lines of what the pipe gave.
Report parseReport(std::string_view text);

}  // namespace conformance
