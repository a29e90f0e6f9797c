#pragma once

#include <cstdint>
#include <ctime>

/// Calendar time broken down in the local time zone; all zero when it cannot be.
std::tm localTime(std::int64_t time);
