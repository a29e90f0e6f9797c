#pragma once

#include <cstdint>

/// Attributes of the output configuration device. Values are texts.
namespace ConfigDeviceNS {

enum ATTRIBUTE : std::int32_t {
  UNKNOWN = -1,
  FILE_NAME = 1,
  FILE_FORMAT = 6,
  SWAP_BIT = 7,
  FILL_VALUE = 8,
  DIRECTION = 10
};

}  // namespace ConfigDeviceNS
