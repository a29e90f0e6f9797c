#include "manager/simulator/AmdFlash.h"

namespace {

constexpr std::uint32_t unlockAddress1 = 0x555;
constexpr std::uint32_t unlockAddress2 = 0x2AA;
constexpr std::uint16_t unlockData1 = 0xAA;
constexpr std::uint16_t unlockData2 = 0x55;
constexpr std::uint16_t resetCommand = 0xF0;
constexpr std::uint16_t abortedBit = 0x02;

}  // namespace

std::uint16_t AmdFlash::read(std::uint32_t address) {
  if (busy()) return status();
  switch (state_) {
    case State::id:
      if ((address & 0xFFU) == 0) return part_.maker;
      return (address & 0xFFU) == 1 ? part_.device : std::uint16_t{0};
    case State::query:
      return query(address & 0xFFU);
    case State::aborted:
      return static_cast<std::uint16_t>(status() | abortedBit);
    default:
      return word(address);
  }
}

/// Bit 7 is the inverse of the data's, bit 6 toggles at each read.
std::uint16_t AmdFlash::status() {
  toggle_ = !toggle_;
  return static_cast<std::uint16_t>((~unsigned{lastData_} & 0x80U) | (toggle_ ? 0x40U : 0U));
}

void AmdFlash::write(std::uint32_t address, std::uint16_t data) {
  if (busy()) return;
  using Step = void (AmdFlash::*)(std::uint32_t, std::uint16_t);
  const auto unlock2 = [&](State next) {
    state_ = isCommandAddress(address, unlockAddress2) && data == unlockData2 ? next : State::array;
  };
  static constexpr Step steps[] = {&AmdFlash::begin,  &AmdFlash::begin,   &AmdFlash::begin,   &AmdFlash::begin,
                                   nullptr,           &AmdFlash::command, &AmdFlash::program, nullptr,
                                   nullptr,           &AmdFlash::erase,   &AmdFlash::count,   &AmdFlash::fill,
                                   &AmdFlash::confirm};
  if (state_ == State::unlock1) return unlock2(State::unlock2);
  if (state_ == State::erase2) return unlock2(State::erase3);
  if (state_ == State::erase1) {
    state_ = isCommandAddress(address, unlockAddress1) && data == unlockData1 ? State::erase2 : State::array;
    return;
  }
  const Step step = steps[static_cast<std::size_t>(state_)];
  (this->*step)(address, data);
}

void AmdFlash::begin(std::uint32_t address, std::uint16_t data) {
  if (isCommandAddress(address, unlockAddress1) && data == unlockData1) {
    // An aborted buffer is left by unlocked reset only; this is its first cycle.
    state_ = State::unlock1;
  } else if (state_ == State::aborted) {
    return;
  } else if ((address & 0xFFU) == 0x55 && data == 0x98) {
    state_ = State::query;
  } else if (data == resetCommand) {
    state_ = State::array;
  }
}

void AmdFlash::command(std::uint32_t address, std::uint16_t data) {
  struct Command {
    std::uint16_t data;
    State next;
  };
  static constexpr Command commands[] = {
      {0x90, State::id}, {0xA0, State::program}, {0x80, State::erase1}, {resetCommand, State::array}};
  state_ = State::array;
  if (data == 0x25 && bufferWords() > 0) {
    state_ = State::count;
    return;
  }
  if (!isCommandAddress(address, unlockAddress1) && data != resetCommand) return;
  for (const Command& row : commands)
    if (row.data == data) state_ = row.next;
}

void AmdFlash::program(std::uint32_t address, std::uint16_t data) {
  programWord(address, data);
  beBusy(times_.program);
  lastData_ = data;
  state_ = State::array;
}

void AmdFlash::erase(std::uint32_t address, std::uint16_t data) {
  state_ = State::array;
  lastData_ = 0xFFFF;
  if (data == 0x30) eraseSector(address);
  if (data == 0x10 && isCommandAddress(address, unlockAddress1)) eraseChip();
}

void AmdFlash::count(std::uint32_t address, std::uint16_t data) {
  const std::uint32_t words = std::uint32_t{data} + 1;
  state_ = words > bufferWords() ? State::aborted : State::fill;
  bufferPending_ = words;
  sector_ = sectorOf(address);
}

void AmdFlash::fill(std::uint32_t address, std::uint16_t data) {
  if (bufferPending_ > 0) {
    startBuffer(address, bufferPending_);
    bufferPending_ = 0;
  }
  lastData_ = data;
  if (sectorOf(address) != sector_ || !fillBuffer(address, data)) {
    state_ = State::aborted;
  } else if (bufferLeft() == 0) {
    state_ = State::confirm;
  }
}

void AmdFlash::confirm(std::uint32_t address, std::uint16_t data) {
  const bool right = data == 0x29 && sectorOf(address) == sector_;
  state_ = right ? State::array : State::aborted;
  if (right) writeBuffer();
}
