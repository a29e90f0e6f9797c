#pragma once

#include <cstdint>
#include <span>
#include <vector>

#include "manager/devices/InstructionLoader.h"

/// The bus to an SPI memory behind a device's bridge register. A transfer is one DR scan: a marker bit, the number of
/// SPI bits less one as 32 bits, the bits themselves. Chip select is low for exactly those. What the memory answers
/// comes later by one bit for each TAP of the chain.
class SpiBus {
 public:
  explicit SpiBus(InstructionLoader& loader) : loader_(loader) {}

  /// Sends bytes and does not wait for an answer.
  Status send(std::span<const std::uint8_t> bytes);
  /// Sends bytes, then takes `count` bytes.
  Result<std::vector<std::uint8_t>> ask(std::span<const std::uint8_t> bytes, std::size_t count);

 private:
  InstructionLoader& loader_;
};
