#include "manager/simulator/TapDevice.h"

TapDevice::TapDevice(PartPointer part, std::function<void()> resetDone)
    : part_(std::move(part)),
      resetDone_(std::move(resetDone)),
      ir_(
          part_->irLength, [this] { return part_->irCapture.value; },
          [this](const BitVector& opcode) { decode(opcode); }) {
  instructions_.push_back({.name = "BYPASS"});
}

void TapDevice::define(Instruction instruction) {
  const auto opcodes = part_->opcodes.find(instruction.name);
  if (opcodes == part_->opcodes.end()) return;
  for (const BitVector& opcode : opcodes->second) opcodes_.emplace_back(opcode, instructions_.size());
  if (instruction.name == "IDCODE") afterReset_ = instructions_.size();
  instructions_.push_back(std::move(instruction));
}

void TapDevice::reset() {
  select(afterReset_);
  resetDone_();
}

void TapDevice::idleEntered() {
  const auto& act = instructions_[current_].idleEntered;
  if (act) act();
}

void TapDevice::idle(std::uint64_t clocks) {
  const auto& act = instructions_[current_].idle;
  if (act) act(clocks);
}

void TapDevice::decode(const BitVector& opcode) {
  for (const auto& [code, instruction] : opcodes_)
    if (code == opcode) return select(instruction);
  select(0);
}

void TapDevice::select(std::size_t instruction) {
  if (instructions_[current_].left) instructions_[current_].left();
  current_ = instruction;
  const Instruction& now = instructions_[current_];
  selected_ = now.reg == nullptr ? &bypass_ : now.reg;
  if (now.loaded) now.loaded();
}
