#include "manager/simulator/BpiFlash.h"

#include <algorithm>
#include <bit>

#include "manager/simulator/AmdFlash.h"
#include "manager/simulator/IntelFlash.h"

std::unique_ptr<BpiFlash> BpiFlash::make(const BpiFlashPart& part, const Times& times, const BoardClock& clock,
                                         bool endless) {
  if (part.commands == BpiFlashPart::Commands::amd) return std::make_unique<AmdFlash>(part, times, clock, endless);
  return std::make_unique<IntelFlash>(part, times, clock, endless);
}

BpiFlash::BpiFlash(const BpiFlashPart& part, const Times& times, const BoardClock& clock, bool endless)
    : part_(part),
      times_(times),
      clock_(clock),
      endless_(endless),
      words_(part.size / 2),
      sectorWords_(part.sectorSize / 2),
      memory_(part.size, 0xFF),
      buffer_(std::max<std::size_t>(part.bufferSize / 2, 1), 0xFFFF) {
  fillQuery();
}

void BpiFlash::beBusy(double seconds) {
  started_ = true;
  busyUntil_ = clock_.now() + seconds;
}

std::uint16_t BpiFlash::word(std::uint32_t address) const {
  const std::size_t place = std::size_t{address % words_} * 2;
  return static_cast<std::uint16_t>(memory_[place] | memory_[place + 1] << 8);
}

void BpiFlash::programWord(std::uint32_t address, std::uint16_t data) {
  const std::size_t place = std::size_t{address % words_} * 2;
  memory_[place] &= static_cast<std::uint8_t>(data);
  memory_[place + 1] &= static_cast<std::uint8_t>(data >> 8);
}

void BpiFlash::eraseSector(std::uint32_t address) {
  const auto first = static_cast<std::ptrdiff_t>(std::size_t{sectorOf(address)} * part_.sectorSize);
  std::fill_n(memory_.begin() + first, part_.sectorSize, std::uint8_t{0xFF});
  beBusy(times_.eraseSector);
}

void BpiFlash::eraseChip() {
  std::fill(memory_.begin(), memory_.end(), std::uint8_t{0xFF});
  beBusy(times_.eraseChip);
}

void BpiFlash::startBuffer(std::uint32_t address, std::uint32_t words) {
  bufferPage_ = address / bufferWords() * bufferWords();
  bufferLeft_ = words;
  std::fill(buffer_.begin(), buffer_.end(), std::uint16_t{0xFFFF});
}

bool BpiFlash::fillBuffer(std::uint32_t address, std::uint16_t data) {
  if (address < bufferPage_ || address - bufferPage_ >= buffer_.size()) return false;
  buffer_[address - bufferPage_] = data;
  --bufferLeft_;
  return true;
}

void BpiFlash::writeBuffer() {
  for (std::uint32_t i = 0; i < buffer_.size(); ++i) programWord(bufferPage_ + i, buffer_[i]);
  beBusy(times_.buffer);
}

void BpiFlash::fillQuery() {
  const bool amd = part_.commands == BpiFlashPart::Commands::amd;
  const auto power = [](std::uint32_t number) { return static_cast<std::uint16_t>(std::bit_width(number) - 1); };
  const std::uint32_t sectors = part_.size / part_.sectorSize - 1;
  const std::uint32_t units = part_.sectorSize / 256;
  query_.assign(0x40, 0);
  const std::vector<std::uint16_t> table = {
      'Q', 'R', 'Y', static_cast<std::uint16_t>(amd ? 2 : 1), 0, 0x40, 0, 0, 0, 0, 0,
      // Supply voltages in BCD, then log2 of times: word and buffer in microseconds, sector and chip in milliseconds;
      // then how much longer each may take.
      0x27, 0x36, 0, 0, 4, 7, 3, 6, 3, 3, 3, 3,
      // Size, bus width of 16, buffer size, one region of equal sectors.
      power(part_.size), 1, 0, power(std::max(part_.bufferSize, 1U)), 0, 1, static_cast<std::uint16_t>(sectors & 0xFF),
      static_cast<std::uint16_t>(sectors >> 8 & 0xFF), static_cast<std::uint16_t>(units & 0xFF),
      static_cast<std::uint16_t>(units >> 8 & 0xFF)};
  std::copy(table.begin(), table.end(), query_.begin() + 0x10);
}
