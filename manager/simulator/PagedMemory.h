#pragma once

#include "manager/simulator/DeviceStatus.h"
#include "manager/simulator/IscModel.h"
#include "manager/simulator/TapDevice.h"

/// An ISC memory of pages behind an address register and a page buffer. Erased bits are ones; programming only clears
/// bits. A refused operation sets the error bit of the status and changes nothing; a refused read gives zeros.
class PagedMemory {
 public:
  /// `model` has pages.
  PagedMemory(const IscModel& model, DeviceStatus& status);

  void define(TapDevice& tap);
  void erase() { array_.fill(true); }
  /// All pages one behind the other.
  BitVector& array() { return array_; }
  const BitVector& array() const { return array_; }

 private:
  bool refused();
  /// The place of the addressed page in the array; false when there is no such page.
  bool findPage(std::size_t& place);
  void program();
  BitVector readPage();

  IscModel model_;
  DeviceStatus& status_;
  BitVector array_;
  std::uint64_t address_ = 0;
  BitVector buffer_;
  bool programArmed_ = false;
  ShiftRegister addressRegister_;
  ShiftRegister dataRegister_;
  ShiftRegister readRegister_;
};
