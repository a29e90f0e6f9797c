#include "manager/simulator/PagedMemory.h"

#include <algorithm>

PagedMemory::PagedMemory(const IscModel& model, DeviceStatus& status)
    : model_(model),
      status_(status),
      array_(model.pages * model.bits, true),
      buffer_(model.bits, true),
      addressRegister_(
          model.addressBits,
          [this] { return BitVector::fromNumber(address_, std::min(model_.addressBits, BitVector::wordBits)); },
          [this](const BitVector& bits) { address_ = bits.number(0, std::min(bits.size(), BitVector::wordBits)); }),
      dataRegister_(
          model.bits, [this] { return buffer_; },
          [this](const BitVector& bits) {
            buffer_ = bits;
            programArmed_ = model_.programTakesData;
          }),
      readRegister_(model.bits, [this] { return readPage(); }) {}

void PagedMemory::define(TapDevice& tap) {
  tap.define({.name = model_.address, .reg = &addressRegister_});
  if (!model_.programTakesData) tap.define({.name = model_.data, .reg = &dataRegister_});
  tap.define({.name = model_.program,
              .reg = model_.programTakesData ? &dataRegister_ : nullptr,
              .loaded = [this] { programArmed_ = !model_.programTakesData; },
              .left = [this] { programArmed_ = false; },
              .idleEntered = [this] { program(); }});
  tap.define({.name = model_.read, .reg = &readRegister_});
}

bool PagedMemory::refused() {
  if (status_.enabled && !status_.busy()) return false;
  status_.error = true;
  return true;
}

bool PagedMemory::findPage(std::size_t& place) {
  if (address_ % model_.addressStep != 0 || address_ / model_.addressStep >= model_.pages) {
    status_.error = true;
    return false;
  }
  place = static_cast<std::size_t>(address_ / model_.addressStep) * model_.bits;
  return true;
}

void PagedMemory::program() {
  if (!programArmed_) return;
  programArmed_ = false;
  std::size_t place = 0;
  if (refused() || !findPage(place)) return;
  if (status_.writeProtected) {
    status_.error = true;
    return;
  }
  BitVector page = array_.slice(place, model_.bits);
  for (std::size_t i = 0; i < page.words().size(); ++i) page.words()[i] &= buffer_.words()[i];
  array_.copy(place, page, 0, model_.bits);
  status_.beBusy(model_.programTime);
}

BitVector PagedMemory::readPage() {
  std::size_t place = 0;
  if (refused() || status_.readProtected || !findPage(place)) return BitVector(model_.bits);
  return array_.slice(place, model_.bits);
}
