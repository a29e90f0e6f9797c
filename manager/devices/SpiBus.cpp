#include "manager/devices/SpiBus.h"

#include <algorithm>
#include <array>

namespace {

constexpr std::size_t headBits = 33;

/// SPI sends the highest bit of a byte first, a scan the lowest.
constexpr std::array<std::uint8_t, 256> turned = [] {
  std::array<std::uint8_t, 256> table{};
  for (unsigned byte = 0; byte < table.size(); ++byte)
    for (unsigned bit = 0; bit < 8; ++bit)
      if ((byte >> bit & 1U) != 0) table[byte] = static_cast<std::uint8_t>(table[byte] | 0x80U >> bit);
  return table;
}();

std::vector<std::uint8_t> turn(std::span<const std::uint8_t> bytes) {
  std::vector<std::uint8_t> result(bytes.size());
  std::transform(bytes.begin(), bytes.end(), result.begin(), [](std::uint8_t byte) { return turned[byte]; });
  return result;
}

/// What comes before the answer of so many bytes.
BitVector frame(std::span<const std::uint8_t> bytes, std::size_t answer) {
  const auto last = static_cast<std::uint32_t>((bytes.size() + answer) * 8 - 1);
  const std::array<std::uint8_t, 4> count = {static_cast<std::uint8_t>(last >> 24),
                                             static_cast<std::uint8_t>(last >> 16),
                                             static_cast<std::uint8_t>(last >> 8), static_cast<std::uint8_t>(last)};
  BitVector bits;
  bits.reserve(headBits + (bytes.size() + answer) * 8 + ScanChain::most);
  bits.append(true);
  bits.append(BitVector::fromBytes(turn(count)));
  bits.append(BitVector::fromBytes(turn(bytes)));
  return bits;
}

}  // namespace

Status SpiBus::send(std::span<const std::uint8_t> bytes) {
  return loader_.chain().scanData(loader_.device(), {.out = frame(bytes, 0)});
}

Result<std::vector<std::uint8_t>> SpiBus::ask(std::span<const std::uint8_t> bytes, std::size_t count) {
  BitVector out = frame(bytes, count);
  const std::size_t first = out.size() + loader_.chain().size();
  out.appendFill(count * 8 + loader_.chain().size(), false);
  BitVector in;
  TESSEL_TRY(loader_.chain().scanData(loader_.device(), {.out = out, .in = &in}));
  if (in.size() != out.size()) return Failure{.text = "the cable gave an answer of another length"};
  return turn(in.slice(first, count * 8).bytes());
}
