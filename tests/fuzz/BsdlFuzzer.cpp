// The readers of part descriptions. Input: a BSDL file; behind a zero byte, if there is one, the JSON file beside it.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "manager/parts/BsdlFile.h"
#include "manager/parts/Sfdp.h"
#include "tests/fuzz/Require.h"

namespace {

using fuzz::require;

void checkFailure(const Failure& failure, std::string_view file) {
  require(failure.text.starts_with(std::string(file) + ':'), "a failure names the file");
  require(!failure.text.ends_with('\n'), "a failure ends without a line end");
  const bool printable = std::all_of(failure.text.begin(), failure.text.end(), [](char character) {
    return static_cast<unsigned char>(character) >= ' ' || character == '\n';
  });
  require(printable, "a failure has no control characters");
}

void checkField(const Isc::Field& field) {
  using Kind = Isc::Value::Kind;
  const Isc::Value& value = field.value;
  const bool constant =
      value.kind == Kind::bits || value.kind == Kind::set || value.kind == Kind::add || value.kind == Kind::subtract;
  require(field.length > 0, "a field has bits");
  require(value.bits.size() == (constant ? field.length : 0), "a constant has as many bits as its field");
  require(!field.mask || field.mask->size() == field.length, "a mask has as many bits as its field");
}

void checkFlow(const Part& part, const Isc::Flow& flow) {
  require(!flow.blocks.empty(), "a flow has blocks");
  for (const Isc::Block& block : flow.blocks) {
    require(!block.items.empty(), "a block has steps");
    for (const Isc::Item& item : block.items) {
      require(item.loop ? !item.steps.empty() && item.loopLeast <= item.loopMost : item.steps.size() == 1,
              "a loop has steps and bounds; what is no loop is a step");
      for (const Isc::Step& step : item.steps) {
        require(part.opcode(step.instruction) != nullptr, "an instruction of a flow has an opcode");
        for (const Isc::Field& field : step.updates) checkField(field);
        for (const Isc::Field& field : step.captures) checkField(field);
      }
    }
  }
}

void checkProgram(const Part& part) {
  for (const Isc::Flow& flow : part.isc.flows) checkFlow(part, flow);
  for (const Isc::Procedure& procedure : part.isc.procedures)
    for (const Isc::Use& use : procedure.flows)
      require(part.isc.findFlow(use.name, use.array) != nullptr, "a procedure's flows are there");
  for (const Isc::Action& action : part.isc.actions)
    for (const Isc::Use& use : action.procedures)
      require(part.isc.findProcedure(use.name, use.array) != nullptr, "an action's procedures are there");
}

void checkPart(const Part& part) {
  require(part.irLength >= 2, "the length of the instruction register is known");
  require(part.opcode("BYPASS") != nullptr && *part.opcode("BYPASS") == BitVector(part.irLength, true),
          "BYPASS is all ones");
  for (const auto& [name, opcodes] : part.opcodes)
    for (const BitVector& opcode : opcodes)
      require(!name.empty() && opcode.size() == part.irLength, "opcodes have the length of the instruction register");
  for (const BitPattern& idcode : part.idcodes)
    require(idcode.value.size() == 32 && part.matchesIdcode(idcode.value), "an IDCODE matches its own pattern");
  for (const BoundaryCell& cell : part.boundary)
    require(!cell.function.empty() && cell.control < static_cast<int>(part.boundary.size()),
            "cells are filled in and control cells are there");
  checkProgram(part);
}

std::string inOtherCase(std::string_view text) {
  std::string result(text);
  for (char& character : result) {
    const bool letter = (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z');
    if (letter) character = static_cast<char>(character ^ 0x20);
  }
  return result;
}

void checkCompanion(std::string_view text, const Part& part) {
  Part result = part;
  const Status status = BsdlFile::parseCompanion("part.json", text, result);
  if (!status) {
    checkFailure(status.failure(), "part.json");
    require(result.registers.empty() && result.name == part.name, "a failure changes nothing");
    return;
  }
  for (const NamedRegister& reg : result.registers) {
    require(reg.length > 0 && result.opcode(reg.instruction) != nullptr, "a register can be read");
    for (const RegisterField& field : reg.fields)
      require(field.length > 0 && field.first + field.length <= reg.length, "a field lies in its register");
  }
}

void checkFlashDescription(std::string_view text) {
  const auto* bytes = reinterpret_cast<const std::uint8_t*>(text.data());
  const auto geometry = Sfdp::decode({bytes, text.size()});
  if (!geometry) return;
  require(geometry->size % geometry->sectorSize == 0 && geometry->pageSize <= geometry->sectorSize,
          "a flash has whole sectors, sectors have whole pages");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view input(reinterpret_cast<const char*>(data), size);
  checkFlashDescription(input);
  const std::string_view text = input.substr(0, input.find('\0'));
  const Result<Part> part = BsdlFile::parse("part.bsd", text);
  if (part)
    checkPart(*part);
  else
    checkFailure(part.failure(), "part.bsd");

  const Result<Part> other = BsdlFile::parse("part.bsd", inOtherCase(text));
  require(other.ok() == part.ok(), "the case of letters does not matter");
  require(!part || other->name == part->name, "names are alike in any letter case");
  require(BsdlFile::parse("part.bsd", "-- entity\n" + std::string(text)).ok() == part.ok(), "a comment is nothing");
  if (part && text.size() < input.size()) checkCompanion(input.substr(text.size() + 1), *part);
  return 0;
}
