#pragma once

#include <cstdint>

/// Attributes of a chain device and of the flash attached to it. Values are texts.
namespace DeviceNS {

enum ATTRIBUTE : std::int32_t {
  UNKNOWN = -1,
  NAME = 1,  ///< "unknown" for a device that a chain scan could not identify
  STATE = 2,
  CS_PIN = 3,
  CONFIG_FILE_NAME = 4,  ///< setting it means assigning a file
  IR_LENGTH = 18,
  KEY = 25,
  MPM_PAIR = 30,  ///< "true" on the fixed PROM part of an MPM pair
  // What `program`, `verify` and `erase` of a target do besides.
  ERASE_FIRST = 40,   ///< "true" or "false"
  VERIFY_AFTER = 41,  ///< "true" or "false"
  ONLY_FPGA = 42,     ///< "true" or "false"
  USERCODE = 43,      ///< hex digits
  UES = 44,
  REVISION = 45,
  BPI_WIDTH = 46,  ///< of an attached flash: "8" or "16"
  SPI_PART = 57,   ///< null when no SPI flash is attached
  SPI_FILE = 58,
  BPI_PART = 60,  ///< null when no BPI flash is attached
  BPI_FILE = 61
};

}  // namespace DeviceNS
