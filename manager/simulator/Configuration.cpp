#include "manager/simulator/Configuration.h"

#include "manager/content/Bitstream.h"

namespace {

/// So many clocks in Run-Test/Idle does a start-up take.
constexpr std::uint64_t clocksOfStart = 16;

}  // namespace

Configuration::Configuration(PartPointer part, std::uint32_t idcode, DeviceStatus& status, const BitVector* flash)
    : part_(std::move(part)),
      idcode_(idcode),
      status_(status),
      flash_(flash),
      memory_(part_->memoryBits, true),
      in_(part_->memoryBits, ShiftRegister::Captured(), [this](const BitVector& bits) { write(bits); }),
      out_(part_->memoryBits, [this] { return read(); }) {}

void Configuration::define(TapDevice& tap) {
  tap.define({.name = "CFG_IN", .reg = &in_});
  tap.define({.name = "CFG_OUT", .reg = &out_});
  tap.define({.name = "CFG_START",
              .loaded =
                  [this] {
                    startPending_ = true;
                    startClocks_ = 0;
                  },
              .left = [this] { startPending_ = false; },
              .idle = [this](std::uint64_t clocks) { countToStart(clocks); }});
  tap.define({.name = "CFG_LOAD", .idleEntered = [this] { loadFromFlash(); }});
}

void Configuration::erase() {
  memory_.fill(true);
  run(false);
}

void Configuration::startUp() {
  run(isValid(memory_));
  status_.error = !status_.done;
}

void Configuration::run(bool valid) {
  status_.done = valid;
  usercode_ = valid ? Bitstream::header(memory_.slice(0, Bitstream::headerBytes * 8).bytes())->usercode : 0xFFFFFFFF;
}

void Configuration::loadFromFlash() {
  if (flash_ == nullptr || status_.busy() || !isValid(*flash_)) {
    status_.error = flash_ != nullptr;
    return;
  }
  memory_ = *flash_;
  startUp();
}

void Configuration::visit(const std::string& prefix, StateVisitor& visitor) {
  visitor.visit(prefix + "configuration", memory_);
  BitVector running = BitVector::fromNumber(status_.done ? 1 : 0, 1);
  visitor.visit(prefix + "running", running);
  run(running.get(0) && isValid(memory_));
}

void Configuration::write(const BitVector& bits) {
  if (!status_.enabled || status_.busy()) {
    status_.error = true;
    return;
  }
  memory_ = bits;
  run(false);
}

BitVector Configuration::read() const { return status_.readProtected ? BitVector(memory_.size()) : memory_; }

bool Configuration::isValid(const BitVector& bits) const {
  return Bitstream::isValid(bits.bytes(), idcode_, part_->memoryBits / 8, nullptr);
}

void Configuration::countToStart(std::uint64_t clocks) {
  if (!startPending_) return;
  startClocks_ += clocks;
  if (startClocks_ < clocksOfStart) return;
  startPending_ = false;
  startUp();
}
