#pragma once

#include <cstdint>
#include <span>
#include <vector>

#include "manager/devices/InstructionLoader.h"

/// The bus to a BPI memory behind a device's bridge register. Addresses are those of bus cycles: words when 16 data
/// lines are used, bytes when 8 are. A cycle is a DR scan of 64 bits; its address is in bits 0 to 31, the data in 32
/// to 47, the strobes to write and read are 48 and 49. After one with bit 51, the next scan gives what is read from
/// the address on, 16 bits a cycle, the lowest first.
class BpiBus {
 public:
  explicit BpiBus(InstructionLoader& loader) : loader_(loader) {}

  Status write(std::uint32_t address, std::uint16_t data);
  Result<std::uint16_t> read(std::uint32_t address);
  /// One after the other.
  Result<std::vector<std::uint16_t>> read(std::uint32_t first, std::size_t count);

 private:
  Status cycle(std::uint64_t bits, BitVector* captured = nullptr);

  InstructionLoader& loader_;
};
