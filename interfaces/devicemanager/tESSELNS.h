#pragma once

#include <cstdint>

/// The numbers that the interpreter and the device manager share.
namespace tESSELNS {

enum MODE_TYPE : std::int32_t {
  BOUNDARY_SCAN = 0,
  SLAVE_SERIAL = 1,
  PARALLEL_PORT = 2,  ///< parallel configuration port
  BOUNDARY_SCAN_FILE = 3,
  DESKTOP_CONFIGURATION = 4,
  SPI = 5,
  SYSTEM_OBA_CF = 6,
  SYSTEM_OBA_MPM = 7,
  PROM_FILE_FORMATTER = 8,
  NO_MODE = 9
};

/// Two meanings share the numbers: those of SystemOBA MPM and those of the PROM file formatter.
enum SUBMODE_TYPE : std::int32_t {
  MPM_SLAVE_SERIAL = 0,
  MPM_PARALLEL_PORT = 1,
  PFF_SERIAL = 0,
  PFF_PARALLEL = 1,
  PFF_VERSION = 2,
  PFF_SPI = 3,
  PFF_BPI = 4,
  PFF_MULTIBOOT_SPI = 5,
  PFF_MULTIBOOT_BPI = 6
};

enum FLASH_TYPE : std::int32_t { SPI_FLASH = 0, BPI_FLASH = 1 };

}  // namespace tESSELNS
