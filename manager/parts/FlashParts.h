#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>

/// Flash memories as tables of data. Sizes are in bytes.
struct SpiFlashPart {
  const char* name;
  std::uint32_t jedecId;  ///< maker, type, capacity: 24 bits
  std::uint32_t size;
  std::uint32_t pageSize;
  std::uint32_t sectorSize;  ///< what `eraseCommand` erases
  std::uint8_t eraseCommand;
  bool fourByteAddress;  ///< needs four address bytes for the upper part
};

struct BpiFlashPart {
  const char* name;
  enum class Commands { amd, intel } commands;
  std::uint16_t maker;
  std::uint16_t device;
  std::uint32_t size;
  std::uint32_t sectorSize;
  std::uint32_t bufferSize;          ///< bytes of the write buffer
  std::uint16_t extendedDevice = 0;  ///< at word address 0E, for a part whose device code (227E) only tells the family
};

namespace FlashParts {

std::span<const SpiFlashPart> spi();
std::span<const BpiFlashPart> bpi();
/// In any letter case; null for an unknown name.
const SpiFlashPart* findSpi(std::string_view name);
const BpiFlashPart* findBpi(std::string_view name);
const SpiFlashPart* findSpiById(std::uint32_t jedecId);

}  // namespace FlashParts
