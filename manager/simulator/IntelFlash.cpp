#include "manager/simulator/IntelFlash.h"

namespace {

constexpr std::uint16_t readyBit = 0x80;
constexpr std::uint16_t eraseProblem = 0x20;
constexpr std::uint16_t programProblem = 0x10;
constexpr std::uint16_t lockedBit = 0x02;
constexpr std::uint16_t sequenceProblem = eraseProblem | programProblem;
constexpr std::uint16_t confirmation = 0xD0;

}  // namespace

std::uint16_t IntelFlash::read(std::uint32_t address) {
  if (busy()) return 0;
  switch (view_) {
    case View::status:
      return static_cast<std::uint16_t>(readyBit | problems_);
    case View::query:
      return query(address & 0xFFU);
    case View::id:
      if ((address & 0xFFU) == 0) return part_.maker;
      if ((address & 0xFFU) == 1) return part_.device;
      return (address & 0xFFU) == 2 && locked_[sectorOf(address)] ? std::uint16_t{1} : std::uint16_t{0};
    case View::array:
      break;
  }
  return word(address);
}

void IntelFlash::write(std::uint32_t address, std::uint16_t data) {
  using Step = void (IntelFlash::*)(std::uint32_t, std::uint16_t);
  static constexpr Step steps[] = {&IntelFlash::command,    &IntelFlash::eraseConfirm, &IntelFlash::programData,
                                   &IntelFlash::lockAction, &IntelFlash::count,        &IntelFlash::fill,
                                   &IntelFlash::confirm};
  const Step step = steps[static_cast<std::size_t>(await_)];
  if (!busy()) (this->*step)(address, data);
}

void IntelFlash::reset() {
  view_ = View::array;
  await_ = Await::command;
  problems_ = 0;
}

void IntelFlash::command(std::uint32_t address, std::uint16_t data) {
  struct Command {
    std::uint16_t data;
    View view;
    Await await;
  };
  static constexpr Command commands[] = {
      {0xFF, View::array, Await::command},       {0x90, View::id, Await::command},
      {0x98, View::query, Await::command},       {0x70, View::status, Await::command},
      {0x20, View::status, Await::eraseConfirm}, {0x40, View::status, Await::programData},
      {0x10, View::status, Await::programData},  {0x60, View::status, Await::lockAction},
      {0xE8, View::status, Await::count},
  };
  if (data == 0x50) problems_ = 0;
  if (data == 0xE8 && bufferWords() == 0) return;
  sector_ = sectorOf(address);
  for (const Command& row : commands) {
    if (row.data != data) continue;
    view_ = row.view;
    await_ = row.await;
  }
}

bool IntelFlash::mayChange(std::uint32_t address, std::uint16_t problem) {
  if (!locked_[sectorOf(address)]) return true;
  problems_ = static_cast<std::uint16_t>(problems_ | problem | lockedBit);
  return false;
}

void IntelFlash::eraseConfirm(std::uint32_t address, std::uint16_t data) {
  await_ = Await::command;
  if (data != confirmation) {
    problems_ |= sequenceProblem;
  } else if (mayChange(address, eraseProblem)) {
    eraseSector(address);
  }
}

void IntelFlash::programData(std::uint32_t address, std::uint16_t data) {
  await_ = Await::command;
  if (!mayChange(address, programProblem)) return;
  programWord(address, data);
  beBusy(times_.program);
}

void IntelFlash::lockAction(std::uint32_t address, std::uint16_t data) {
  await_ = Await::command;
  if (data == 0x01 || data == confirmation) {
    locked_[sectorOf(address)] = data == 0x01;
  } else {
    problems_ |= sequenceProblem;
  }
}

void IntelFlash::count(std::uint32_t /*address*/, std::uint16_t data) {
  bufferPending_ = std::uint32_t{data} + 1;
  await_ = Await::fill;
  if (bufferPending_ <= bufferWords()) return;
  await_ = Await::command;
  problems_ |= sequenceProblem;
}

void IntelFlash::fill(std::uint32_t address, std::uint16_t data) {
  if (bufferPending_ > 0) {
    startBuffer(address, bufferPending_);
    bufferPending_ = 0;
  }
  if (sectorOf(address) != sector_ || !fillBuffer(address, data)) {
    await_ = Await::command;
    problems_ |= sequenceProblem;
  } else if (bufferLeft() == 0) {
    await_ = Await::confirm;
  }
}

void IntelFlash::confirm(std::uint32_t address, std::uint16_t data) {
  await_ = Await::command;
  if (data != confirmation) {
    problems_ |= sequenceProblem;
  } else if (mayChange(address, programProblem)) {
    writeBuffer();
  }
}
