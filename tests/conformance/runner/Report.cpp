#include "tests/conformance/runner/Report.h"

#include <unistd.h>

#include <cerrno>
#include <charconv>
#include <cstdlib>

#include "tests/conformance/runner/LineCursor.h"

namespace conformance {
namespace {

std::size_t toSize(std::string_view digits) {
  std::size_t number = 0;
  std::from_chars(digits.data(), digits.data() + digits.size(), number);
  return number;
}

void readEvent(Report& report, std::string_view text) {
  const std::size_t end = std::min(text.find(' '), text.size());
  LineCursor cursor(text.substr(end), {"trace", static_cast<int>(report.events.size()) + 1});
  report.events.push_back(parseEvent(std::string(text.substr(0, end)), cursor));
}

void readFact(Report& report, std::string_view text) {
  const std::size_t end = std::min(text.find(' '), text.size());
  report.facts[toSize(text.substr(0, end))] = text.substr(std::min(end + 1, text.size()));
}

void readLine(Report& report, char letter, std::string_view text) {
  switch (letter) {
    case 'E':
      readEvent(report, text);
      break;
    case 'O':
      report.outputRead = toSize(text);
      break;
    case 'C':
      readFact(report, text);
      break;
    case 'F':
      report.failures.push_back(LineCursor(text, {"trace", 0}).text());
      break;
    case 'Z':
      report.finished = true;
      break;
    default:
      report.failures.push_back("the process wrote a line into its report that cannot be read");
  }
}

}  // namespace

void ReportWriter::line(char letter, const std::string& text) {
  const std::string line = std::string({letter, ' '}) + text + "\n";
  for (std::size_t written = 0; written < line.size();) {
    const ssize_t count = write(pipe_, line.data() + written, line.size() - written);
    if (count < 0 && errno == EINTR) continue;
    if (count <= 0) std::_Exit(EXIT_FAILURE);  // the parent is gone
    written += static_cast<std::size_t>(count);
  }
}

void ReportWriter::event(const Event& event) { line('E', render(event)); }
void ReportWriter::outputRead(std::size_t bytes) { line('O', std::to_string(bytes)); }
void ReportWriter::fact(std::size_t check, const std::string& text) { line('C', std::to_string(check) + " " + text); }
void ReportWriter::failure(const std::string& what) { line('F', quote(what)); }
void ReportWriter::finished() { line('Z', ""); }

Report parseReport(std::string_view text) {
  Report report;
  for (std::size_t end = text.find('\n'); end != std::string_view::npos; end = text.find('\n')) {
    if (end >= 2) readLine(report, text[0], text.substr(2, end - 2));
    text.remove_prefix(end + 1);
  }
  return report;
}

}  // namespace conformance
