#pragma once

#include <cstdint>

#include "interfaces/Export.h"
#include "interfaces/portability/StringBase.h"

/// Calendar time in whole seconds since 1970-01-01 00:00 UTC.
class TESSEL_EXPORT UT_TIME {
 public:
  static std::int64_t Time();
  /// Local time as `2026-03-09 14:05:00`, without a line end.
  static StringBase CTime(std::int64_t time);
};

/// The current calendar time in seconds, also stored in `*time` unless that is null.
TESSEL_EXPORT std::int64_t _time64(std::int64_t* time);
/// The seconds from `start` to `end`.
TESSEL_EXPORT double _difftime64(std::int64_t end, std::int64_t start);
