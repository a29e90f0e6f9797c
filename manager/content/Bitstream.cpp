#include "manager/content/Bitstream.h"

#include <algorithm>
#include <array>
#include <string_view>

namespace {

constexpr std::string_view mark = "TSLB";
constexpr std::uint32_t versionBits = 0xF0000000;

std::uint32_t numberAt(std::span<const std::uint8_t> bytes, std::size_t place) {
  std::uint32_t number = 0;
  for (std::size_t i = 0; i < 4; ++i) number |= static_cast<std::uint32_t>(bytes[place + i]) << (8 * i);
  return number;
}

void putNumber(std::vector<std::uint8_t>& bytes, std::size_t place, std::uint32_t number) {
  for (std::size_t i = 0; i < 4; ++i) bytes[place + i] = static_cast<std::uint8_t>(number >> (8 * i));
}

/// What each value of a byte adds to the sum; the polynomial with its highest power last.
constexpr std::array<std::uint32_t, 256> crcTable = [] {
  std::array<std::uint32_t, 256> table{};
  for (std::uint32_t byte = 0; byte < table.size(); ++byte) {
    std::uint32_t sum = byte;
    for (int bit = 0; bit < 8; ++bit) sum = (sum & 1) != 0 ? sum >> 1 ^ 0xEDB88320U : sum >> 1;
    table[byte] = sum;
  }
  return table;
}();

const char* faultOf(std::span<const std::uint8_t> bytes, std::uint32_t idcode, std::size_t memoryBytes) {
  const auto header = Bitstream::header(bytes);
  if (!header) return "it does not begin with a bitstream header";
  if (((header->idcode ^ idcode) & ~versionBits) != 0) return "it is made for a part with another IDCODE";
  if (header->length != memoryBytes || memoryBytes < Bitstream::headerBytes + Bitstream::crcBytes)
    return "its length is not that of the part's memory";
  if (bytes.size() < memoryBytes) return "it is cut short";
  const std::size_t checked = memoryBytes - Bitstream::crcBytes;
  return Bitstream::crc32(bytes.first(checked)) == numberAt(bytes, checked) ? nullptr : "its CRC is wrong";
}

}  // namespace

std::optional<Bitstream::Header> Bitstream::header(std::span<const std::uint8_t> bytes) {
  if (bytes.size() < headerBytes || !std::equal(mark.begin(), mark.end(), bytes.begin())) return std::nullopt;
  return Header{.idcode = numberAt(bytes, 4), .length = numberAt(bytes, 8), .usercode = numberAt(bytes, 12)};
}

bool Bitstream::isValid(std::span<const std::uint8_t> bytes, std::uint32_t idcode, std::size_t memoryBytes,
                        const char** why) {
  const char* fault = faultOf(bytes, idcode, memoryBytes);
  if (why != nullptr) *why = fault;
  return fault == nullptr;
}

std::vector<std::uint8_t> Bitstream::make(std::uint32_t idcode, std::size_t memoryBytes, std::uint32_t usercode,
                                          std::span<const std::uint8_t> content) {
  std::vector<std::uint8_t> bytes(std::max(memoryBytes, headerBytes + crcBytes));
  std::copy(mark.begin(), mark.end(), bytes.begin());
  putNumber(bytes, 4, idcode);
  putNumber(bytes, 8, static_cast<std::uint32_t>(bytes.size()));
  putNumber(bytes, 12, usercode);
  const std::size_t room = bytes.size() - headerBytes - crcBytes;
  std::copy_n(content.begin(), std::min(room, content.size()), bytes.begin() + headerBytes);
  const std::size_t checked = bytes.size() - crcBytes;
  putNumber(bytes, checked, crc32(std::span(bytes).first(checked)));
  return bytes;
}

std::uint32_t Bitstream::crc32(std::span<const std::uint8_t> bytes) {
  std::uint32_t sum = 0xFFFFFFFF;
  for (const std::uint8_t byte : bytes) sum = crcTable[(sum ^ byte) & 0xFFU] ^ sum >> 8;
  return ~sum;
}
