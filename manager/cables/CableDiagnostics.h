#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

#include "manager/scan/Cable.h"
#include "manager/support/Result.h"

/// Tests a cable and the chain on it by what comes out of TDO; no device's part needs to be known. Nothing but IDCODE
/// and BYPASS is loaded. The TAPs are reset at the end.
namespace CableDiagnostics {

struct Report {
  std::vector<BitVector> idcodes;  ///< as ChainScan::Found has them
  std::size_t totalIrLength = 0;
  std::size_t bypassLength = 0;  ///< as many as there are devices
  std::size_t patternBits = 0;
  std::size_t patternErrors = 0;   ///< 0: errors are a failure
  std::vector<std::string> lines;  ///< for the user
};

/// Gets each line as it is known, also when the test fails later.
using Listener = std::function<void(const std::string& line)>;

/// A TDO that is stuck, lengths that contradict each other, and errors in a pattern are failures.
Result<Report> run(Cable& cable, const Listener& listener = {});

}  // namespace CableDiagnostics
