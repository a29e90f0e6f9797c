#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "manager/parts/FlashParts.h"
#include "manager/parts/Part.h"
#include "manager/simulator/BpiFlash.h"
#include "manager/simulator/IscModel.h"
#include "manager/simulator/SpiFlash.h"

/// What a board file says, checked.
struct DeviceDescription {
  struct Spi {
    const SpiFlashPart* part = nullptr;
    SpiFlash::Times times;
    std::vector<std::uint8_t> content;
  };
  struct Bpi {
    const BpiFlashPart* part = nullptr;
    BpiFlash::Times times;
    std::vector<std::uint8_t> content;
  };

  PartPointer part;
  std::vector<std::uint8_t> content;  ///< the initial one of the device's own memory
  std::optional<Spi> spi;
  std::optional<Bpi> bpi;
  std::map<std::string, double> monitors;      ///< quantities by field
  std::map<std::string, BitVector> registers;  ///< initial values by register
  std::optional<std::uint32_t> idcode;         ///< answered instead of the right one
  IscModel isc;
  bool endlessBusy = false;
};

struct BoardDescription {
  /// Bits that are flipped at random.
  struct Noise {
    double rate = 0;  ///< of all bits
    std::uint64_t seed = 0;
  };

  std::string name;
  double tck = 10e6;  ///< Hz
  std::vector<DeviceDescription> devices;
  std::vector<std::vector<std::pair<std::size_t, std::string>>> nets;  ///< device and port, in lower case
  std::string statePath;                                               ///< empty for none
  std::optional<bool> stuckTdo;
  Noise tdoNoise;
  Noise tdiNoise;
  std::optional<std::uint64_t> dropAfter;  ///< bytes of the link
};
