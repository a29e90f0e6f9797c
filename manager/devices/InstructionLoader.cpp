#include "manager/devices/InstructionLoader.h"

#include <algorithm>
#include <string_view>

namespace {

constexpr std::size_t idcodeBits = 32;

std::string text(const BitPattern& pattern) {
  std::string digits;
  for (std::size_t i = pattern.value.size(); i-- > 0;)
    digits += !pattern.care.get(i) ? 'X' : pattern.value.get(i) ? '1' : '0';
  return digits;
}

/// '-' and '_' are one.
bool sameName(std::string_view left, std::string_view right) {
  return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                    [](char a, char b) { return (a == '-' ? '_' : a) == (b == '-' ? '_' : b); });
}

}  // namespace

Status InstructionLoader::load(const std::string& instruction, Check check) {
  const BitVector* opcode = part_->opcode(instruction);
  if (opcode == nullptr) return Failure{.text = part_->name + " has no instruction " + instruction};
  const bool wanted = check == Check::always || (check == Check::sometimes && ++unchecked_ >= loadsPerCheck);
  if (!wanted || chain_.cable().recordsOnly()) return chain_.loadInstruction(device_, *opcode);

  unchecked_ = 0;
  BitVector captured;
  TESSEL_TRY(chain_.loadInstruction(device_, *opcode, &captured));
  const BitPattern& pattern = part_->irCapture;
  const bool told = pattern.value.size() == captured.size();
  if (told ? pattern.matches(captured) : captured.size() >= 2 && captured.number(0, 2) == 1) return {};
  return Failure{.text = "the instruction register answered " + captured.binary() + " to " + instruction +
                         ", expected " + (told ? text(pattern) : "...01") + ": the chain is broken",
                 .kind = Failure::Kind::general};
}

Result<BitVector> InstructionLoader::readRegister(const std::string& instruction, std::size_t length) {
  TESSEL_TRY(load(instruction));
  BitVector found;
  TESSEL_TRY(chain_.scanData(device_, {.out = BitVector(length), .in = &found}));
  found.resize(length);
  return found;
}

Status InstructionLoader::checkIdcode() {
  if (part_->idcodes.empty() || part_->opcode("IDCODE") == nullptr) return {};
  if (chain_.cable().recordsOnly()) {
    const BitPattern& pattern = part_->idcodes.front();
    TESSEL_TRY(load("IDCODE"));
    return chain_.scanData(device_, {.out = BitVector(idcodeBits), .expected = &pattern.value, .mask = &pattern.care});
  }
  const Result<BitVector> idcode = readRegister("IDCODE", idcodeBits);
  if (!idcode) return idcode.failure();
  if (part_->matchesIdcode(*idcode)) return {};
  return Failure{.text = "the IDCODE is " + idcode->hex() + ", expected that of " + part_->name + ", " +
                         text(part_->idcodes.front()),
                 .kind = Failure::Kind::mismatch};
}

Result<std::uint64_t> InstructionLoader::field(const std::string& registerName, const std::string& fieldName,
                                               std::uint64_t absent) {
  const NamedRegister* found = part_->findRegister(registerName);
  if (found == nullptr || chain_.cable().recordsOnly()) return absent;
  const auto place = std::find_if(found->fields.begin(), found->fields.end(),
                                  [&](const RegisterField& row) { return sameName(row.name, fieldName); });
  if (place == found->fields.end() || place->length > 64 || place->first + place->length > found->length) return absent;
  const Result<BitVector> bits = readRegister(found->instruction, found->length);
  if (!bits) return bits.failure();
  return bits->number(place->first, place->length);
}
