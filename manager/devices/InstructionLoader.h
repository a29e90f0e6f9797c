#pragma once

#include <cstddef>
#include <string>

#include "manager/parts/Part.h"
#include "manager/scan/ScanChain.h"
#include "manager/support/Result.h"

/// Loads a device's instructions by name and looks at what its instruction register answers: the pattern that the
/// part tells, or at least the 01 that the standard asks for. Anything else means that the chain is broken.
class InstructionLoader {
 public:
  /// An answer costs a round trip on a remote cable. `always` asks for it; `sometimes` asks at the first load and
  /// then once in `loadsPerCheck`, for rows of loads that have no other reason to wait.
  enum class Check { always, sometimes, never };
  static constexpr int loadsPerCheck = 64;

  InstructionLoader(ScanChain& chain, std::size_t device, PartPointer part)
      : chain_(chain), device_(device), part_(std::move(part)) {}

  Status load(const std::string& instruction, Check check = Check::always);
  /// The next load is checked.
  void checkNext() { unchecked_ = loadsPerCheck; }

  /// Loads the instruction and reads its data register.
  Result<BitVector> readRegister(const std::string& instruction, std::size_t length);
  /// Reads the IDCODE, if the part has one, and compares it with the part's.
  Status checkIdcode();
  /// A field of a register that the part names; `absent` when there is no such field.
  Result<std::uint64_t> field(const std::string& registerName, const std::string& fieldName, std::uint64_t absent = 0);

  ScanChain& chain() { return chain_; }
  std::size_t device() const { return device_; }
  const Part& part() const { return *part_; }

 private:
  ScanChain& chain_;
  std::size_t device_;
  PartPointer part_;
  int unchecked_ = loadsPerCheck;
};
