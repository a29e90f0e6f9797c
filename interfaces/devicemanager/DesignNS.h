#pragma once

#include <cstdint>

/// Attributes of a design. Values are texts.
namespace DesignNS {

enum ATTRIBUTE : std::int32_t { UNKNOWN = -1, NAME = 1, START_ADDRESS = 2 };

}  // namespace DesignNS
