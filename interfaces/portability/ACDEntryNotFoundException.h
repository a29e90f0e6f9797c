#pragma once

#include <stdexcept>

#include "interfaces/Export.h"

/// Thrown by the command table for a word it does not hold, and by the PROM device table for an unknown
/// part. `what()` gives the name looked for.
class TESSEL_EXPORT ACDEntryNotFoundException : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};
