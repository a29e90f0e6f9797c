#include "manager/simulator/EraseInstruction.h"

EraseInstruction::EraseInstruction(KeyedInstruction instruction, double time, DeviceStatus& status)
    : instruction_(std::move(instruction)),
      time_(time),
      status_(status),
      register_(instruction_.bits, ShiftRegister::Captured(), [this](const BitVector& key) { arm(key); }) {}

void EraseInstruction::define(TapDevice& tap) {
  tap.define({.name = instruction_.name,
              .reg = instruction_.bits > 0 ? &register_ : nullptr,
              .loaded = [this] { armed_ = instruction_.bits == 0; },
              .left = [this] { armed_ = false; },
              .idleEntered = [this] { erase(); }});
}

void EraseInstruction::arm(const BitVector& key) {
  armed_ = !instruction_.key || key == *instruction_.key;
  if (!armed_) status_.error = true;
}

void EraseInstruction::erase() {
  if (!armed_) return;
  armed_ = false;
  if (!status_.enabled || status_.busy()) {
    status_.error = true;
    return;
  }
  for (const Action& act : actions_) act();
  status_.error = false;
  status_.beBusy(time_);
}
