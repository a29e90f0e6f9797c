#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "manager/support/Result.h"

/// Whole files. Failures name the path and the system's reason.
namespace FileAccess {

/// The content of a regular file of at most `most` bytes.
Result<std::string> read(const std::string& path, std::uint64_t most);
/// Writes beside the path, then renames. What is no regular file, such as a device, is written directly. On a failure
/// the path is as it was.
Status replace(const std::string& path, std::string_view content);

}  // namespace FileAccess
