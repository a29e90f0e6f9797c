// The reader of PROM descriptions. Input: the file.

#include <climits>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

#include "interfaces/constraints/ModeKeywords.h"
#include "interfaces/pdr/Pdr.h"
#include "tests/fuzz/MemoryFile.h"
#include "tests/fuzz/MessageLog.h"
#include "tests/fuzz/Require.h"

namespace {

using fuzz::MemoryFile;
using fuzz::require;

/// A text that the getters give, as a line of a description; nothing for an empty text.
std::string lineOf(const char* keyword, const char* value) {
  require(value != nullptr, "inside the range there is a text");
  return *value == '\0' ? "" : std::string(keyword) + " " + value + "\n";
}

/// As `lineOf`, for a value that no line may lack.
std::string lineWith(const char* keyword, const char* value) {
  const std::string line = lineOf(keyword, value);
  require(!line.empty(), "a line without a value is a read error");
  return line;
}

std::string modeLine(tESSELNS::SUBMODE_TYPE layout) {
  for (const ModeKeywords::Submode& row : ModeKeywords::submodes)
    if (row.requiredMode == tESSELNS::PROM_FILE_FORMATTER && row.submode == layout) return lineOf("MODE", row.keyword);
  require(false, "the mode is a layout of the PROM file formatter");
  return {};
}

/// What the getters tell, as a description of its own.
std::string describe(const Pdr& pdr) {
  std::string text = modeLine(pdr.getMode());
  text += lineOf("FILE_FORMAT", pdr.getFileFormat()) + lineOf("SWAP_BIT", pdr.getSwapBit());
  text += lineOf("FILL_VALUE", pdr.getFillValue()) + lineOf("DIRECTION", pdr.getDirection());
  for (int i = 0; i < pdr.getNumberPromDevices(); ++i) text += lineWith("PROM", pdr.getPromDevice(i));
  for (int i = 0; i < pdr.getNumberDesignRecords(); ++i) {
    text += lineWith("DESIGN", pdr.getStartAddress(i));
    for (int j = 0; j < pdr.getNumberDevices(i); ++j) text += lineWith("DEVICE", pdr.getDevice(i, j));
  }
  return text;
}

void checkOutside(const Pdr& pdr) {
  const int designs = pdr.getNumberDesignRecords();
  for (const int outside : {-1, pdr.getNumberPromDevices(), INT_MAX, INT_MIN})
    require(pdr.getPromDevice(outside) == nullptr, "outside there is no PROM");
  for (const int outside : {-1, designs, INT_MAX, INT_MIN}) {
    require(pdr.getStartAddress(outside) == nullptr, "outside there is no design");
    require(pdr.getNumberDevices(outside) == 0 && pdr.getDevice(outside, 0) == nullptr, "no design has no devices");
  }
  for (int i = 0; i < designs; ++i)
    for (const int outside : {-1, pdr.getNumberDevices(i), INT_MAX, INT_MIN})
      require(pdr.getDevice(i, outside) == nullptr, "outside there is no device");
}

/// The description of what is read, and nothing for a read error.
std::string readBack(MemoryFile& file, std::string_view text) {
  fuzz::MessageLog messages;
  file.fill(text);
  Pdr pdr(file.path().c_str());
  const bool result = pdr.read();
  checkOutside(pdr);
  if (result) {
    require(messages.shown() == 0, "a file that can be read brings no message");
    return describe(pdr);
  }
  require(messages.shown() == 1 && messages.errors() == 1, "a read error brings one error");
  require(messages.lastError().starts_with(file.path() + ":"), "the error begins with the place");
  require(messages.lastError().ends_with('\n'), "the error ends its line");
  return {};
}

std::string withCarriageReturns(std::string_view text) {
  std::string result;
  for (const char character : text) {
    if (character == '\n') result += '\r';
    result += character;
  }
  return result;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static MemoryFile file;
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  const std::string description = readBack(file, text);
  require(readBack(file, withCarriageReturns(text)) == description, "both line ends are alike");
  if (description.empty()) return 0;
  require(readBack(file, description) == description, "what was read can be written and read again");
  require(readBack(file, std::string(text) + "\n # comment\n\n").empty() == false,
          "comments and empty lines are nothing");
  require(readBack(file, std::string(text) + "\nBOGUS 1\n").empty(), "an unknown keyword is a read error");
  return 0;
}
