#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "manager/parts/BsdlLexer.h"
#include "manager/parts/BsdlText.h"

/// An entity of a BSDL file as it is written: ports, the first pin map, and the values of attributes, not looked into.
struct BsdlEntity {
  struct Attribute {
    std::size_t offset = 0;         ///< of the value in the file
    std::optional<BsdlText> text;   ///< of a value that is a text
    std::vector<BsdlToken> tokens;  ///< of any other value
  };
  /// Indices of a vector port, in their order; one that is no vector has none.
  struct Port {
    bool vector = false;
    std::size_t left = 0;
    std::size_t right = 0;
  };

  std::string name;
  std::size_t offset = 0;                       ///< of the name in the file
  std::map<std::string, Port> ports;            ///< by name in upper case
  std::optional<BsdlText> pinMap;               ///< the first one
  std::map<std::string, Attribute> attributes;  ///< by name in upper case

  const Attribute* find(std::string_view attribute) const;

  /// Reads the first entity of a file. Attributes that are not `wanted`, in upper case, are skipped, and so is
  /// everything else that VHDL may have there.
  static BsdlEntity read(BsdlSource& source, std::span<const std::string_view> wanted);
  /// Only the entity's name; empty when there is none.
  static std::string readName(BsdlSource& source);
};
