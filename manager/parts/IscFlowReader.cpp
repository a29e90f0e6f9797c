#include "manager/parts/IscFlowReader.h"

#include <algorithm>

namespace {

using Token = BsdlTextCursor::Token;
using Isc::Value;

constexpr std::size_t mostFieldBits = std::size_t{1} << 28;
/// What the flows of a part may take together, in bits of constants; a step or a field takes `entryBits` besides.
constexpr std::size_t mostBits = std::size_t{1} << 26;
constexpr std::size_t entryBits = 64;
constexpr std::size_t mostTurns = 1'000'000'000;
constexpr std::size_t mostCycles = 1'000'000'000'000;
constexpr double mostSeconds = 86400;

Isc::Item single(Isc::Step step) {
  Isc::Item item;
  item.steps.push_back(std::move(step));
  return item;
}

bool isHex(std::string_view word) {
  return !word.empty() && word.find_first_not_of("0123456789abcdefABCDEF_") == std::string_view::npos;
}

/// What a field is marked with for a maker's own checker.
bool isMarker(std::string_view word) { return BsdlWords::same(word, "CRC") || BsdlWords::same(word, "OST"); }

class FlowReader {
 public:
  FlowReader(BsdlTextCursor& cursor, const Part& part, std::size_t& taken)
      : cursor_(cursor), part_(part), taken_(taken) {}

  Isc::Flow read();

 private:
  bool readBlock(Isc::Flow& flow);
  void readItems(Isc::Block& block);
  void readLoop(Isc::Block& block);
  Isc::Step readStep();
  void readWait(Isc::Step& step);
  bool atLimit() const;
  Isc::Wait readLimit();
  Isc::Field readUpdate();
  Isc::Field readCapture();
  Isc::Field beginField();
  Value readValue(std::size_t length);
  Value readVariable(std::size_t length);
  BitVector readBits(std::size_t length);
  bool skipMarker();
  bool atLength() const;
  void take(std::size_t bits);
  bool atField() const { return cursor_.atNumber(); }

  BsdlTextCursor& cursor_;
  const Part& part_;
  std::size_t& taken_;
};

Isc::Flow FlowReader::read() {
  Isc::Flow flow;
  flow.name = readIscName(cursor_, "flow_");
  flow.array = readIscArray(cursor_);
  for (bool more = true; more;) {
    more = false;
    if (cursor_.accept("unprocessed")) more = flow.unprocessed = true;
    if (cursor_.accept("exit_on_error")) more = flow.exitOnError = true;
  }
  while (readBlock(flow)) {
  }
  if (flow.blocks.empty()) cursor_.failExpected("'initialize', 'repeat' or 'terminate'");
  return flow;
}

/// False at the end of the flow.
bool FlowReader::readBlock(Isc::Flow& flow) {
  using Kind = Isc::Block::Kind;
  Isc::Block block;
  if (cursor_.accept("initialize")) {
    block.kind = Kind::initialize;
  } else if (cursor_.accept("repeat")) {
    block.kind = Kind::repeat;
    block.count = cursor_.expectCount("how often to repeat", 0, mostTurns);
  } else if (cursor_.accept("terminate")) {
    block.kind = Kind::terminate;
  } else {
    return false;
  }
  readItems(block);
  if (block.items.empty()) cursor_.failExpected("'(' or 'loop'");
  flow.blocks.push_back(std::move(block));
  return !cursor_.failed();
}

void FlowReader::readItems(Isc::Block& block) {
  while (!cursor_.failed()) {
    if (cursor_.at("("))
      block.items.push_back(single(readStep()));
    else if (cursor_.accept("loop"))
      readLoop(block);
    else
      return;
    // A comma between steps; the one behind the last step ends the flow, and is its caller's.
    if (cursor_.at(",") && (cursor_.ahead(1) == "(" || BsdlWords::same(cursor_.ahead(1), "loop"))) cursor_.next();
  }
}

void FlowReader::readLoop(Isc::Block& block) {
  Isc::Item loop;
  loop.loop = true;
  if (cursor_.accept("min")) loop.loopLeast = cursor_.expectCount("the least number of turns", 0, mostTurns);
  cursor_.expect("max");
  const Token place = cursor_.peek();
  loop.loopMost = cursor_.expectCount("the greatest number of turns", 1, mostTurns);
  if (loop.loopMost < loop.loopLeast) cursor_.fail(place, "a loop's max is less than its min");
  while (!cursor_.failed() && cursor_.at("(")) {
    loop.steps.push_back(readStep());
    if (cursor_.at(",") && cursor_.ahead(1) == "(") cursor_.next();
  }
  if (loop.steps.empty()) cursor_.failExpected("'('");
  block.items.push_back(std::move(loop));
}

/// ( INSTRUCTION UPDATES wait LIMITS CAPTURES )
Isc::Step FlowReader::readStep() {
  Isc::Step step;
  take(entryBits);
  cursor_.expect("(");
  const Token name = cursor_.expectWord("an instruction's name");
  step.instruction = BsdlWords::upper(name.text);
  if (part_.opcode(step.instruction) == nullptr)
    cursor_.fail(name, "instruction " + step.instruction + " has no opcode");
  cursor_.accept(",");
  while (atField()) {
    step.updates.push_back(readUpdate());
    cursor_.accept(",");
  }
  if (cursor_.accept("wait")) readWait(step);
  cursor_.accept(",");
  while (atField()) {
    step.captures.push_back(readCapture());
    cursor_.accept(",");
  }
  cursor_.expect(")");
  return step;
}

void FlowReader::readWait(Isc::Step& step) {
  if (atLimit()) step.least = readLimit();
  if (!cursor_.accept(":")) return;
  const Token place = cursor_.peek();
  step.most = readLimit();
  // Cycles and seconds can't be compared with each other.
  const bool fewer = step.most->cycles != 0 && step.most->cycles < step.least.cycles;
  const bool shorter = step.most->seconds != 0 && step.most->seconds < step.least.seconds;
  if (fewer || shorter) cursor_.fail(place, "the longest wait is shorter than the shortest");
}

/// A capture begins with a number as well: its length, which is followed by ':'. That is no limit, unless it has a
/// fraction: "8:00" is a capture, "1.0e-3:2.0e-3" are two limits.
bool FlowReader::atLimit() const {
  if (cursor_.at("TCK")) return true;
  return cursor_.atNumber() && (cursor_.peek().text.find('.') != std::string_view::npos || cursor_.ahead(1) != ":");
}

Isc::Wait FlowReader::readLimit() {
  Isc::Wait wait;
  if (!cursor_.accept("TCK")) {
    wait.seconds = cursor_.expectReal("'TCK' or a time in seconds", mostSeconds);
    return wait;
  }
  wait.cycles = cursor_.expectCount("a number of TCKs", 0, mostCycles);
  // Behind the comma may stand a capture instead.
  const std::string_view behind = cursor_.at(",") ? cursor_.ahead(1) : std::string_view();
  if (behind.find('.') != std::string_view::npos) {
    cursor_.next();
    wait.seconds = cursor_.expectReal("a time in seconds", mostSeconds);
  }
  return wait;
}

/// A damaged file must not take all memory.
void FlowReader::take(std::size_t bits) {
  taken_ += bits;
  if (taken_ > mostBits) cursor_.fail(cursor_.peek(), "the flows are too long");
}

Isc::Field FlowReader::beginField() {
  take(entryBits);
  Isc::Field field;
  field.length = cursor_.expectCount("the length of a field", 1, mostFieldBits);
  cursor_.expect(":");
  return field;
}

Isc::Field FlowReader::readUpdate() {
  Isc::Field field = beginField();
  field.value = readValue(field.length);
  skipMarker();
  return field;
}

Isc::Field FlowReader::readCapture() {
  Isc::Field field = beginField();
  if (skipMarker()) {
    // In the place of a value: nothing is compared here.
    take(2 * field.length);
    if (!cursor_.failed()) field.value.bits = BitVector(field.length);
    if (!cursor_.failed()) field.mask = BitVector(field.length);
    return field;
  }
  if (cursor_.accept("!"))
    field.value.kind = Value::Kind::output;
  else
    field.value = readValue(field.length);
  if (cursor_.accept("*")) field.mask = readBits(field.length);
  while (skipMarker()) {
  }
  return field;
}

/// [:] CRC or [:] OST.
bool FlowReader::skipMarker() {
  if (cursor_.at(":") && isMarker(cursor_.ahead(1))) cursor_.next();
  if (!isMarker(cursor_.peek().text)) return false;
  cursor_.next();
  return true;
}

Value FlowReader::readValue(std::size_t length) {
  bool complement = false;
  while (cursor_.accept("~")) complement = !complement;
  Value value;
  if (cursor_.accept("?"))
    value.kind = Value::Kind::input;
  else if (cursor_.accept("$"))
    value = readVariable(length);
  else
    value.bits = readBits(length);
  value.complement = complement;
  return value;
}

Value FlowReader::readVariable(std::size_t length) {
  Value value;
  value.kind = Value::Kind::variable;
  value.variable = BsdlWords::lower(cursor_.expectWord("the name of a variable").text);
  static constexpr struct {
    std::string_view sign;
    Value::Kind kind;
  } signs[] = {{"=", Value::Kind::set}, {"+", Value::Kind::add}, {"-", Value::Kind::subtract}};
  for (const auto& [sign, kind] : signs) {
    if (!cursor_.accept(sign)) continue;
    value.kind = kind;
    value.bits = readBits(length);
    return value;
  }
  for (const std::string_view sign : {"<", ">"}) {
    if (!cursor_.accept(sign)) continue;
    cursor_.expect(sign);
    value.kind = sign == "<" ? Value::Kind::shiftLeft : Value::Kind::shiftRight;
    value.amount = cursor_.expectCount("by how many bits to shift", 0, mostFieldBits);
    return value;
  }
  return value;
}

/// Whether the next word is the length of a field: ':' and a value follow.
bool FlowReader::atLength() const {
  return BsdlWords::count(cursor_.peek().text, mostFieldBits) && cursor_.ahead(1) == ":" && !isMarker(cursor_.ahead(2));
}

/// Hex digits, with white space among them.
BitVector FlowReader::readBits(std::size_t length) {
  const Token first = cursor_.peek();
  if (!isHex(first.text)) cursor_.failExpected("hex digits");
  take(length);
  if (cursor_.failed()) return {};
  std::string digits(cursor_.next().text);
  while (isHex(cursor_.peek().text) && !atLength()) digits += cursor_.next().text;
  std::erase(digits, '_');
  if (cursor_.failed()) return {};
  auto bits = BitVector::fromHex(digits, length);
  if (!bits) cursor_.fail(first, "the value does not fit into " + std::to_string(length) + " bits");
  return bits ? std::move(*bits) : BitVector();
}

}  // namespace

Isc::Flow readIscFlow(BsdlTextCursor& cursor, const Part& part, std::size_t& taken) {
  return FlowReader(cursor, part, taken).read();
}
