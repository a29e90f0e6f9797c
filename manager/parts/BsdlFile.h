#pragma once

#include <string>
#include <string_view>

#include "manager/parts/Part.h"
#include "manager/support/Result.h"

/// Reads a BSDL file (IEEE 1149.1, the attributes of IEEE 1532) and, when there is one, the JSON file beside it.
namespace BsdlFile {

/// `name` is the file's name for messages. Errors name file, line and column, and show the line with a caret.
Result<Part> parse(std::string_view name, std::string_view text);
/// Adds what a JSON file says about named registers, kind, bridges and sizes to a part.
Status parseCompanion(std::string_view name, std::string_view text, Part& part);
/// Reads PATH, and PATH with the extension .json instead of its own when that is there.
Result<Part> read(const std::string& path);

}  // namespace BsdlFile
