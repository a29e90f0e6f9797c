#include "manager/parts/BsdlAttributes.h"

#include <algorithm>
#include <array>

#include "manager/parts/BoundaryReader.h"

namespace {

using BsdlAttributes::readPattern;
using BsdlAttributes::textOf;

constexpr std::size_t mostInstructionBits = 4096;
constexpr std::size_t mostRegisterBits = std::size_t{1} << 28;
constexpr double mostHertz = 1e12;
constexpr std::size_t idcodeBits = 32;

struct Context {
  BsdlSource& source;
  const BsdlEntity& entity;
  const BsdlEntity::Attribute& attribute;
  std::string_view name;
  Part& part;
  std::size_t& boundaryLength;  ///< 0 when not told
};

bool isPattern(std::string_view text) { return text.find_first_not_of("01Xx_") == std::string_view::npos; }

void failAt(const Context& context, std::string_view message) {
  context.source.fail(context.attribute.offset, message);
}

/// A number that stands alone, such as a length.
std::size_t wholeNumber(const Context& context, std::size_t least, std::size_t most) {
  const std::vector<BsdlToken>& tokens = context.attribute.tokens;
  const auto number = tokens.size() == 1 ? BsdlWords::count(tokens[0].text, most) : std::nullopt;
  if (number && *number >= least) return *number;
  failAt(context, std::string(context.name) + ": expected a number from " + std::to_string(least) + " to " +
                      std::to_string(most));
  return least;
}

void readClock(const Context& context) {
  for (const BsdlToken& token : context.attribute.tokens) {
    if (token.text == "(") continue;
    const auto hertz = BsdlWords::real(token.text, mostHertz);
    if (!hertz)
      context.source.fail(token.offset, "expected the highest TCK in Hz, found " + BsdlWords::describe(token));
    context.part.maxTck = hertz.value_or(0);
    return;
  }
  failAt(context, "expected the highest TCK in Hz");
}

void readInstructionLength(const Context& context) {
  context.part.irLength = wholeNumber(context, 2, mostInstructionBits);
}

void readCapture(const Context& context) {
  const BsdlText* text = textOf(context.source, context.attribute, context.name);
  if (text == nullptr) return;
  BsdlTextCursor cursor(context.source, *text);
  context.part.irCapture = readPattern(cursor, "instruction capture", context.part.irLength).value_or(BitPattern{});
  if (!cursor.atEnd()) cursor.failExpected("the end of the text");
}

/// NAME ( PATTERN, PATTERN )
void readOpcode(BsdlTextCursor& cursor, Part& part) {
  const BsdlTextCursor::Token token = cursor.expectWord("an instruction's name");
  const std::string name = BsdlWords::upper(token.text);
  std::vector<BitVector> opcodes;
  cursor.expect("(");
  do {
    const auto pattern = readPattern(cursor, "opcode", part.irLength);
    if (pattern) opcodes.push_back(pattern->value);
  } while (!cursor.failed() && cursor.accept(","));
  cursor.expect(")");
  if (!part.opcodes.try_emplace(name, std::move(opcodes)).second)
    cursor.fail(token, "instruction " + name + " is given twice");
}

/// The entries of a list end with ',', and makers forget one, or write one too many at the end.
template <class Entry>
void readList(const Context& context, const Entry& entry) {
  const BsdlText* text = textOf(context.source, context.attribute, context.name);
  if (text == nullptr) return;
  BsdlTextCursor cursor(context.source, *text);
  while (!cursor.atEnd()) {
    entry(cursor);
    cursor.accept(",");
  }
}

void readOpcodes(const Context& context) {
  readList(context, [&](BsdlTextCursor& cursor) { readOpcode(cursor, context.part); });
}

void readIdcodes(const Context& context) {
  readList(context, [&](BsdlTextCursor& cursor) {
    if (auto pattern = readPattern(cursor, "IDCODE", idcodeBits)) context.part.idcodes.push_back(std::move(*pattern));
  });
}

void readUsercode(const Context& context) {
  readList(context, [&](BsdlTextCursor& cursor) {
    auto pattern = readPattern(cursor, "USERCODE", idcodeBits);
    if (!context.part.usercode) context.part.usercode = std::move(pattern);
  });
}

void readBlankUsercode(const Context& context) {
  readList(context, [&](BsdlTextCursor& cursor) {
    if (auto pattern = readPattern(cursor, "blank USERCODE", idcodeBits))
      context.part.blankUsercode = std::move(pattern->value);
  });
}

/// Skips "CAPTURES 01" behind an instruction.
void skipCaptures(BsdlTextCursor& cursor) {
  while (!cursor.atEnd() && !cursor.at(",") && !cursor.at(")")) cursor.next();
}

/// [LENGTH] behind a register's name; "[*]" tells nothing.
std::size_t readLength(BsdlTextCursor& cursor) {
  if (!cursor.accept("[")) return 0;
  std::size_t length = 0;
  if (!cursor.accept("*")) length = cursor.expectCount("a register's length in bits", 1, mostRegisterBits);
  cursor.expect("]");
  return length;
}

/// REGISTER [LENGTH] ( INSTRUCTION, INSTRUCTION CAPTURES VALUE )
void readAccess(BsdlTextCursor& cursor, Part& part) {
  Part::Access access;
  access.reg = BsdlWords::upper(cursor.expectWord("a register's name").text);
  access.length = readLength(cursor);
  cursor.expect("(");
  while (!cursor.atEnd() && !cursor.at(")")) {
    part.access[BsdlWords::upper(cursor.expectWord("an instruction's name").text)] = access;
    skipCaptures(cursor);
    if (!cursor.accept(",")) break;
  }
  cursor.expect(")");
}

void readAccesses(const Context& context) {
  readList(context, [&](BsdlTextCursor& cursor) { readAccess(cursor, context.part); });
}

void readBoundaryLength(const Context& context) { context.boundaryLength = wholeNumber(context, 1, mostBoundaryCells); }

void readBoundary(const Context& context) {
  const BsdlText* text = textOf(context.source, context.attribute, context.name);
  if (text == nullptr) return;
  context.part.boundary = readBoundaryRegister(context.source, *text, context.attribute.offset, context.boundaryLength);
  context.boundaryLength = context.part.boundary.size();
}

void readIscMark(const Context& context) { context.part.hasIsc = true; }

/// In the order of reading: a row may rely on those before it.
struct Row {
  std::string_view name;
  void (*read)(const Context&);
};
constexpr Row rows[] = {
    {"TAP_SCAN_CLOCK", readClock},
    {"INSTRUCTION_LENGTH", readInstructionLength},
    {"INSTRUCTION_CAPTURE", readCapture},
    {"INSTRUCTION_OPCODE", readOpcodes},
    {"IDCODE_REGISTER", readIdcodes},
    {"USERCODE_REGISTER", readUsercode},
    {"REGISTER_ACCESS", readAccesses},
    {"BOUNDARY_LENGTH", readBoundaryLength},
    {"BOUNDARY_REGISTER", readBoundary},
    {"ISC_CONFORMANCE", readIscMark},
    {"ISC_BLANK_USERCODE", readBlankUsercode},
};

/// What the standard fixes: the registers of its own instructions, and BYPASS.
void addStandard(std::size_t boundary, Part& part) {
  std::vector<BitVector>& bypass = part.opcodes["BYPASS"];
  const BitVector ones(part.irLength, true);
  std::erase(bypass, ones);
  bypass.insert(bypass.begin(), ones);

  const std::pair<const char*, Part::Access> standard[] = {
      {"BYPASS", {"BYPASS", 1}},          {"HIGHZ", {"BYPASS", 1}},
      {"CLAMP", {"BYPASS", 1}},           {"IDCODE", {"DEVICE_ID", 32}},
      {"USERCODE", {"DEVICE_ID", 32}},    {"EXTEST", {"BOUNDARY", boundary}},
      {"SAMPLE", {"BOUNDARY", boundary}}, {"PRELOAD", {"BOUNDARY", boundary}},
      {"INTEST", {"BOUNDARY", boundary}},
  };
  for (const auto& [instruction, access] : standard)
    if (part.opcodes.count(instruction) != 0) part.access.try_emplace(instruction, access);

  const std::pair<const char*, std::size_t> lengths[] = {{"BYPASS", 1}, {"DEVICE_ID", 32}, {"BOUNDARY", boundary}};
  for (auto& [instruction, access] : part.access)
    for (const auto& [name, length] : lengths)
      if (access.reg == name) access.length = length;
}

void addPins(BsdlSource& source, const BsdlEntity& entity, Part& part) {
  if (entity.pinMap) part.pins = readPinMap(source, *entity.pinMap, entity);
}

}  // namespace

namespace BsdlAttributes {

std::span<const std::string_view> wanted() {
  static constexpr std::size_t more = 5;
  static const auto names = [] {
    std::array<std::string_view, std::size(rows) + more> result{"ISC_FLOW", "ISC_PROCEDURE", "ISC_ACTION",
                                                                "ISC_SECURITY", "ISC_STATUS"};
    std::transform(std::begin(rows), std::end(rows), result.begin() + more, [](const Row& row) { return row.name; });
    return result;
  }();
  return names;
}

const BsdlText* textOf(BsdlSource& source, const BsdlEntity::Attribute& attribute, std::string_view name) {
  if (attribute.text) return &*attribute.text;
  source.fail(attribute.offset, std::string(name) + ": expected a string");
  return nullptr;
}

std::optional<BitPattern> readPattern(BsdlTextCursor& cursor, std::string_view what, std::size_t length) {
  const BsdlTextCursor::Token first = cursor.expectWord("the bits of the " + std::string(what));
  std::string bits = BsdlWords::upper(first.text);
  while (cursor.atWord() && isPattern(cursor.peek().text)) bits += BsdlWords::upper(cursor.next().text);
  std::erase(bits, '_');
  if (!isPattern(bits)) cursor.fail(first, "the " + std::string(what) + " is written with 0, 1 and X");
  if (length != 0 && bits.size() != length)
    cursor.fail(first, "the " + std::string(what) + " has " + std::to_string(bits.size()) + " bits, expected " +
                           std::to_string(length));
  if (cursor.failed()) return std::nullopt;
  std::string value = bits;
  std::string care = bits;
  std::replace(value.begin(), value.end(), 'X', '0');
  std::replace_if(
      care.begin(), care.end(), [](char bit) { return bit != 'X'; }, '1');
  std::replace(care.begin(), care.end(), 'X', '0');
  return BitPattern{*BitVector::fromBinary(value), *BitVector::fromBinary(care)};
}

void interpret(BsdlSource& source, const BsdlEntity& entity, Part& part) {
  if (source.failed()) return;
  part.name = BsdlWords::lower(entity.name);
  std::size_t boundaryLength = 0;
  for (const Row& row : rows)
    if (const BsdlEntity::Attribute* attribute = entity.find(row.name); attribute != nullptr && !source.failed())
      row.read({source, entity, *attribute, row.name, part, boundaryLength});
  if (part.irLength == 0) source.fail(entity.offset, "attribute INSTRUCTION_LENGTH of " + entity.name + " is missing");
  if (source.failed()) return;
  addPins(source, entity, part);
  addStandard(boundaryLength, part);
}

}  // namespace BsdlAttributes
