#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "manager/scan/BitVector.h"

/// Goes over everything that a board keeps from one run to the next; either takes it or fills it in.
class StateVisitor {
 public:
  virtual ~StateVisitor() = default;

  /// The size never changes. `name` is unique within the board.
  virtual void visit(const std::string& name, BitVector& bits) = 0;
  virtual void visit(const std::string& name, std::vector<std::uint8_t>& bytes) = 0;
};
