#pragma once

#include <memory>
#include <string>

#include "manager/devices/BpiBus.h"
#include "manager/devices/FlashMemory.h"

/// The commands of one kind of BPI flash. Addresses are those of bus cycles.
class BpiCommands {
 public:
  struct Id {
    std::uint16_t maker = 0;
    std::uint16_t device = 0;
  };

  /// Sizes in bytes; 0 for what is not told.
  struct Query {
    std::uint64_t size = 0;
    std::uint64_t bufferSize = 0;
  };

  static std::unique_ptr<BpiCommands> make(BpiFlashPart::Commands kind, BpiBus& bus, Cable& cable, int width);
  BpiCommands(BpiBus& bus, Cable& cable, int width) : bus_(bus), cable_(cable), width_(width) {}
  virtual ~BpiCommands() = default;

  /// Back to reading data.
  virtual Status reset() = 0;
  virtual Result<Id> readId() = 0;
  virtual Status eraseSector(std::uint32_t sector) = 0;
  /// `bufferCycles` is how many cycles the write buffer holds; 0 when there is none. The data lie in one buffer page.
  virtual Status program(std::uint32_t sector, std::uint32_t address, std::span<const std::uint16_t> data,
                         std::uint32_t bufferCycles) = 0;
  /// What the memory tells of itself (CFI).
  Result<Query> query();

 protected:
  /// Commands and tables are spread over every other address when only 8 data lines are used.
  std::uint32_t spread(std::uint32_t address) const { return width_ == 8 ? address * 2 : address; }
  std::uint16_t lines(std::uint16_t data) const { return width_ == 8 ? data & 0xFFU : data; }

  BpiBus& bus_;
  Cable& cable_;
  int width_;
};

/// A BPI flash memory behind a device's bridge register.
class BpiFlashMemory : public FlashMemory {
 public:
  /// `flash` null: it is found out by `open`. `width` is 8 or 16.
  BpiFlashMemory(ScanChain& chain, std::size_t device, PartPointer part, const BpiFlashPart* flash, int width);

  Status open() override;
  std::uint64_t size() const override { return flash_ == nullptr ? 0 : flash_->size; }
  std::string name() const override {
    return std::string("BPI flash ") + (flash_ == nullptr ? "(unknown)" : flash_->name);
  }

 protected:
  std::uint32_t sectorSize() const override { return flash_->sectorSize; }
  std::uint32_t blockSize() const override;
  Status select() override { return loader().load(loader().part().bridge.bpiInstruction); }
  Status refuseProtected() override { return {}; }
  Status eraseAll() override;
  Status eraseSector(std::uint64_t address) override;
  Status programBlock(std::uint64_t address, std::span<const std::uint8_t> bytes) override;
  Result<std::vector<std::uint8_t>> readBytes(std::uint64_t first, std::size_t count) override;

 private:
  Status identify();
  std::uint32_t cycleOf(std::uint64_t address) const { return static_cast<std::uint32_t>(address / cycleBytes_); }

  BpiBus bus_;
  int width_;
  std::uint32_t cycleBytes_;
  const BpiFlashPart* flash_;
  std::unique_ptr<BpiCommands> commands_;
  std::uint32_t bufferSize_ = 0;  ///< in bytes; 0 for none
};
