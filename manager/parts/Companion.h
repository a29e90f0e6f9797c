#pragma once

#include <string_view>

#include "manager/parts/Part.h"
#include "manager/support/Result.h"

/// The JSON file beside a BSDL file (docs/parts.md).
namespace Companion {

/// Sets in the part what the file says. Errors of the form name the place, those of a value its key. The part is
/// unchanged after a failure.
Status apply(std::string_view name, std::string_view text, Part& part);
/// The part's name in the file; empty when it has none or can't be read.
std::string nameIn(std::string_view text);

}  // namespace Companion
