#include "tests/conformance/runner/Event.h"

#include "tests/conformance/runner/Operations.h"

namespace conformance {
namespace {

/// What follows the first word of an event line.
enum class Operand { call, text, boolean, nothing };

struct Row {
  Event::Kind kind;
  std::string_view word;
  Operand operand;
};
constexpr Row rows[] = {
    {Event::Kind::call, "call", Operand::call},          {Event::Kind::error, "error", Operand::text},
    {Event::Kind::warning, "warning", Operand::text},    {Event::Kind::status, "status", Operand::text},
    {Event::Kind::debug, "debug", Operand::text},        {Event::Kind::standardOutput, "stdout", Operand::text},
    {Event::Kind::handled, "handled", Operand::boolean}, {Event::Kind::abort, "abort", Operand::nothing},
    {Event::Kind::result, "result", Operand::boolean},   {Event::Kind::teardown, "teardown", Operand::nothing},
};

const Row* findRow(std::string_view word) {
  for (const Row& row : rows)
    if (row.word == word) return &row;
  return nullptr;
}

const Row& rowOf(Event::Kind kind) {
  const Row* found = rows;
  while (found->kind != kind) ++found;
  return *found;
}

void requireArgument(const Value& value, const LineCursor& cursor) {
  const Value::Kind kind = value.kind;
  if (kind == Value::Kind::exception || kind == Value::Kind::tuple || kind == Value::Kind::modeInterface)
    cursor.fail("'" + render(value) + "' is no argument");
}

/// Reads `NAME(ARGUMENTS)` and, where there is one, `-> VALUE`.
void parseCall(Event& event, LineCursor& cursor) {
  event.name = cursor.name("the name of a call");
  if (!isOperation(event.name)) cursor.fail("unknown call '" + event.name + "'");
  if (!isTraced(event.name)) cursor.fail("the call '" + event.name + "' is left out of the trace");
  cursor.require("(");
  event.arguments = cursor.valuesUpTo(")");
  for (const Value& argument : event.arguments) requireArgument(argument, cursor);
  const Operation* const operation = findOperation(event.name, static_cast<int>(event.arguments.size()));
  if (operation == nullptr) cursor.fail("wrong number of arguments for '" + event.name + "'");

  if (cursor.take("->")) {
    event.value = cursor.value();
    if (event.value.kind != Value::Kind::any && !fits(operation->answer, event.value))
      cursor.fail("'" + event.name + "' cannot answer '" + render(event.value) + "'");
  } else if (operation->answer != Answer::none) {
    cursor.fail("the result of '" + event.name + "' is missing ('-> VALUE')");
  }
}

}  // namespace

bool isEventWord(std::string_view word) { return findRow(word) != nullptr; }

Event parseEvent(const std::string& word, LineCursor& cursor) {
  const Row* const row = findRow(word);
  if (row == nullptr) cursor.fail("unknown event '" + word + "'");
  Event event;
  event.kind = row->kind;
  switch (row->operand) {
    case Operand::call:
      parseCall(event, cursor);
      break;
    case Operand::text:
      event.value = cursor.take("*") ? Value(Value::Kind::any) : Value(Value::Kind::text, cursor.text());
      break;
    case Operand::boolean:
      event.value = cursor.take("*") ? Value(Value::Kind::any) : Value(Value::Kind::boolean, cursor.boolean() ? 1 : 0);
      break;
    case Operand::nothing:
      break;
  }
  cursor.requireEnd();
  return event;
}

std::string render(const Event& event) {
  std::string line(rowOf(event.kind).word);
  if (event.kind == Event::Kind::call) {
    line += " " + event.name + "(" + renderList(event.arguments) + ")";
    if (event.value.kind != Value::Kind::none) line += " ->";
  }
  if (event.value.kind != Value::Kind::none) line += " " + render(event.value);
  return line;
}

bool matches(const Event& expected, const Event& actual) {
  return expected.kind == actual.kind && expected.name == actual.name &&
         matches(expected.arguments, actual.arguments) && matches(expected.value, actual.value);
}

}  // namespace conformance
