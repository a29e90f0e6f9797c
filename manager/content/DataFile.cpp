#include "manager/content/DataFile.h"

#include <algorithm>
#include <array>
#include <cctype>

#include "manager/content/FileAccess.h"
#include "manager/content/Formats.h"

namespace {

constexpr std::uint64_t mostBytes = std::uint64_t{1} << 30;
constexpr std::uint64_t addressSpace = std::uint64_t{1} << 32;

Result<DataImage> parseBinary(std::string_view, std::string_view text) {
  DataImage image;
  image.add(0, {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()});
  return image;
}

std::string formatBinary(const DataImage& image) {
  const std::vector<std::uint8_t> bytes = image.flatten(0, image.end());
  return {bytes.begin(), bytes.end()};
}

struct Row {
  DataFile::Format format;
  std::string_view name;
  Result<DataImage> (*parse)(std::string_view name, std::string_view text);
  std::string (*write)(const DataImage& image);  ///< null for a format that is only read
  bool hasAddresses;
};

constexpr std::array<Row, 5> rows = {{
    {DataFile::Format::binary, "bin", parseBinary, formatBinary, false},
    {DataFile::Format::intelHex, "mcs", IntelHex::parse, IntelHex::format, true},
    {DataFile::Format::sRecord, "exo", SRecord::parse, SRecord::format, true},
    {DataFile::Format::hex, "hex", PlainDigits::parseHex, PlainDigits::formatHex, false},
    {DataFile::Format::ascii, "rbt", PlainDigits::parseBits, nullptr, false},
}};

struct Extension {
  std::string_view text;
  DataFile::Format format;
};
constexpr std::array<Extension, 6> extensions = {{{".bin", DataFile::Format::binary},
                                                  {".bit", DataFile::Format::binary},
                                                  {".mcs", DataFile::Format::intelHex},
                                                  {".exo", DataFile::Format::sRecord},
                                                  {".hex", DataFile::Format::hex},
                                                  {".rbt", DataFile::Format::ascii}}};

const Row& rowOf(DataFile::Format format) {
  return *std::find_if(rows.begin(), rows.end(), [format](const Row& row) { return row.format == format; });
}

bool sameText(std::string_view left, std::string_view right) {
  return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                    [](unsigned char a, unsigned char b) { return std::tolower(a) == std::tolower(b); });
}

/// Whether a file of the format can hold the image.
Status fits(const std::string& path, const DataImage& image, const Row& row) {
  std::uint64_t count = 0;
  for (const auto& [address, bytes] : image.runs()) count += bytes.size();
  const std::uint64_t most = row.hasAddresses ? addressSpace : mostBytes;
  if (image.end() <= most && count <= mostBytes && row.write != nullptr) return {};
  std::string why =
      "the data go up to byte " + std::to_string(image.end()) + ", expected at most " + std::to_string(most);
  if (row.write == nullptr) why = "the format " + std::string(row.name) + " is only read";
  if (count > mostBytes)
    why = "there are " + std::to_string(count) + " bytes, expected at most " + std::to_string(mostBytes);
  return Failure{.text = path + ": can't write: " + why, .kind = Failure::Kind::general};
}

}  // namespace

std::optional<DataFile::Format> DataFile::formatOf(std::string_view path) {
  for (const Extension& extension : extensions)
    if (path.size() >= extension.text.size() &&
        sameText(path.substr(path.size() - extension.text.size()), extension.text))
      return extension.format;
  return std::nullopt;
}

std::optional<DataFile::Format> DataFile::formatByName(std::string_view name) {
  for (const Row& row : rows)
    if (row.write != nullptr && sameText(row.name, name)) return row.format;
  return std::nullopt;
}

Result<DataImage> DataFile::read(const std::string& path, Format format) {
  const Result<std::string> text = FileAccess::read(path, mostBytes);
  if (!text) return text.failure();
  return parse(path, *text, format);
}

Result<DataImage> DataFile::parse(std::string_view name, std::string_view text, Format format) {
  return rowOf(format).parse(name, text);
}

Status DataFile::write(const std::string& path, const DataImage& image, Format format) {
  TESSEL_TRY(fits(path, image, rowOf(format)));
  return FileAccess::replace(path, DataFile::format(image, format));
}

std::string DataFile::format(const DataImage& image, Format format) {
  const Row& row = rowOf(format);
  return row.write == nullptr ? std::string() : row.write(image);
}
