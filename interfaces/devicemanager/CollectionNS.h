#pragma once

#include <cstdint>

/// Attributes of a collection. Values are texts.
namespace CollectionNS {

enum ATTRIBUTE : std::int32_t { UNKNOWN = -1, NAME = 1 };

}  // namespace CollectionNS
