#pragma once

#include <cstddef>
#include <vector>

#include "manager/scan/Cable.h"

/// A chain of up to 256 TAPs on a cable, addressed one device at a time; the others are in BYPASS. Device 0 is
/// the first behind TDI, the last one is next to TDO.
///
///     ScanChain chain(cable, {6, 8});
///     chain.loadInstruction(1, idcodeOpcode);
///     BitVector idcode;
///     chain.scanData(1, {.out = BitVector(32), .in = &idcode});
class ScanChain {
 public:
  static constexpr std::size_t most = 256;

  /// The lengths of the instruction registers in bits, device 0 first.
  ScanChain(Cable& cable, std::vector<std::size_t> irLengths);

  std::size_t size() const { return irLengths_.size(); }
  std::size_t irLength(std::size_t device) const { return irLengths_[device]; }
  Cable& cable() { return cable_; }

  /// Loads an instruction into one device and BYPASS into all others. `captured`, when not null, gets what the
  /// device's instruction register held at capture. An instruction that is loaded already is loaded again.
  Status loadInstruction(std::size_t device, const BitVector& opcode, BitVector* captured = nullptr,
                         TapState end = TapState::idle);
  /// Loads an instruction into every device, device 0 first.
  Status loadInstructions(const std::vector<BitVector>& opcodes, TapState end = TapState::idle);
  /// Scans the data register of one device while the others have one bypass bit each. `scan` is about the
  /// device's own bits; those of the bypass registers are not compared.
  Status scanData(std::size_t device, const Scan& scan);
  /// How many bypass bits lie between a device and TDO, and between TDI and it.
  std::size_t bitsBehind(std::size_t device) const { return irLengths_.size() - 1 - device; }
  std::size_t bitsBefore(std::size_t device) const { return device; }

 private:
  /// What is read from a cable that only records are zeros.
  Status recordData(std::size_t device, const Scan& scan, const BitVector& out);
  /// A device's own bits with zeros for the bypass bits around it.
  BitVector padded(std::size_t device, const BitVector& bits) const;
  Status checkOpcode(std::size_t device, const BitVector& opcode) const;
  Failure noDevice(std::size_t device) const;

  Cable& cable_;
  std::vector<std::size_t> irLengths_;
};
