#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <vector>

/// The configuration bitstream of the built-in FPGA families, as bytes. All numbers have their lowest byte first.
///
///     0   "TSLB"
///     4   IDCODE of the part (the version, its four highest bits, is not compared)
///     8   length of the whole bitstream in bytes: the part's configuration memory
///     12  user code, what the USERCODE register shows after start-up
///     16  configuration data
///     end CRC-32 (the polynomial of IEEE 802.3) over all bytes before it
namespace Bitstream {

inline constexpr std::size_t headerBytes = 16;
inline constexpr std::size_t crcBytes = 4;

struct Header {
  std::uint32_t idcode = 0;
  std::uint32_t length = 0;
  std::uint32_t usercode = 0;
};

/// The header; empty when the bytes begin with none.
std::optional<Header> header(std::span<const std::uint8_t> bytes);
/// Whether a part with this IDCODE and memory starts up on the bytes; `why` tells why not.
bool isValid(std::span<const std::uint8_t> bytes, std::uint32_t idcode, std::size_t memoryBytes, const char** why);
/// A whole bitstream with this content, which is cut, or filled up with zeros, to the room there is.
std::vector<std::uint8_t> make(std::uint32_t idcode, std::size_t memoryBytes, std::uint32_t usercode,
                               std::span<const std::uint8_t> content);
std::uint32_t crc32(std::span<const std::uint8_t> bytes);

}  // namespace Bitstream
