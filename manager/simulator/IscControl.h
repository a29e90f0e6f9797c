#pragma once

#include "manager/simulator/DeviceStatus.h"
#include "manager/simulator/IscModel.h"
#include "manager/simulator/TapDevice.h"

/// The instructions that switch a device's ISC mode on and off, and the one that tells its status.
class IscControl {
 public:
  IscControl(const Part& part, const IscModel& model, DeviceStatus& status);

  void define(TapDevice& tap);

 private:
  void enable(const BitVector& key);
  BitVector statusBits() const;

  IscModel model_;
  KeyedInstruction enable_;
  DeviceStatus& status_;
  ShiftRegister enableRegister_;
  ShiftRegister statusRegister_;
};
