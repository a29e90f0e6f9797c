#pragma once

#include <cstddef>

#include "manager/parts/Part.h"
#include "manager/scan/ScanChain.h"
#include "manager/support/Result.h"

/// Registers of a device that stand behind instructions.
namespace Registers {

/// How long a written register takes until its new value is kept, in seconds.
inline constexpr double writeTime = 1.0e-3;

/// Loads an instruction by name. The failure says that the part lacks it, or that what the instruction register held
/// is not what the part's has: the chain is broken.
Status load(ScanChain& chain, std::size_t device, const Part& part, const std::string& instruction);
/// Loads the instruction and reads `length` bits.
Result<BitVector> read(ScanChain& chain, std::size_t device, const Part& part, const std::string& instruction,
                       std::size_t length);
/// Loads the instruction, shifts the bits in and waits for `writeTime`.
Status write(ScanChain& chain, std::size_t device, const Part& part, const std::string& instruction,
             const BitVector& bits);

}  // namespace Registers
