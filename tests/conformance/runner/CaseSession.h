#pragma once

#include <string>

#include "tests/conformance/runner/Case.h"

namespace conformance {

/// What the parent has prepared for a case's process.
struct Surroundings {
  std::string directory;  ///< the empty working directory
  std::string inputFile;  ///< where console input is put, outside the working directory
  int report = -1;        ///< the pipe to the parent
  int output = -1;        ///< the file that takes standard output
};

/// Carries out a case in this process, which is the case's own and good for nothing else afterwards, and
/// reports to the parent. The process's exit status: 0 when the case came to its end.
int performCase(const Case& script, const Surroundings& surroundings);

}  // namespace conformance
