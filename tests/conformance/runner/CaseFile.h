#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "tests/conformance/runner/Case.h"

namespace conformance {

/// Reads the cases of a file. Throws `CaseError` for a file that cannot be read and for its first bad line.
std::vector<Case> readCaseFile(const std::string& path);

/// The same for a file's text; `file` is its name in errors.
std::vector<Case> parseCases(const std::string& file, std::string_view text);

}  // namespace conformance
