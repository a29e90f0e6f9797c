#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <vector>

#include "manager/devices/DataBits.h"
#include "manager/devices/InstructionLoader.h"
#include "manager/devices/Memory.h"

/// What all flash memories behind a bridge have in common: they are erased sector by sector, programmed block by
/// block, and programming only clears bits.
class FlashMemory : public Memory {
 public:
  /// How long something takes as a rule and at most, in seconds.
  struct Time {
    double typical;
    double most;
  };

  Status check(const DataImage& data) override { return DataCompare::fits(data, size()); }
  /// Erases every sector that the data touch, whatever else it holds; all of the memory when there are no data.
  Status erase(const DataImage* data, const Progress& progress) override;
  /// Without the option to erase, data that the memory can't take without are refused before anything is written.
  Status program(const DataImage& data, const ProgramOptions& options, const Progress& progress) override;
  Result<Comparison> compare(const DataImage& data, const Progress& progress) override;
  Result<Comparison> blankCheck(const Progress& progress) override;
  Result<std::vector<std::uint8_t>> read(std::uint64_t first, std::uint64_t count, const Progress& progress) override;

 protected:
  FlashMemory(ScanChain& chain, std::size_t device, PartPointer part) : loader_(chain, device, std::move(part)) {}

  virtual std::uint32_t sectorSize() const = 0;
  /// What is programmed at once; a divisor of the sector's size.
  virtual std::uint32_t blockSize() const = 0;
  /// Loads the bridge's instruction. Done before each kind of work and now and then in between, for the answer to it
  /// shows that the chain is whole.
  virtual Status select() = 0;
  /// Fails when the memory is protected.
  virtual Status refuseProtected() = 0;
  virtual Status eraseAll() = 0;
  virtual Status eraseSector(std::uint64_t address) = 0;
  /// Bytes inside one block, not all of them blank.
  virtual Status programBlock(std::uint64_t address, std::span<const std::uint8_t> bytes) = 0;
  virtual Result<std::vector<std::uint8_t>> readBytes(std::uint64_t first, std::size_t count) = 0;

  Cable& cable() { return loader_.chain().cable(); }
  InstructionLoader& loader() { return loader_; }

 private:
  Status eraseSectors(const DataImage* data, const Progress& progress);
  Status refuseOverwriting(const DataImage& data);
  Status programBlocks(const DataImage& data, const Progress& progress);

  InstructionLoader loader_;
};
