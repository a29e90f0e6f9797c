#include "manager/parts/BoundaryReader.h"

#include <algorithm>

namespace {

using Token = BsdlTextCursor::Token;

constexpr std::string_view functions[] = {"input",   "clock",    "output2",  "output3",     "bidir",
                                          "control", "controlr", "internal", "observe_only"};
constexpr std::string_view disableResults[] = {"Z", "WEAK0", "WEAK1", "PULL0", "PULL1", "KEEPER"};

struct Entry {
  std::size_t number = 0;
  Token place;
  BoundaryCell cell;
};

/// PORT or PORT ( INDEX ) in upper case.
std::string readPort(BsdlTextCursor& cursor) {
  std::string port = BsdlWords::upper(cursor.expectWord("a port's name or '*'").text);
  if (!cursor.accept("(")) return port;
  port += '(' + std::to_string(cursor.expectCount("an index", 0, mostBoundaryCells)) + ')';
  cursor.expect(")");
  return port;
}

std::string readFunction(BsdlTextCursor& cursor) {
  const Token token = cursor.expectWord("the function of a cell");
  std::string function = BsdlWords::lower(token.text);
  if (std::find(std::begin(functions), std::end(functions), function) == std::end(functions))
    cursor.fail(token, "'" + std::string(token.text) + "' is no function of a boundary cell");
  return function;
}

char readLevel(BsdlTextCursor& cursor, std::string_view what) {
  const Token token = cursor.expectWord(what);
  const std::string level = BsdlWords::upper(token.text);
  if (level == "0" || level == "1" || level == "X") return level[0];
  cursor.fail(token, "expected " + std::string(what) + " (0, 1 or X), found '" + std::string(token.text) + "'");
  return 'X';
}

/// , CONTROL CELL, DISABLE VALUE, RESULT or , INPUT SPECIFICATION (EXTERN0, OPENX, ...), which tells nothing that is
/// used.
void readDisable(BsdlTextCursor& cursor, BoundaryCell& cell) {
  while (cursor.accept(",")) {
    if (!cursor.atNumber()) {
      cursor.expectWord("a control cell or an input specification");
      continue;
    }
    cell.control = static_cast<int>(cursor.expectCount("a control cell", 0, mostBoundaryCells - 1));
    cursor.expect(",");
    cell.disableValue = readLevel(cursor, "the level that disables the cell");
    cursor.expect(",");
    const Token token = cursor.expectWord("what a disabled cell gives");
    cell.disableResult = BsdlWords::upper(token.text);
    if (std::find(std::begin(disableResults), std::end(disableResults), cell.disableResult) == std::end(disableResults))
      cursor.fail(token, "expected Z, WEAK0, WEAK1, PULL0, PULL1 or KEEPER, found '" + std::string(token.text) + "'");
  }
}

/// NUMBER ( TYPE, PORT, FUNCTION, SAFE [, ...] )
Entry readCell(BsdlTextCursor& cursor) {
  Entry entry;
  entry.place = cursor.peek();
  entry.number = cursor.expectCount("the number of a boundary cell", 0, mostBoundaryCells - 1);
  cursor.expect("(");
  entry.cell.type = BsdlWords::upper(cursor.expectWord("the type of a boundary cell").text);
  cursor.expect(",");
  if (!cursor.accept("*")) entry.cell.port = readPort(cursor);
  cursor.expect(",");
  entry.cell.function = readFunction(cursor);
  cursor.expect(",");
  entry.cell.safe = readLevel(cursor, "the safe level of a cell");
  readDisable(cursor, entry.cell);
  cursor.expect(")");
  return entry;
}

std::string cellName(std::size_t number) { return "boundary cell " + std::to_string(number); }

bool observes(const BoundaryCell& cell) {
  return cell.function == "input" || cell.function == "clock" || cell.function == "observe_only";
}

/// Puts an entry into the register. A number may stand for two ports once: one that the cell observes, and one that
/// it drives. Gives what is wrong with the numbers; empty when nothing is.
std::string take(Entry& entry, std::vector<BoundaryCell>& cells, std::vector<int>& given) {
  const std::string outside = " is outside: the register has " + std::to_string(given.size()) + " cells";
  if (entry.number >= given.size()) return cellName(entry.number) + outside;
  if (entry.cell.control >= static_cast<int>(given.size()))
    return "the control cell of " + cellName(entry.number) + outside;
  BoundaryCell& cell = cells[entry.number];
  const int times = given[entry.number]++;
  if (times == 0) {
    cell = std::move(entry.cell);
    return "";
  }
  if (times > 1 || observes(cell) == observes(entry.cell)) return cellName(entry.number) + " is given twice";
  if (observes(cell)) std::swap(cell, entry.cell);
  cell.observedPort = std::move(entry.cell.port);
  return "";
}

}  // namespace

std::vector<BoundaryCell> readBoundaryRegister(BsdlSource& source, const BsdlText& text, std::size_t offset,
                                               std::size_t length) {
  BsdlTextCursor cursor(source, text);
  std::vector<Entry> entries;
  while (!cursor.atEnd()) {
    entries.push_back(readCell(cursor));
    cursor.accept(",");
  }
  if (source.failed()) return {};
  if (length == 0)
    for (const Entry& entry : entries) length = std::max(length, entry.number + 1);
  std::vector<BoundaryCell> cells(length);
  std::vector<int> given(length);
  for (Entry& entry : entries) {
    if (const std::string why = take(entry, cells, given); !why.empty()) {
      cursor.fail(entry.place, why);
      return {};
    }
  }
  const auto missing = std::find(given.begin(), given.end(), 0);
  if (missing != given.end())
    source.fail(offset, cellName(static_cast<std::size_t>(missing - given.begin())) + " is missing");
  return cells;
}

std::map<std::string, std::string> readPinMap(BsdlSource& source, const BsdlText& text, const BsdlEntity& entity) {
  std::map<std::string, std::string> pins;
  BsdlTextCursor cursor(source, text);
  while (!cursor.atEnd()) {
    const std::string name = readPort(cursor);
    cursor.expect(":");
    if (!cursor.accept("(")) {
      pins[name] = cursor.expectWord("a package pin").text;
    } else {
      const auto found = entity.ports.find(name);
      const BsdlEntity::Port port = found == entity.ports.end() ? BsdlEntity::Port{} : found->second;
      std::size_t index = port.left;
      while (!cursor.atEnd() && !cursor.at(")")) {
        pins[name + '(' + std::to_string(index) + ')'] = cursor.expectWord("a package pin").text;
        if (port.left > port.right)
          --index;
        else
          ++index;
        if (!cursor.accept(",")) break;
      }
      cursor.expect(")");
    }
    cursor.accept(",");
  }
  return pins;
}
