#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "manager/content/DataImage.h"
#include "manager/support/Result.h"

/// Reads and writes files of memory content.
namespace DataFile {

enum class Format {
  binary,    ///< .bin, .bit: bytes from address 0 on
  intelHex,  ///< .mcs
  sRecord,   ///< .exo
  hex,       ///< .hex: two digits a byte from address 0 on, white space between lines
  ascii,     ///< .rbt: '0' and '1' digits, the lowest bit of the first byte first; read only
};

/// By the extension of a path, in any letter case; empty for any other.
std::optional<Format> formatOf(std::string_view path);
/// By name: bin, mcs, exo, hex.
std::optional<Format> formatByName(std::string_view name);

/// Errors name file, line and column.
Result<DataImage> read(const std::string& path, Format format);
Result<DataImage> parse(std::string_view name, std::string_view text, Format format);
/// Writes beside the path, then renames: the file is whole or untouched.
Status write(const std::string& path, const DataImage& image, Format format);
std::string format(const DataImage& image, Format format);

}  // namespace DataFile
