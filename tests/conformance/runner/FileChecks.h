#pragma once

#include <map>
#include <string>
#include <vector>

#include "tests/conformance/runner/Case.h"

namespace conformance {

/// The actual form of a case's checks, in their order: the process's facts by the number of their check,
/// and what the files hold now. `directory` is the working directory.
std::vector<std::string> actualCheckLines(const std::vector<Check>& checks,
                                          const std::map<std::size_t, std::string>& facts,
                                          const std::string& directory);

/// The lines of a file's text, rendered as those of a text check.
std::vector<std::string> renderFileText(const std::string& text);

}  // namespace conformance
