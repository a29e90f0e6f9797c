#pragma once

#include <set>
#include <string>
#include <vector>

#include "manager/parts/Part.h"
#include "manager/simulator/Nets.h"
#include "manager/simulator/TapDevice.h"

/// A device's boundary register and the pins behind it.
class Boundary {
 public:
  /// `device` is the position in the chain.
  Boundary(PartPointer part, std::size_t device, Nets& nets);

  /// Defines EXTEST, SAMPLE, PRELOAD, INTEST and CLAMP; `taken` gets their names.
  void define(TapDevice& tap, std::set<std::string>& taken);
  /// The core has the pins again.
  void release() { setDriving(false); }

 private:
  enum class Role { input, output, control, internal };
  struct Cell {
    Role role = Role::internal;
    bool drives = false;  ///< an output
    std::size_t net = 0;  ///< of input and output cells
    int control = -1;
    bool disabled = false;  ///< the control cell's level that switches this output off
  };

  Cell makeCell(const BoundaryCell& cell, std::size_t device);
  BitVector levels() const;
  void update(const BitVector& bits);
  void setDriving(bool driving);
  void drive();

  PartPointer part_;
  std::size_t device_;
  Nets& nets_;
  std::vector<Cell> cells_;
  BitVector latch_;
  bool driving_ = false;
  ShiftRegister register_;
};
