#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "manager/content/DataImage.h"
#include "manager/parts/FlashParts.h"
#include "manager/parts/Part.h"
#include "manager/scan/ScanChain.h"
#include "manager/support/Progress.h"
#include "manager/support/Result.h"

/// What a comparison of a memory with data found. Addresses are in bytes.
struct Comparison {
  std::uint64_t compared = 0;
  std::uint64_t differences = 0;  ///< bytes that differ
  std::uint64_t firstAddress = 0;
  std::uint8_t expected = 0;  ///< at the first address
  std::uint8_t found = 0;

  bool equal() const { return differences == 0; }
};

/// A memory on the chain: what a device keeps inside, or the flash behind it. Failures name what was expected, not
/// the device's position: the caller puts that in front.
class Memory {
 public:
  struct ProgramOptions {
    bool erase = false;
    bool verify = false;
    bool onlyFpga = false;  ///< the configuration of a part that has flash inside as well
    std::string key;        ///< an encryption key as hex digits; empty for none
  };

  virtual ~Memory() = default;

  /// Finds out what is there and whether it is what was described. Called first, once; changes nothing.
  virtual Status open() = 0;
  /// In bytes, known after `open`.
  virtual std::uint64_t size() const = 0;
  /// Such as "zp18v01" or "SPI flash w25q64".
  virtual std::string name() const = 0;
  /// Whether the data can be programmed at all; asked before anything is erased.
  virtual Status check(const DataImage& data) = 0;
  /// Erases the whole memory, or the sectors that `data` needs.
  virtual Status erase(const DataImage* data, const Progress& progress) = 0;
  /// Erases and verifies when the options say so. Success means what was asked for was done and found right.
  virtual Status program(const DataImage& data, const ProgramOptions& options, const Progress& progress) = 0;
  /// Only what `data` covers; bytes in its holes are not compared.
  virtual Result<Comparison> compare(const DataImage& data, const Progress& progress) = 0;
  /// Against the blank state; `expected` is then what a blank byte holds.
  virtual Result<Comparison> blankCheck(const Progress& progress) = 0;
  virtual Result<std::vector<std::uint8_t>> read(std::uint64_t first, std::uint64_t count,
                                                 const Progress& progress) = 0;
};

/// A device's own memory, worked on as its ISC actions say. The failure names what the part lacks.
Result<std::unique_ptr<Memory>> makeIscMemory(ScanChain& chain, std::size_t device, PartPointer part);
/// SPI flash behind a device's bridge register; `flash` null when it is to be discovered.
Result<std::unique_ptr<Memory>> makeSpiFlash(ScanChain& chain, std::size_t device, PartPointer part,
                                             const SpiFlashPart* flash);
/// BPI flash behind a device's bridge register; `width` is 8 or 16 bits.
Result<std::unique_ptr<Memory>> makeBpiFlash(ScanChain& chain, std::size_t device, PartPointer part,
                                             const BpiFlashPart* flash, int width);
