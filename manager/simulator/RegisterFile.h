#pragma once

#include <deque>
#include <functional>
#include <map>
#include <optional>
#include <set>
#include <string>

#include "manager/parts/Part.h"
#include "manager/simulator/DeviceStatus.h"
#include "manager/simulator/StateVisitor.h"
#include "manager/simulator/TapDevice.h"

/// The named registers of a part. Written values stay; eFuse bits can only be set. Monitors show fixed quantities.
class RegisterFile {
 public:
  using Computed = std::function<BitVector()>;

  RegisterFile(PartPointer part, DeviceStatus& status);

  /// A register whose value another model knows; it is not stored. Before `define`.
  void compute(const std::string& name, Computed value) { computed_[name] = std::move(value); }
  /// Defines the instructions of all registers but those in `taken`, which gets their names.
  void define(TapDevice& tap, std::set<std::string>& taken);
  /// What an erasure of the device does to its registers.
  void erase();
  /// The bits of a stored register; null when the part has none of that name.
  BitVector* find(const std::string& name);
  /// Sets a field of a monitor to a quantity in the field's unit. False when there is no such field.
  bool setMonitor(const std::string& field, double quantity);
  void visit(const std::string& prefix, StateVisitor& visitor);

 private:
  /// A register has one shift register for reads and one for writes; they stay where they are.
  struct Entry {
    const NamedRegister& definition;
    BitVector value;
    ShiftRegister reader;
    ShiftRegister writer;
    ShiftRegister both;
  };

  BitVector read(const Entry& entry) const;
  void write(Entry& entry, const BitVector& bits);
  /// Whether a fuse of "efuse_control" is blown.
  bool isBlown(std::size_t controlBit) const;
  bool isLocked(const std::string& name) const;
  void applySecurity();

  PartPointer part_;
  DeviceStatus& status_;
  std::map<std::string, Computed> computed_;
  std::deque<Entry> entries_;
};
