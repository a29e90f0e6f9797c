#include "manager/simulator/TapChain.h"

#include <algorithm>

namespace {

/// A run is shifted through all devices piece by piece, so that a piece stays in the processor's cache.
constexpr std::size_t pieceBits = std::size_t{1} << 17;

}  // namespace

void TapChain::clock(bool tms, const BitVector& tdi, BitVector* tdo) {
  for (std::size_t i = 0; i < tdi.size(); ++i) {
    if (stays(tms)) return stay(tdi, i, tdo);
    const bool level = clockOnce(tms, tdi.get(i));
    if (tdo != nullptr) tdo->append(level);
  }
}

void TapChain::idleClocks(bool tms, std::uint64_t count) {
  for (; count > 0 && !(stays(tms) && !shifting()); --count) clockOnce(tms, false);
  if (count == 0) return;
  pass(count);
  if (state_ == TapState::idle)
    for (TapDevice* device : devices_) device->idle(count);
}

bool TapChain::clockOnce(bool tms, bool tdi) {
  const bool level = tdo();
  if (shifting() && !held_) {
    bit_.set(0, tdi);
    shiftThrough(bit_);
  }
  pass(1);
  if (held_) return level;
  const TapState to = Tap::next(state_, tms);
  if (to != state_) {
    leave();
    enter(to);
  } else if (state_ == TapState::idle) {
    for (TapDevice* device : devices_) device->idle(1);
  }
  return level;
}

void TapChain::reset() { enter(TapState::reset); }

bool TapChain::tdo() const {
  if (!shifting() || devices_.empty()) return true;
  return registerOf(*devices_.back()).next();
}

DataRegister& TapChain::registerOf(TapDevice& device) const {
  return state_ == TapState::irShift ? device.instructionRegister() : device.dataRegister();
}

void TapChain::stay(const BitVector& tdi, std::size_t first, BitVector* tdo) {
  const std::size_t count = tdi.size() - first;
  if (!shifting() || devices_.empty() || held_) {
    if (tdo != nullptr) tdo->appendFill(count, true);
    return idleClocks(state_ == TapState::reset, count);
  }
  if (first == 0 && count <= pieceBits) return shift(tdi, tdo);
  for (; first < tdi.size(); first += pieceBits) shift(tdi.slice(first, std::min(pieceBits, tdi.size() - first)), tdo);
}

void TapChain::shift(const BitVector& tdi, BitVector* tdo) {
  const BitVector& out = shiftThrough(tdi);
  pass(tdi.size());
  if (tdo != nullptr) tdo->append(out);
}

const BitVector& TapChain::shiftThrough(const BitVector& tdi) {
  const BitVector* in = &tdi;
  std::size_t next = 0;
  for (TapDevice* device : devices_) {
    BitVector& out = buffers_[next];
    out.resize(tdi.size());
    registerOf(*device).shift(*in, out);
    in = &out;
    next = 1 - next;
  }
  return *in;
}

void TapChain::leave() {
  if (state_ == TapState::drCapture)
    for (TapDevice* device : devices_) device->dataRegister().capture();
  if (state_ == TapState::irCapture)
    for (TapDevice* device : devices_) device->instructionRegister().capture();
}

void TapChain::enter(TapState state) {
  state_ = state;
  for (TapDevice* device : devices_) {
    if (state == TapState::drUpdate) device->dataRegister().update();
    if (state == TapState::irUpdate) device->instructionRegister().update();
    if (state == TapState::reset) device->reset();
    if (state == TapState::idle) device->idleEntered();
  }
}
