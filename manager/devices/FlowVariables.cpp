#include "manager/devices/FlowVariables.h"

#include <algorithm>

namespace {

BitVector resized(BitVector bits, std::size_t size) {
  bits.resize(size);
  return bits;
}

/// left + right + carry, modulo 2^size of the two.
BitVector sum(const BitVector& left, const BitVector& right, bool carry) {
  BitVector result(left.size());
  for (std::size_t place = 0; place < left.size(); place += 32) {
    const std::size_t count = std::min<std::size_t>(32, left.size() - place);
    const BitVector::Word part = left.number(place, count) + right.number(place, count) + (carry ? 1U : 0U);
    result.setNumber(place, count, part & ((BitVector::Word{1} << count) - 1));
    carry = (part >> count) != 0;
  }
  return result;
}

/// Moves towards the higher bits.
BitVector shiftedLeft(const BitVector& bits, std::size_t amount) {
  BitVector result(bits.size());
  if (amount < bits.size()) result.copy(amount, bits, 0, bits.size() - amount);
  return result;
}

BitVector shiftedRight(const BitVector& bits, std::size_t amount) {
  BitVector result(bits.size());
  if (amount < bits.size()) result.copy(0, bits, amount, bits.size() - amount);
  return result;
}

}  // namespace

BitVector FlowVariables::evaluate(const Isc::Field& field) {
  using Kind = Isc::Value::Kind;
  const Isc::Value& value = field.value;
  BitVector result = resized(value.bits, field.length);
  if (value.kind != Kind::bits) {
    BitVector& variable = values_[value.variable];
    const BitVector old = resized(variable, field.length);
    if (value.kind == Kind::variable) result = old;
    if (value.kind == Kind::add) result = sum(old, result, false);
    if (value.kind == Kind::subtract) result = sum(old, ~result, true);
    if (value.kind == Kind::shiftLeft) result = shiftedLeft(old, value.amount);
    if (value.kind == Kind::shiftRight) result = shiftedRight(old, value.amount);
    if (value.kind != Kind::variable) variable = result;
  }
  return value.complement ? ~result : result;
}
