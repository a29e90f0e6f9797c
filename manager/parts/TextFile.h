#pragma once

#include <optional>
#include <string>

#include "manager/support/Result.h"

namespace TextFile {

/// The whole file, which has at most 8 MiB.
Result<std::string> read(const std::string& path);
/// As `read`; nothing when there is no such file.
Result<std::optional<std::string>> readIfThere(const std::string& path);

}  // namespace TextFile
