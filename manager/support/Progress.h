#pragma once

#include <cstdint>
#include <functional>

/// How far an operation is. The listener gets done and total in bytes (or other units), `done` from 0 to `total`.
using Progress = std::function<void(std::uint64_t done, std::uint64_t total)>;
