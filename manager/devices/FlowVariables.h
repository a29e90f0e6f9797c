#pragma once

#include <map>
#include <string>

#include "manager/parts/IscProgram.h"
#include "manager/scan/BitVector.h"

/// The variables of one run of a flow. Each is zero until it gets a value, and as wide as the field that gave it
/// the last one; numbers wrap around at that width.
class FlowVariables {
 public:
  /// The bits of a field whose value is neither data in nor data out. Changes the variable that the value changes.
  BitVector evaluate(const Isc::Field& field);

 private:
  std::map<std::string, BitVector> values_;
};
