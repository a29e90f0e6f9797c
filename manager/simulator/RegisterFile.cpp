#include "manager/simulator/RegisterFile.h"

#include <algorithm>
#include <cmath>
#include <string_view>

namespace {

// Of "security".
constexpr std::size_t readProtectBit = 0;
constexpr std::size_t writeProtectBit = 1;
// Of "efuse_control".
constexpr std::size_t keyReadDisabledBit = 0;
constexpr std::size_t keyWriteDisabledBit = 1;
constexpr std::size_t controlWriteDisabledBit = 2;

/// How registers differ from plain storage.
struct Habit {
  std::string_view name;
  bool ones;         ///< holds ones when new
  bool erased;       ///< an erasure makes it new again
  bool setOnly;      ///< a write only sets bits
  bool protectable;  ///< a write is refused while the device is write-protected
};

constexpr Habit habits[] = {
    {"usercode", true, true, false, true},        {"ues", true, true, false, true},
    {"customer_code", true, false, false, true},  {"options", true, false, false, true},
    {"security", false, true, true, false},       {"efuse", false, false, true, false},
    {"efuse_control", false, false, true, false},
};

const Habit& habitOf(std::string_view name) {
  static constexpr Habit plain = {"", false, false, false, false};
  const auto* found =
      std::find_if(std::begin(habits), std::end(habits), [&](const Habit& h) { return h.name == name; });
  return found == std::end(habits) ? plain : *found;
}

BitVector orOf(const BitVector& left, const BitVector& right) {
  BitVector result = left;
  for (std::size_t i = 0; i < result.words().size(); ++i) result.words()[i] |= right.words()[i];
  return result;
}

/// A room-temperature board with usual supplies.
double usualQuantity(const RegisterField& field) {
  if (field.unit == "C") return 25.0;
  return field.name.find("aux") != std::string::npos ? 2.5 : 1.0;
}

void setField(BitVector& bits, const RegisterField& field, double quantity) {
  const std::size_t length = std::min<std::size_t>(field.length, 32);
  if (field.first + length > bits.size()) return;
  const double highest = std::exp2(static_cast<double>(length)) - 1;
  const double raw = std::clamp(std::round((quantity - field.offset) / field.scale), 0.0, highest);
  bits.setNumber(field.first, length, static_cast<std::uint64_t>(raw));
}

}  // namespace

RegisterFile::RegisterFile(PartPointer part, DeviceStatus& status) : part_(std::move(part)), status_(status) {
  for (const NamedRegister& definition : part_->registers) {
    const std::size_t at = entries_.size();
    const auto captured = [this, at] { return read(entries_[at]); };
    const auto updated = [this, at](const BitVector& bits) { write(entries_[at], bits); };
    const std::size_t length = definition.length;
    entries_.push_back({definition, BitVector(length, habitOf(definition.name).ones), ShiftRegister(length, captured),
                        ShiftRegister(length, ShiftRegister::Captured(), updated),
                        ShiftRegister(length, captured, updated)});
    for (const RegisterField& field : definition.fields)
      if (field.scale != 0) setField(entries_[at].value, field, usualQuantity(field));
  }
}

void RegisterFile::define(TapDevice& tap, std::set<std::string>& taken) {
  for (Entry& entry : entries_) {
    const NamedRegister& definition = entry.definition;
    const bool both = definition.instruction == definition.writeInstruction;
    if (taken.insert(definition.instruction).second)
      tap.define({.name = definition.instruction, .reg = both ? &entry.both : &entry.reader});
    if (!definition.writeInstruction.empty() && taken.insert(definition.writeInstruction).second)
      tap.define({.name = definition.writeInstruction, .reg = &entry.writer});
  }
}

void RegisterFile::erase() {
  for (Entry& entry : entries_) {
    const Habit& habit = habitOf(entry.definition.name);
    if (habit.erased) entry.value.fill(habit.ones);
  }
  applySecurity();
}

BitVector* RegisterFile::find(const std::string& name) {
  for (Entry& entry : entries_)
    if (entry.definition.name == name && computed_.count(name) == 0) return &entry.value;
  return nullptr;
}

bool RegisterFile::setMonitor(const std::string& fieldName, double quantity) {
  for (Entry& entry : entries_)
    for (const RegisterField& field : entry.definition.fields) {
      if (field.name != fieldName || field.scale == 0) continue;
      setField(entry.value, field, quantity);
      return true;
    }
  return false;
}

void RegisterFile::visit(const std::string& prefix, StateVisitor& visitor) {
  for (Entry& entry : entries_)
    if (computed_.count(entry.definition.name) == 0 && !entry.definition.writeInstruction.empty())
      visitor.visit(prefix + "register " + entry.definition.name, entry.value);
  applySecurity();
}

BitVector RegisterFile::read(const Entry& entry) const {
  const auto computed = computed_.find(entry.definition.name);
  if (computed != computed_.end()) {
    BitVector bits = computed->second();
    bits.resize(entry.definition.length);
    return bits;
  }
  const bool hidden = entry.definition.name == "efuse" && isBlown(keyReadDisabledBit);
  return hidden ? BitVector(entry.value.size()) : entry.value;
}

bool RegisterFile::isBlown(std::size_t controlBit) const {
  for (const Entry& entry : entries_)
    if (entry.definition.name == "efuse_control") return controlBit < entry.value.size() && entry.value.get(controlBit);
  return false;
}

bool RegisterFile::isLocked(const std::string& name) const {
  if (name == "efuse") return isBlown(keyWriteDisabledBit);
  if (name == "efuse_control") return isBlown(controlWriteDisabledBit);
  return habitOf(name).protectable && status_.writeProtected;
}

void RegisterFile::write(Entry& entry, const BitVector& bits) {
  const Habit& habit = habitOf(entry.definition.name);
  if (isLocked(entry.definition.name)) {
    status_.error = true;
    return;
  }
  entry.value = habit.setOnly ? orOf(entry.value, bits) : bits;
  if (entry.definition.name == "security") applySecurity();
}

void RegisterFile::applySecurity() {
  const BitVector* security = find("security");
  if (security == nullptr || security->size() <= writeProtectBit) return;
  status_.readProtected = security->get(readProtectBit);
  status_.writeProtected = security->get(writeProtectBit);
}
