#include "manager/devices/BpiBus.h"

namespace {

constexpr std::size_t cycleBits = 64;
constexpr std::size_t dataPlace = 32;
constexpr std::size_t dataBits = 16;
constexpr std::size_t readyPlace = 50;
constexpr std::uint64_t writeStrobe = std::uint64_t{1} << 48;
constexpr std::uint64_t readStrobe = std::uint64_t{1} << 49;
constexpr std::uint64_t stream = std::uint64_t{1} << 51;

}  // namespace

Status BpiBus::cycle(std::uint64_t bits, BitVector* captured) {
  return loader_.chain().scanData(loader_.device(), {.out = BitVector::fromNumber(bits, cycleBits), .in = captured});
}

Status BpiBus::write(std::uint32_t address, std::uint16_t data) {
  return cycle(address | std::uint64_t{data} << dataPlace | writeStrobe);
}

Result<std::uint16_t> BpiBus::read(std::uint32_t address) {
  TESSEL_TRY(cycle(address | readStrobe));
  BitVector captured;
  TESSEL_TRY(cycle(address, &captured));
  if (captured.size() != cycleBits || !captured.get(readyPlace))
    return Failure{.text = "the bridge to the BPI flash is not ready, its register holds " + captured.hex()};
  return static_cast<std::uint16_t>(captured.number(dataPlace, dataBits));
}

Result<std::vector<std::uint16_t>> BpiBus::read(std::uint32_t first, std::size_t count) {
  TESSEL_TRY(cycle(first | stream));
  BitVector found;
  TESSEL_TRY(loader_.chain().scanData(loader_.device(), {.out = BitVector(count * dataBits), .in = &found}));
  found.resize(count * dataBits);
  std::vector<std::uint16_t> words(count);
  for (std::size_t i = 0; i < count; ++i) words[i] = static_cast<std::uint16_t>(found.number(i * dataBits, dataBits));
  return words;
}
