// The readers of memory content. Input: a byte that chooses the format, then the file.

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "manager/content/DataFile.h"
#include "tests/fuzz/Require.h"

namespace {

using DataFile::Format;
using fuzz::require;

constexpr Format formats[] = {Format::binary, Format::intelHex, Format::sRecord, Format::hex, Format::ascii};

void checkRuns(const DataImage& image, std::size_t inputSize) {
  std::uint64_t reached = 0;
  std::uint64_t count = 0;
  bool first = true;
  for (const auto& [address, bytes] : image.runs()) {
    require(!bytes.empty(), "no run is empty");
    require(first || address > reached, "runs neither touch nor overlap");
    reached = address + bytes.size();
    count += bytes.size();
    first = false;
  }
  require(image.end() == reached, "the end is that of the last run");
  require(reached <= std::uint64_t{1} << 32, "no byte lies beyond 2^32");
  require(count <= inputSize, "a file gives no more bytes than it has");
}

/// What is written is read again as the same image.
void checkAgain(const DataImage& image) {
  for (const Format format : {Format::intelHex, Format::sRecord}) {
    const auto again = DataFile::parse("again", DataFile::format(image, format), format);
    require(again.ok(), "a file that was written can be read");
    require(*again == image, "a file that was written gives the same bytes");
  }
  if (image.end() > 1 << 16) return;
  DataImage filled;
  require(filled.add(0, image.flatten(0, image.end())), "an empty image takes everything");
  for (const Format format : {Format::binary, Format::hex}) {
    const auto again = DataFile::parse("again", DataFile::format(image, format), format);
    require(again.ok() && *again == filled, "without addresses holes are filled");
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const Format format = formats[data[0] % std::size(formats)];
  const std::string_view text(reinterpret_cast<const char*>(data + 1), size - 1);
  const auto image = DataFile::parse("file", text, format);
  if (!image) {
    require(image.failure().text.starts_with("file:"), "a failure begins with the place");
    require(!image.failure().text.ends_with('\n'), "a failure has no line end");
    return 0;
  }
  checkRuns(*image, size);
  checkAgain(*image);
  return 0;
}
