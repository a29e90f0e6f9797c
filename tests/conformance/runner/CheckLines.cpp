#include "tests/conformance/runner/CheckLines.h"

#include <algorithm>

namespace conformance {
namespace {

/// A lone `*` as the value of a check.
bool takesAnything(Check& check, LineCursor& cursor) {
  if (!cursor.take("*")) return false;
  check.value = Value(Value::Kind::any);
  return true;
}

void readFlag(Check& check, LineCursor& cursor) {
  check.name = cursor.name("the name of a flag");
  if (std::find(flagNames.begin(), flagNames.end(), check.name) == flagNames.end())
    cursor.fail("unknown flag '" + check.name + "'");
  if (takesAnything(check, cursor)) return;
  check.value = check.name == numberFlag ? Value(Value::Kind::number, cursor.number())
                                         : Value(Value::Kind::boolean, cursor.boolean() ? 1 : 0);
}

void readTranscript(Check& check, LineCursor& cursor) {
  if (!takesAnything(check, cursor)) check.value = Value(Value::Kind::text, cursor.text());
}

void readEnvironment(Check& check, LineCursor& cursor) {
  check.name = cursor.name("the name of a variable");
  if (takesAnything(check, cursor)) return;
  check.value = cursor.take("null") ? Value(Value::Kind::null) : Value(Value::Kind::text, cursor.text());
}

void readPath(Check& check, LineCursor& cursor) { check.name = cursor.wordOrText("a path"); }

struct Row {
  const char* word;
  Check::Kind kind;
  void (*read)(Check&, LineCursor&);
};
constexpr Row rows[] = {
    {"flag", Check::Kind::flag, readFlag},
    {"transcript", Check::Kind::transcript, readTranscript},
    {"environment", Check::Kind::environment, readEnvironment},
    {"text", Check::Kind::text, readPath},
    {"absent", Check::Kind::absent, readPath},
};

}  // namespace

void CheckLines::readLine(const std::string& word, Case& target, LineCursor& cursor) {
  inText_ = false;
  if (isEventWord(word)) {
    addEvent(word, target, cursor);
    return;
  }
  const Row* const row = std::find_if(std::begin(rows), std::end(rows), [&](const Row& r) { return word == r.word; });
  if (row == std::end(rows)) cursor.fail("unknown event or check '" + word + "'");
  Check check;
  check.kind = row->kind;
  row->read(check, cursor);
  cursor.requireEnd();
  inText_ = check.kind == Check::Kind::text;
  target.checks.push_back(std::move(check));
}

void CheckLines::addEvent(const std::string& word, Case& target, LineCursor& cursor) {
  if (!target.events.empty() && target.events.back().kind == Event::Kind::abort)
    cursor.fail("nothing can follow 'abort'");
  target.events.push_back(parseEvent(word, cursor));
}

void CheckLines::addFileLine(Case& target, std::string line, LineCursor& cursor) {
  if (!inText_) cursor.fail("a '|' line must follow 'text'");
  Check& check = target.checks.back();
  if (check.openEnd) cursor.fail("nothing can follow '|\\'");
  check.lines.push_back(std::move(line));
}

void CheckLines::openEnd(Case& target, LineCursor& cursor) {
  if (!inText_ || target.checks.back().lines.empty()) cursor.fail("'|\\' must follow a '|' line");
  if (target.checks.back().openEnd) cursor.fail("nothing can follow '|\\'");
  target.checks.back().openEnd = true;
}

}  // namespace conformance
