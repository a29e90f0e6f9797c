#include "manager/parts/IscReader.h"

#include <algorithm>

#include "manager/parts/BsdlAttributes.h"
#include "manager/parts/IscFlowReader.h"

namespace {

using Token = BsdlTextCursor::Token;

const BsdlText* find(BsdlSource& source, const BsdlEntity& entity, std::string_view name) {
  if (source.failed()) return nullptr;
  const BsdlEntity::Attribute* attribute = entity.find(name);
  return attribute == nullptr ? nullptr : BsdlAttributes::textOf(source, *attribute, name);
}

/// More than any part has; keeps a damaged file from taking all day.
constexpr std::size_t mostEntries = 1024;
constexpr std::size_t mostUses = 64;

void checkCount(BsdlTextCursor& cursor, std::size_t count, std::size_t most) {
  if (count > most) cursor.fail(cursor.peek(), "there are more than " + std::to_string(most) + " entries");
}

std::string withArray(const std::string& name, const std::string& array) {
  return array.empty() ? name : name + '(' + array + ')';
}

/// A list of names in parentheses; `read` gets each.
template <class Read>
void readUses(BsdlTextCursor& cursor, const Read& read) {
  cursor.expect("=");
  cursor.expect("(");
  while (!cursor.atEnd() && !cursor.at(")")) {
    read();
    cursor.accept(",");
  }
  cursor.expect(")");
  cursor.accept(",");
}

void readFlows(BsdlTextCursor& cursor, const Part& part, Isc::Program& program) {
  std::size_t taken = 0;
  while (!cursor.atEnd()) {
    const Token place = cursor.peek();
    Isc::Flow flow = readIscFlow(cursor, part, taken);
    if (program.findFlow(flow.name, flow.array) != nullptr)
      cursor.fail(place, "flow " + withArray(flow.name, flow.array) + " is given twice");
    program.flows.push_back(std::move(flow));
    checkCount(cursor, program.flows.size(), mostEntries);
    cursor.accept(",");
  }
}

Isc::Use readFlowUse(BsdlTextCursor& cursor, const Isc::Program& program) {
  const Token place = cursor.peek();
  Isc::Use use;
  use.name = readIscName(cursor, "flow_");
  use.array = readIscArray(cursor);
  if (program.findFlow(use.name, use.array) == nullptr)
    cursor.fail(place, "there is no flow " + withArray(use.name, use.array));
  return use;
}

void readProcedures(BsdlTextCursor& cursor, Isc::Program& program) {
  while (!cursor.atEnd()) {
    const Token place = cursor.peek();
    Isc::Procedure procedure;
    procedure.name = readIscName(cursor, "proc_");
    procedure.array = readIscArray(cursor);
    readUses(cursor, [&] { procedure.flows.push_back(readFlowUse(cursor, program)); });
    if (program.findProcedure(procedure.name, procedure.array) != nullptr)
      cursor.fail(place, "procedure " + withArray(procedure.name, procedure.array) + " is given twice");
    checkCount(cursor, procedure.flows.size(), mostUses);
    program.procedures.push_back(std::move(procedure));
    checkCount(cursor, program.procedures.size(), mostEntries);
  }
}

Isc::Use readProcedureUse(BsdlTextCursor& cursor, const Isc::Program& program) {
  const Token place = cursor.peek();
  Isc::Use use;
  use.name = readIscName(cursor, "proc_");
  use.array = readIscArray(cursor);
  if (cursor.accept("optional"))
    use.choice = Isc::Use::Choice::optional;
  else if (cursor.accept("recommended"))
    use.choice = Isc::Use::Choice::recommended;
  if (program.findProcedure(use.name, use.array) == nullptr)
    cursor.fail(place, "there is no procedure " + withArray(use.name, use.array));
  return use;
}

void readActions(BsdlTextCursor& cursor, Isc::Program& program) {
  while (!cursor.atEnd()) {
    const Token place = cursor.peek();
    Isc::Action action;
    action.name = readIscName(cursor, "");
    action.array = readIscArray(cursor);
    readUses(cursor, [&] { action.procedures.push_back(readProcedureUse(cursor, program)); });
    const bool twice = std::any_of(program.actions.begin(), program.actions.end(), [&](const Isc::Action& one) {
      return one.name == action.name && one.array == action.array;
    });
    if (twice) cursor.fail(place, "action " + withArray(action.name, action.array) + " is given twice");
    checkCount(cursor, action.procedures.size(), mostUses);
    program.actions.push_back(std::move(action));
    checkCount(cursor, program.actions.size(), mostEntries);
  }
}

/// NAME FIRST [- LAST], ...; "*" in place of a number: the part has none.
void readSecurity(BsdlTextCursor& cursor, Isc::Program& program) {
  static constexpr std::size_t mostPlace = 65535;
  while (!cursor.atEnd()) {
    const Token name = cursor.expectWord("the name of a security bit");
    Isc::SecurityBits bits;
    const bool none = cursor.accept("*");
    if (!none) bits.first = bits.last = cursor.expectCount("the place of a security bit", 0, mostPlace);
    if (cursor.accept("-") && !cursor.accept("*"))
      bits.last = cursor.expectCount("the place of a security bit", 0, mostPlace);
    if (bits.last < bits.first) std::swap(bits.first, bits.last);
    if (!none) program.security[BsdlWords::lower(name.text)] = bits;
    cursor.accept(",");
  }
}

}  // namespace

std::string readIscName(BsdlTextCursor& cursor, std::string_view prefix) {
  const Token token = cursor.peek();
  std::string name = BsdlWords::lower(token.text);
  if (!cursor.atWord() || cursor.atNumber() || !name.starts_with(prefix) || name.size() == prefix.size()) {
    cursor.failExpected(prefix.empty() ? "a name" : "a name that begins with '" + std::string(prefix) + "'");
    return {};
  }
  cursor.next();
  return name.substr(prefix.size());
}

std::string readIscArray(BsdlTextCursor& cursor) {
  if (!cursor.accept("(")) return {};
  std::string array = BsdlWords::lower(cursor.expectWord("the name of an array").text);
  cursor.expect(")");
  return array;
}

void readIscProgram(BsdlSource& source, const BsdlEntity& entity, Part& part) {
  const auto read = [&](std::string_view attribute, const auto& readText) {
    const BsdlText* text = find(source, entity, attribute);
    if (text == nullptr) return;
    BsdlTextCursor cursor(source, *text);
    readText(cursor);
  };
  read("ISC_FLOW", [&](BsdlTextCursor& cursor) { readFlows(cursor, part, part.isc); });
  read("ISC_PROCEDURE", [&](BsdlTextCursor& cursor) { readProcedures(cursor, part.isc); });
  read("ISC_ACTION", [&](BsdlTextCursor& cursor) { readActions(cursor, part.isc); });
  read("ISC_SECURITY", [&](BsdlTextCursor& cursor) { readSecurity(cursor, part.isc); });
}
