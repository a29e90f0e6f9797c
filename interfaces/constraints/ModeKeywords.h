#pragma once

#include "interfaces/devicemanager/tESSELNS.h"

/// The keywords that select modes and submodes, compared in full and without regard to letter case.
namespace ModeKeywords {

struct Mode {
  const char* keyword;
  tESSELNS::MODE_TYPE mode;
};
inline constexpr Mode modes[] = {
    {"ss", tESSELNS::SLAVE_SERIAL},
    {"sserial", tESSELNS::SLAVE_SERIAL},
    {"bs", tESSELNS::BOUNDARY_SCAN},
    {"bscan", tESSELNS::BOUNDARY_SCAN},
    {"sm", tESSELNS::PARALLEL_PORT},
    {"smap", tESSELNS::PARALLEL_PORT},
    {"cf", tESSELNS::SYSTEM_OBA_CF},
    {"compactflash", tESSELNS::SYSTEM_OBA_CF},
    {"obacf", tESSELNS::SYSTEM_OBA_CF},
    {"mpm", tESSELNS::SYSTEM_OBA_MPM},
    {"obampm", tESSELNS::SYSTEM_OBA_MPM},
    {"pff", tESSELNS::PROM_FILE_FORMATTER},
    {"promfile", tESSELNS::PROM_FILE_FORMATTER},
    {"bsfile", tESSELNS::BOUNDARY_SCAN_FILE},
    {"hw520", tESSELNS::DESKTOP_CONFIGURATION},
    {"dtconfig", tESSELNS::DESKTOP_CONFIGURATION},
    {"spi", tESSELNS::SPI},
};

struct Submode {
  const char* keyword;
  tESSELNS::MODE_TYPE requiredMode;  ///< the active mode that the keyword needs
  tESSELNS::SUBMODE_TYPE submode;
};
inline constexpr Submode submodes[] = {
    {"mpmss", tESSELNS::SYSTEM_OBA_MPM, tESSELNS::MPM_SLAVE_SERIAL},
    {"mpmsm", tESSELNS::SYSTEM_OBA_MPM, tESSELNS::MPM_PARALLEL_PORT},
    {"pffserial", tESSELNS::PROM_FILE_FORMATTER, tESSELNS::PFF_SERIAL},
    {"pffparallel", tESSELNS::PROM_FILE_FORMATTER, tESSELNS::PFF_PARALLEL},
    {"pffversion", tESSELNS::PROM_FILE_FORMATTER, tESSELNS::PFF_VERSION},
    {"pffspi", tESSELNS::PROM_FILE_FORMATTER, tESSELNS::PFF_SPI},
    {"pffbpi", tESSELNS::PROM_FILE_FORMATTER, tESSELNS::PFF_BPI},
    {"pffmbspi", tESSELNS::PROM_FILE_FORMATTER, tESSELNS::PFF_MULTIBOOT_SPI},
    {"pffmbbpi", tESSELNS::PROM_FILE_FORMATTER, tESSELNS::PFF_MULTIBOOT_BPI},
};

}  // namespace ModeKeywords
