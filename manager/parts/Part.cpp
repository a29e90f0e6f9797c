#include "manager/parts/Part.h"

#include <algorithm>

bool BitPattern::matches(const BitVector& bits) const {
  return bits.size() == value.size() && firstDifference(value, bits, &care) == BitVector::npos;
}

const BitVector* Part::opcode(const std::string& instruction) const {
  const auto place = opcodes.find(instruction);
  return place == opcodes.end() || place->second.empty() ? nullptr : &place->second.front();
}

const NamedRegister* Part::findRegister(const std::string& registerName) const {
  const auto place = std::find_if(registers.begin(), registers.end(),
                                  [&](const NamedRegister& one) { return one.name == registerName; });
  return place == registers.end() ? nullptr : &*place;
}

bool Part::matchesIdcode(const BitVector& idcode) const {
  return std::any_of(idcodes.begin(), idcodes.end(), [&](const BitPattern& one) { return one.matches(idcode); });
}
