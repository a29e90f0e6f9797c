#pragma once

#include <source_location>

namespace fuzz {

/// Ends the process when a property does not hold, so that the fuzzer keeps the input. `property` says in
/// words what should have held.
void require(bool holds, const char* property, std::source_location where = std::source_location::current());

}  // namespace fuzz
