#include "manager/parts/FlashParts.h"

#include <algorithm>

#include "manager/parts/BsdlLexer.h"

namespace {

constexpr std::uint32_t KiB = 1024;
constexpr std::uint32_t MiB = 1024 * KiB;
constexpr std::uint8_t eraseBlock = 0xD8;

/// Three address bytes reach this far.
constexpr bool isBig(std::uint32_t size) { return size > 16 * MiB; }

/// Pages of 256 bytes; `sectorSize` is the block that D8 erases.
constexpr SpiFlashPart row(const char* name, std::uint32_t jedecId, std::uint32_t size,
                           std::uint32_t sectorSize = 64 * KiB) {
  return {name, jedecId, size, 256, sectorSize, eraseBlock, isBig(size)};
}

constexpr SpiFlashPart spiParts[] = {
    row("m25p05", 0x202010, 64 * KiB, 32 * KiB),
    row("m25p10", 0x202011, 128 * KiB, 32 * KiB),
    row("m25p20", 0x202012, 256 * KiB),
    row("m25p40", 0x202013, 512 * KiB),
    row("m25p80", 0x202014, 1 * MiB),
    row("m25p16", 0x202015, 2 * MiB),
    row("m25p32", 0x202016, 4 * MiB),
    row("m25p64", 0x202017, 8 * MiB),
    row("m25p128", 0x202018, 16 * MiB, 256 * KiB),
    row("n25q032", 0x20BA16, 4 * MiB),
    row("n25q064", 0x20BA17, 8 * MiB),
    row("n25q128", 0x20BA18, 16 * MiB),
    row("n25q256", 0x20BA19, 32 * MiB),
    row("n25q512", 0x20BA20, 64 * MiB),
    row("mt25ql01g", 0x20BA21, 128 * MiB),
    row("mt25ql02g", 0x20BA22, 256 * MiB),
    row("mt25qu128", 0x20BB18, 16 * MiB),
    row("mt25qu256", 0x20BB19, 32 * MiB),
    row("mt25qu512", 0x20BB20, 64 * MiB),
    row("mt25qu01g", 0x20BB21, 128 * MiB),
    row("w25x10", 0xEF3011, 128 * KiB),
    row("w25x20", 0xEF3012, 256 * KiB),
    row("w25x40", 0xEF3013, 512 * KiB),
    row("w25x80", 0xEF3014, 1 * MiB),
    row("w25x16", 0xEF3015, 2 * MiB),
    row("w25x32", 0xEF3016, 4 * MiB),
    row("w25x64", 0xEF3017, 8 * MiB),
    row("w25q80", 0xEF4014, 1 * MiB),
    row("w25q16", 0xEF4015, 2 * MiB),
    row("w25q32", 0xEF4016, 4 * MiB),
    row("w25q64", 0xEF4017, 8 * MiB),
    row("w25q128", 0xEF4018, 16 * MiB),
    row("w25q256", 0xEF4019, 32 * MiB),
    row("w25q512", 0xEF4020, 64 * MiB),
    row("w25q01", 0xEF4021, 128 * MiB),
    row("w25q16dw", 0xEF6015, 2 * MiB),
    row("w25q32dw", 0xEF6016, 4 * MiB),
    row("w25q64dw", 0xEF6017, 8 * MiB),
    row("w25q128fw", 0xEF6018, 16 * MiB),
    row("w25q256jw", 0xEF6019, 32 * MiB),
    row("mx25l4005", 0xC22013, 512 * KiB),
    row("mx25l8005", 0xC22014, 1 * MiB),
    row("mx25l1605", 0xC22015, 2 * MiB),
    row("mx25l3205", 0xC22016, 4 * MiB),
    row("mx25l6405", 0xC22017, 8 * MiB),
    row("mx25l12805", 0xC22018, 16 * MiB),
    row("mx25l25635", 0xC22019, 32 * MiB),
    row("mx25l51245", 0xC2201A, 64 * MiB),
    row("mx66l1g45", 0xC2201B, 128 * MiB),
    row("mx25u1635", 0xC22535, 2 * MiB),
    row("mx25u3235", 0xC22536, 4 * MiB),
    row("mx25u6435", 0xC22537, 8 * MiB),
    row("mx25u12835", 0xC22538, 16 * MiB),
    row("mx25u25635", 0xC22539, 32 * MiB),
    row("gd25q40", 0xC84013, 512 * KiB),
    row("gd25q80", 0xC84014, 1 * MiB),
    row("gd25q16", 0xC84015, 2 * MiB),
    row("gd25q32", 0xC84016, 4 * MiB),
    row("gd25q64", 0xC84017, 8 * MiB),
    row("gd25q128", 0xC84018, 16 * MiB),
    row("gd25q256", 0xC84019, 32 * MiB),
    row("gd25lq64", 0xC86017, 8 * MiB),
    row("gd25lq128", 0xC86018, 16 * MiB),
    row("s25fl116k", 0x014015, 2 * MiB),
    row("s25fl132k", 0x014016, 4 * MiB),
    row("s25fl164k", 0x014017, 8 * MiB),
    row("s25fl064l", 0x016017, 8 * MiB),
    row("s25fl128l", 0x016018, 16 * MiB),
    row("s25fl256l", 0x016019, 32 * MiB),
    row("s25fl128s", 0x012018, 16 * MiB),
    row("s25fl256s", 0x010219, 32 * MiB),
    row("s25fl512s", 0x010220, 64 * MiB, 256 * KiB),
    row("is25lp032", 0x9D6016, 4 * MiB),
    row("is25lp064", 0x9D6017, 8 * MiB),
    row("is25lp128", 0x9D6018, 16 * MiB),
    row("is25lp256", 0x9D6019, 32 * MiB),
    row("is25lp512", 0x9D601A, 64 * MiB),
    row("is25wp064", 0x9D7017, 8 * MiB),
    row("is25wp128", 0x9D7018, 16 * MiB),
    row("is25wp256", 0x9D7019, 32 * MiB),
    row("en25q32", 0x1C3016, 4 * MiB),
    row("en25q64", 0x1C3017, 8 * MiB),
    row("en25q128", 0x1C3018, 16 * MiB),
    row("en25qh64", 0x1C7017, 8 * MiB),
    row("en25qh128", 0x1C7018, 16 * MiB),
    row("en25qh256", 0x1C7019, 32 * MiB),
};

using Commands = BpiFlashPart::Commands;

/// Blocks of 128 KiB. The parts with extended codes have 227E as their device code.
constexpr BpiFlashPart amd(const char* name, std::uint16_t maker, std::uint16_t extended, std::uint32_t size,
                           std::uint32_t bufferSize) {
  return {name, Commands::amd, maker, 0x227E, size, 128 * KiB, bufferSize, extended};
}

constexpr BpiFlashPart intel(const char* name, std::uint16_t device, std::uint32_t size) {
  return {name, Commands::intel, 0x0089, device, size, 128 * KiB, 32, 0};
}

constexpr BpiFlashPart bpiParts[] = {
    amd("s29gl128p", 0x0001, 0x2221, 16 * MiB, 64),
    amd("s29gl256p", 0x0001, 0x2222, 32 * MiB, 64),
    amd("s29gl512p", 0x0001, 0x2223, 64 * MiB, 64),
    amd("s29gl01gp", 0x0001, 0x2228, 128 * MiB, 64),
    amd("s29gl128s", 0x0001, 0x2221, 16 * MiB, 512),
    amd("s29gl256s", 0x0001, 0x2222, 32 * MiB, 512),
    amd("s29gl512s", 0x0001, 0x2223, 64 * MiB, 512),
    amd("s29gl01gs", 0x0001, 0x2228, 128 * MiB, 512),
    amd("m29w128g", 0x0020, 0x2221, 16 * MiB, 64),
    amd("m29w256g", 0x0020, 0x2222, 32 * MiB, 64),
    amd("mx29gl128e", 0x00C2, 0x2221, 16 * MiB, 64),
    amd("mx29gl256e", 0x00C2, 0x2222, 32 * MiB, 64),
    amd("28f256m29ew", 0x0089, 0x2222, 32 * MiB, 1024),
    amd("28f512m29ew", 0x0089, 0x2223, 64 * MiB, 1024),
    amd("28f00am29ew", 0x0089, 0x2228, 128 * MiB, 1024),
    intel("28f320j5", 0x0014, 4 * MiB),
    intel("28f640j5", 0x0015, 8 * MiB),
    intel("28f320j3", 0x0016, 4 * MiB),
    intel("28f640j3", 0x0017, 8 * MiB),
    intel("28f128j3", 0x0018, 16 * MiB),
    intel("28f256j3", 0x001D, 32 * MiB),
};

template <class Part>
const Part* findByName(std::span<const Part> parts, std::string_view name) {
  const auto place =
      std::find_if(parts.begin(), parts.end(), [&](const Part& one) { return BsdlWords::same(one.name, name); });
  return place == parts.end() ? nullptr : &*place;
}

}  // namespace

namespace FlashParts {

std::span<const SpiFlashPart> spi() { return spiParts; }

std::span<const BpiFlashPart> bpi() { return bpiParts; }

const SpiFlashPart* findSpi(std::string_view name) { return findByName(spi(), name); }

const BpiFlashPart* findBpi(std::string_view name) { return findByName(bpi(), name); }

const SpiFlashPart* findSpiById(std::uint32_t jedecId) {
  const auto parts = spi();
  const auto place =
      std::find_if(parts.begin(), parts.end(), [&](const SpiFlashPart& one) { return one.jedecId == jedecId; });
  return place == parts.end() ? nullptr : &*place;
}

}  // namespace FlashParts
