#pragma once

#include <string>
#include <string_view>

#include "manager/content/DataImage.h"
#include "manager/support/Result.h"

/// The readers and writers of file formats that `DataFile` chooses from. `name` is the file's name for failures.

namespace IntelHex {
Result<DataImage> parse(std::string_view name, std::string_view text);
/// The addresses are below 2^32.
std::string format(const DataImage& image);
}  // namespace IntelHex

namespace SRecord {
Result<DataImage> parse(std::string_view name, std::string_view text);
/// The addresses are below 2^32.
std::string format(const DataImage& image);
}  // namespace SRecord

namespace PlainDigits {
Result<DataImage> parseHex(std::string_view name, std::string_view text);
std::string formatHex(const DataImage& image);
Result<DataImage> parseBits(std::string_view name, std::string_view text);
}  // namespace PlainDigits
