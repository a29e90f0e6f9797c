#pragma once

#include <functional>

#include "manager/parts/Part.h"
#include "manager/simulator/DeviceStatus.h"
#include "manager/simulator/StateVisitor.h"
#include "manager/simulator/TapDevice.h"

/// The configuration memory of an FPGA. The device starts up only on a whole valid bitstream.
class Configuration {
 public:
  /// `flash`, when not null, is the memory inside the part from which it loads itself.
  Configuration(PartPointer part, std::uint32_t idcode, DeviceStatus& status, const BitVector* flash);

  void define(TapDevice& tap);
  void erase();
  /// Checks the memory, and sets the device's done or error bit.
  void startUp();
  /// As at power-up: takes the flash over when it holds a valid bitstream.
  void loadFromFlash();
  /// The running bitstream's; all ones when none runs.
  std::uint32_t usercode() const { return usercode_; }
  BitVector& memory() { return memory_; }
  const BitVector& memory() const { return memory_; }
  void visit(const std::string& prefix, StateVisitor& visitor);

 private:
  void run(bool valid);
  void write(const BitVector& bits);
  BitVector read() const;
  bool isValid(const BitVector& bits) const;
  void countToStart(std::uint64_t clocks);

  PartPointer part_;
  std::uint32_t idcode_;
  DeviceStatus& status_;
  const BitVector* flash_;
  BitVector memory_;
  std::uint32_t usercode_ = 0xFFFFFFFF;
  std::uint64_t startClocks_ = 0;
  bool startPending_ = false;
  ShiftRegister in_;
  ShiftRegister out_;
};
