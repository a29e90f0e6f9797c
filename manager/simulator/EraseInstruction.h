#pragma once

#include <functional>
#include <memory>
#include <vector>

#include "manager/simulator/DeviceStatus.h"
#include "manager/simulator/IscModel.h"
#include "manager/simulator/TapDevice.h"

/// An instruction that erases something when Run-Test/Idle is entered, once the right code was shifted in.
class EraseInstruction {
 public:
  using Action = std::function<void()>;

  /// `time` is in seconds.
  EraseInstruction(KeyedInstruction instruction, double time, DeviceStatus& status);

  void define(TapDevice& tap);
  /// Called, in order, at each erasure.
  void add(Action action) { actions_.push_back(std::move(action)); }

 private:
  void arm(const BitVector& key);
  void erase();

  KeyedInstruction instruction_;
  double time_;
  DeviceStatus& status_;
  std::vector<Action> actions_;
  bool armed_ = false;
  ShiftRegister register_;
};
