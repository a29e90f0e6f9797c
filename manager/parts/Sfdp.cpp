#include "manager/parts/Sfdp.h"

#include <bit>

namespace {

constexpr std::uint32_t signature = 0x50444653;  // "SFDP"
constexpr std::size_t headerBytes = 8;           // of the whole, and of each table
constexpr std::size_t tableAt = 0x30;
constexpr std::uint32_t tableWords = 16;
constexpr std::uint32_t leastWords = 9;
constexpr std::uint32_t basicTable = 0xFF00;
constexpr std::uint32_t reachOfThreeBytes = 16U << 20U;
constexpr std::uint32_t preferredSector = 64U << 10U;

std::uint32_t word(std::span<const std::uint8_t> content, std::size_t at) {
  std::uint32_t value = 0;
  for (std::size_t i = 0; i < 4 && at + i < content.size(); ++i)
    value |= static_cast<std::uint32_t>(content[at + i]) << (8 * i);
  return value;
}

void setWord(std::vector<std::uint8_t>& content, std::size_t at, std::uint32_t value) {
  for (std::size_t i = 0; i < 4; ++i) content[at + i] = static_cast<std::uint8_t>(value >> (8 * i));
}

/// Words of a table, counted from 1 as its description does; zero beyond its end.
class Table {
 public:
  Table(std::span<const std::uint8_t> content, std::size_t at, std::uint32_t words)
      : content_(content), at_(at), words_(words) {}
  std::uint32_t operator[](std::uint32_t number) const {
    return number <= words_ ? word(content_, at_ + 4 * (std::size_t{number} - 1)) : 0;
  }
  std::uint32_t words() const { return words_; }

 private:
  std::span<const std::uint8_t> content_;
  std::size_t at_;
  std::uint32_t words_;
};

/// The table of the newest version stands last.
std::optional<Table> findTable(std::span<const std::uint8_t> content) {
  if (content.size() < 2 * headerBytes || word(content, 0) != signature) return std::nullopt;
  const std::size_t headers = std::size_t{content[6]} + 1;
  std::optional<Table> result;
  for (std::size_t i = 1; i <= headers && (i + 1) * headerBytes <= content.size(); ++i) {
    const std::uint32_t head = word(content, i * headerBytes);
    const std::uint32_t place = word(content, i * headerBytes + 4);
    const std::uint32_t id = (place >> 24U) << 8U | (head & 0xFFU);
    const std::size_t at = place & 0xFFFFFFU;
    const std::uint32_t words = head >> 24U;
    const bool whole = at + 4 * std::size_t{words} <= content.size();
    if (id == basicTable && words >= leastWords && whole) result.emplace(content, at, words);
  }
  return result;
}

/// Bytes; 0 for a size that no 32-bit number holds.
std::uint32_t sizeOf(std::uint32_t density) {
  if ((density & 0x80000000U) == 0) return (density >> 3U) + 1;
  const std::uint32_t exponent = density & 0x7FFFFFFFU;
  return exponent >= 3 && exponent < 35 ? 1U << (exponent - 3) : 0;
}

void chooseErase(const Table& table, Sfdp::Geometry& geometry) {
  const std::uint32_t kinds[] = {table[8] & 0xFFFFU, table[8] >> 16U, table[9] & 0xFFFFU, table[9] >> 16U};
  for (const std::uint32_t kind : kinds) {
    const std::uint32_t exponent = kind & 0xFFU;
    if (exponent == 0 || exponent > 31) continue;
    const std::uint32_t size = 1U << exponent;
    const std::uint32_t chosen = geometry.sectorSize;
    const bool better = chosen == 0 || (size <= preferredSector ? size > chosen || chosen > preferredSector
                                                                : size < chosen && chosen > preferredSector);
    if (!better) continue;
    geometry.sectorSize = size;
    geometry.eraseCommand = static_cast<std::uint8_t>(kind >> 8U);
  }
}

}  // namespace

namespace Sfdp {

std::vector<std::uint8_t> build(const SpiFlashPart& part) {
  std::vector<std::uint8_t> content(bytes, 0xFF);
  setWord(content, 0, signature);
  setWord(content, 4, 0xFF000106);  // version 1.6, one table
  setWord(content, 8, tableWords << 24U | 0x010600);
  setWord(content, 12, 0xFF000000 | tableAt);
  const auto set = [&](std::uint32_t number, std::uint32_t value) {
    setWord(content, tableAt + 4 * (std::size_t{number} - 1), value);
  };
  for (std::uint32_t number = 1; number <= tableWords; ++number) set(number, 0);
  const bool small = part.sectorSize == 4096;
  const std::uint32_t smallErase = small ? part.eraseCommand : 0xFFU;
  const std::uint32_t addressBytes = part.fourByteAddress ? 1 : 0;  // three or four; three
  set(1, 0xFF800000 | addressBytes << 17U | smallErase << 8U | 0xE4U | (small ? 1U : 3U));
  set(2, part.size > reachOfThreeBytes * 16 ? 0x80000000U | static_cast<std::uint32_t>(std::bit_width(part.size) + 2)
                                            : part.size * 8 - 1);
  set(8, static_cast<std::uint32_t>(part.eraseCommand) << 8U |
             static_cast<std::uint32_t>(std::countr_zero(part.sectorSize)));
  set(11, static_cast<std::uint32_t>(std::countr_zero(part.pageSize)) << 4U);
  // Four-byte mode is entered by B7, left by E9; there is a reset by 66 and 99.
  set(16, part.fourByteAddress ? 0x01004010U | 0x1000U : 0x1000U);
  return content;
}

std::optional<Geometry> decode(std::span<const std::uint8_t> content) {
  const std::optional<Table> table = findTable(content);
  if (!table) return std::nullopt;
  Geometry geometry;
  geometry.size = sizeOf((*table)[2]);
  const std::uint32_t pageExponent = (*table)[11] >> 4U & 0xFU;
  geometry.pageSize = table->words() >= 11 ? 1U << pageExponent : 256;
  geometry.fourByteAddress = geometry.size > reachOfThreeBytes;
  chooseErase(*table, geometry);
  const bool sensible = geometry.sectorSize != 0 && std::has_single_bit(geometry.size) &&
                        geometry.size % geometry.sectorSize == 0 && geometry.pageSize <= geometry.sectorSize;
  return sensible ? std::optional(geometry) : std::nullopt;
}

}  // namespace Sfdp
