#include "manager/cables/BitbangAnswers.h"

#include <algorithm>
#include <string>

#include "manager/cables/BitbangText.h"

namespace {

Failure answered(std::string what) { return {.text = "answered " + std::move(what), .kind = Failure::Kind::link}; }

/// The first of some bytes that is no answer.
Failure wrongByte(std::span<const char> bytes) {
  constexpr char digits[] = "0123456789ABCDEF";
  const auto isWrong = [](char byte) { return !BitbangText::readBit(byte); };
  const auto value = static_cast<unsigned char>(*std::find_if(bytes.begin(), bytes.end(), isWrong));
  return answered(std::string("the byte 0x") + digits[value / 16] + digits[value % 16] + " where 0 or 1 was expected");
}

}  // namespace

void BitbangAnswers::collect(BitVector* to) {
  to_ = to;
  place_ = 0;
}

Status BitbangAnswers::take(std::span<const char> bytes) {
  received_ += bytes.size();
  if (bytes.size() > outstanding())
    return answered(std::to_string(bytes.size() - outstanding()) + " bytes more than it was asked for");
  TESSEL_TRY(takeSigns(bytes));
  return takeBits(bytes);
}

Status BitbangAnswers::takeSigns(std::span<const char>& bytes) {
  const std::span<const char> signs = bytes.first(std::min(signs_, bytes.size()));
  for (const char& sign : signs)
    if (!BitbangText::readBit(sign)) return wrongByte({&sign, 1});
  signs_ -= signs.size();
  bytes = bytes.subspan(signs.size());
  return {};
}

Status BitbangAnswers::takeBits(std::span<const char>& bytes) {
  wanted_ -= bytes.size();
  while (!bytes.empty()) {
    const bool whole = place_ % BitVector::wordBits == 0 && bytes.size() >= BitVector::wordBits;
    const std::size_t count = whole ? BitVector::wordBits : 1;
    const auto bits = whole ? BitbangText::readWord(bytes.data()) : BitbangText::readBit(bytes.front());
    if (!bits) return wrongByte(bytes.first(count));
    if (whole)
      to_->words()[place_ / BitVector::wordBits] = *bits;
    else
      to_->set(place_, *bits != 0);
    place_ += count;
    bytes = bytes.subspan(count);
  }
  return {};
}
