#pragma once

#include <stdexcept>

#include "interfaces/Export.h"

/// Thrown by the command table when a switch or an argument does not fit the command; the table has
/// issued the error by then.
class TESSEL_EXPORT InvalidArgumentException : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};
