#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "manager/parts/Part.h"
#include "manager/simulator/DataRegister.h"

/// What an instruction selects and does. The register belongs to someone else, who outlives the TAP.
struct Instruction {
  std::string name;
  DataRegister* reg = nullptr;                   ///< null for BYPASS
  std::function<void()> loaded = {};             ///< at Update-IR
  std::function<void()> left = {};               ///< when another one takes its place, before that one's `loaded`
  std::function<void()> idleEntered = {};        ///< at each entry of Run-Test/Idle
  std::function<void(std::uint64_t)> idle = {};  ///< clocks in Run-Test/Idle
};

/// One device's instruction register and what it selects. Which state the TAP is in is the chain's to know.
class TapDevice {
 public:
  /// Nothing is called before the first reset. `resetDone` is called at each reset of the TAP.
  TapDevice(PartPointer part, std::function<void()> resetDone);
  TapDevice(const TapDevice&) = delete;
  TapDevice& operator=(const TapDevice&) = delete;

  /// Gives the part's opcodes of an instruction a meaning. Without opcodes it does nothing.
  void define(Instruction instruction);
  /// The instruction of a reset: IDCODE when it is defined, else BYPASS.
  void reset();

  DataRegister& instructionRegister() { return ir_; }
  DataRegister& dataRegister() { return *selected_; }
  void idleEntered();
  void idle(std::uint64_t clocks);
  /// The name of the current instruction.
  const std::string& instruction() const { return instructions_[current_].name; }

 private:
  void decode(const BitVector& opcode);
  void select(std::size_t instruction);

  PartPointer part_;
  std::function<void()> resetDone_;
  ShiftRegister ir_;
  BypassRegister bypass_;
  std::vector<Instruction> instructions_;  ///< the first is BYPASS
  std::vector<std::pair<BitVector, std::size_t>> opcodes_;
  std::size_t current_ = 0;
  std::size_t afterReset_ = 0;
  DataRegister* selected_ = &bypass_;
};
