#include "tests/conformance/runner/Case.h"

namespace conformance {

std::string renderCheck(const Check& check, const Value& value) {
  switch (check.kind) {
    case Check::Kind::flag:
      return "flag " + check.name + " " + render(value);
    case Check::Kind::transcript:
      return "transcript " + render(value);
    case Check::Kind::environment:
      return "environment " + check.name + " " + render(value);
    case Check::Kind::text:
      return "text " + check.name;
    case Check::Kind::absent:
      return "absent " + check.name;
  }
  return "";
}

std::vector<std::string> renderFileLines(const std::vector<std::string>& lines, bool openEnd) {
  std::vector<std::string> rendered;
  for (const std::string& line : lines) rendered.push_back("| " + line);
  if (openEnd) rendered.emplace_back("|\\");
  return rendered;
}

}  // namespace conformance
