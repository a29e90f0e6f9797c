#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "manager/parts/FlashParts.h"

/// What an SPI flash tells about itself by command 5A: a header, and JEDEC's table of basic flash parameters.
namespace Sfdp {

/// Sizes in bytes.
struct Geometry {
  std::uint32_t size = 0;
  std::uint32_t pageSize = 0;
  std::uint32_t sectorSize = 0;  ///< what `eraseCommand` erases
  std::uint8_t eraseCommand = 0;
  bool fourByteAddress = false;  ///< needs four address bytes for the upper part
};

/// How much has to be read for `decode`.
inline constexpr std::size_t bytes = 256;

/// What a part would answer, from address 0 on, `bytes` long.
std::vector<std::uint8_t> build(const SpiFlashPart& part);
/// Empty when the bytes are no such answer, or one that makes no sense. Of several erase commands it is the one with
/// the largest sector of at most 64 KiB, else the one with the smallest sector.
std::optional<Geometry> decode(std::span<const std::uint8_t> content);

}  // namespace Sfdp
