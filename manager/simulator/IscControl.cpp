#include "manager/simulator/IscControl.h"

IscControl::IscControl(const Part& part, const IscModel& model, DeviceStatus& status)
    : model_(model),
      enable_(IscModels::keyed(part, model.enable)),
      status_(status),
      enableRegister_(enable_.bits, ShiftRegister::Captured(), [this](const BitVector& key) { enable(key); }),
      statusRegister_(model.statusBits, [this] { return statusBits(); }) {}

void IscControl::define(TapDevice& tap) {
  const bool byRegister = enable_.bits > 0;
  tap.define({.name = model_.enable, .reg = byRegister ? &enableRegister_ : nullptr, .loaded = [this, byRegister] {
                if (!byRegister) enable(BitVector());
              }});
  tap.define({.name = model_.disable, .loaded = [this] { status_.enabled = false; }});
  if (model_.statusBits > 0) tap.define({.name = model_.status, .reg = &statusRegister_});
}

void IscControl::enable(const BitVector& key) {
  status_.error = enable_.bits > 0 && enable_.key && key != *enable_.key;
  if (!status_.error) status_.enabled = true;
}

BitVector IscControl::statusBits() const {
  BitVector bits = BitVector::fromNumber(status_.byte(), 8);
  bits.resize(model_.statusBits);
  if (!model_.statusMask) return bits;
  for (std::size_t i = 0; i < bits.size(); ++i)
    if (model_.statusMask->get(i)) bits.set(i, model_.statusBusy->get(i) == status_.busy());
  return bits;
}
