#pragma once

#include <string>

#include "manager/devices/FlashMemory.h"
#include "manager/devices/SpiBus.h"

/// An SPI flash memory behind a device's bridge register.
class SpiFlashMemory : public FlashMemory {
 public:
  /// `flash` null: it is found out by `open`.
  SpiFlashMemory(ScanChain& chain, std::size_t device, PartPointer part, const SpiFlashPart* flash);

  Status open() override;
  std::uint64_t size() const override { return flash_.size; }
  std::string name() const override { return "SPI flash " + flash_.name; }

 protected:
  std::uint32_t sectorSize() const override { return flash_.sectorSize; }
  std::uint32_t blockSize() const override { return flash_.pageSize; }
  Status select() override { return loader().load(loader().part().bridge.spiInstruction); }
  Status refuseProtected() override;
  Status eraseAll() override;
  Status eraseSector(std::uint64_t address) override;
  Status programBlock(std::uint64_t address, std::span<const std::uint8_t> bytes) override;
  Result<std::vector<std::uint8_t>> readBytes(std::uint64_t first, std::size_t count) override;

 private:
  struct Geometry {
    std::string name = "(unknown)";
    std::uint64_t size = 0;
    std::uint32_t pageSize = 256;
    std::uint32_t sectorSize = 0;
    std::uint8_t eraseCommand = 0;
    bool fourByteAddress = false;
  };
  static Geometry geometryOf(const SpiFlashPart& part);
  Result<Geometry> discover(std::uint32_t id);
  Status waitForOthers();
  Result<std::uint32_t> readId();
  Result<std::uint8_t> readStatus();
  Status writeEnable();
  Status waitReady(const Time& time, const char* what);
  std::vector<std::uint8_t> command(std::uint8_t code, std::uint64_t address) const;
  Status change(const std::vector<std::uint8_t>& bytes, const Time& time, const char* what);

  SpiBus bus_;
  const SpiFlashPart* wanted_;
  Geometry flash_;
};
