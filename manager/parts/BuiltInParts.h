#pragma once

#include <span>
#include <string_view>

/// A part that comes with the program: the texts of its BSDL file and of the JSON file beside it. They are made of
/// builtin/ when the program is built.
struct BuiltInPart {
  std::string_view name;
  std::string_view bsdl;
  std::string_view companion;
};

std::span<const BuiltInPart> builtInParts();
