#include "tests/conformance/runner/TraceLine.h"

#include <algorithm>

namespace conformance {
namespace {

bool isTeardown(const Event& event) { return event.kind == Event::Kind::teardown; }

void addCheck(std::vector<TraceLine>& lines, const Check& check) {
  lines.push_back({renderCheck(check, check.value), std::nullopt, check.value.kind == Value::Kind::any});
  for (const std::string& line : renderFileLines(check.lines, check.openEnd))
    lines.push_back({line, std::nullopt, line == "| *"});
}

}  // namespace

bool matches(const TraceLine& expected, const TraceLine& actual) {
  if (expected.event && actual.event) return matches(*expected.event, *actual.event);
  if (expected.event || actual.event) return false;
  const std::string& text = expected.text;
  return text == actual.text || (expected.anyEnd && actual.text.starts_with(text.substr(0, text.size() - 1)));
}

bool expectsTeardown(const Case& script) { return std::any_of(script.events.begin(), script.events.end(), isTeardown); }

std::vector<TraceLine> expectedLines(const Case& script) {
  std::vector<TraceLine> lines;
  for (const Event& event : script.events) lines.push_back({render(event), event, false});
  for (const Check& check : script.checks) addCheck(lines, check);
  return lines;
}

std::vector<TraceLine> actualLines(const Case& script, const std::vector<Event>& events,
                                   const std::vector<std::string>& checkLines) {
  std::vector<TraceLine> lines;
  const bool whole = expectsTeardown(script);
  for (const Event& event : events) {
    if (isTeardown(event) && !whole) break;
    lines.push_back({render(event), event, false});
  }
  for (const std::string& line : checkLines) lines.push_back({line, std::nullopt, false});
  return lines;
}

}  // namespace conformance
