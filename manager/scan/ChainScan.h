#pragma once

#include <cstddef>
#include <vector>

#include "manager/scan/BitVector.h"
#include "manager/scan/Cable.h"
#include "manager/support/Result.h"

/// Finds out what is on a chain of which nothing is known, by what comes out of it.
namespace ChainScan {

struct Found {
  /// Device 0 first; 32 bits, or one bit of 0 for a device without IDCODE.
  std::vector<BitVector> idcodes;
  std::size_t totalIrLength = 0;  ///< of all devices together, in bits
  /// What the instruction registers captured, the device next to TDO first. Each device's own lowest two bits are
  /// 01; where the devices begin cannot be told for certain, as more bits may look so.
  BitVector irCapture;
};

/// The IDCODEs. Resets the TAPs and leaves them in Run-Test/Idle. A TDO that is stuck, a chain of no device or of more
/// than 256, and a stream that makes no sense are failures.
Result<std::vector<BitVector>> findIdcodes(Cable& cable);

/// The length of all instruction registers together and what they captured; BYPASS is in all of them then.
/// `devices` bounds the length.
Result<BitVector> captureInstructions(Cable& cable, std::size_t devices);

/// How many bits are between TDI and TDO in the data registers that are selected now, at most `most`.
Result<std::size_t> measureData(Cable& cable, std::size_t most);

/// Both; the TAPs are reset at the end.
Result<Found> find(Cable& cable);

}  // namespace ChainScan
