#include "interfaces/pdr/Pdr.h"

#include <cerrno>
#include <cstring>
#include <fstream>
#include <optional>
#include <string_view>

#include "interfaces/constraints/ModeKeywords.h"
#include "interfaces/portability/Port_MsgManData.h"
#include "interfaces/portability/UT_STR.h"

namespace {

constexpr std::string_view blanks = " \t\r";

std::string_view trimmed(std::string_view text) {
  const std::size_t start = text.find_first_not_of(blanks);
  if (start == std::string_view::npos) return {};
  return text.substr(start, text.find_last_not_of(blanks) + 1 - start);
}

std::optional<tESSELNS::SUBMODE_TYPE> layoutOf(const std::string& keyword) {
  for (const ModeKeywords::Submode& row : ModeKeywords::submodes)
    if (row.requiredMode == tESSELNS::PROM_FILE_FORMATTER && UT_STR::ICompare(row.keyword, keyword.c_str()) == 0)
      return row.submode;
  return std::nullopt;
}

const char* textAt(const std::vector<std::string>& texts, int index) {
  const auto place = static_cast<std::size_t>(index);
  return index >= 0 && place < texts.size() ? texts[place].c_str() : nullptr;
}

/// A text of the file as it may stand in a message: short, and without control characters.
std::string shown(std::string_view text) {
  constexpr std::size_t longest = 40;
  std::string result(text.substr(0, longest));
  for (char& character : result)
    if (static_cast<unsigned char>(character) < ' ' || character == 0x7F) character = '?';
  return text.size() > longest ? result + "..." : result;
}

/// Issues the read error; `line` is 0 when the file as a whole is meant.
bool fail(const std::string& path, int line, const std::string& reason) {
  const std::string place = line == 0 ? path : path + ":" + std::to_string(line);
  Port_MsgManData::createObject("tESSEL", "../s/Pdr", __LINE__, "").issueError("%s: %s\n", place, reason);
  return false;
}

}  // namespace

Pdr::Pdr(const char* path) : path_(path) {}

bool Pdr::read() {
  std::ifstream file(path_, std::ios::binary);
  if (!file) return fail(path_, 0, std::strerror(errno));
  bool modeSeen = false;
  std::string text;
  for (int line = 1; std::getline(file, text); ++line) {
    const std::string_view content = trimmed(text);
    if (content.empty() || content.front() == '#') continue;
    if (content.find('\0') != std::string_view::npos) return fail(path_, line, "a zero byte in the line");
    const std::size_t end = content.find_first_of(blanks);
    const std::string keyword(content.substr(0, end));
    const std::string value(end == std::string_view::npos ? "" : trimmed(content.substr(end)));
    const std::string problem = takeLine(keyword, value, modeSeen);
    if (!problem.empty()) return fail(path_, line, problem);
  }
  if (file.bad()) return fail(path_, 0, "read error");
  if (!modeSeen) return fail(path_, 0, "no MODE line, expected one such as MODE pffserial");
  return true;
}

std::string Pdr::takeLine(const std::string& keyword, const std::string& value, bool& modeSeen) {
  struct TextRow {
    const char* keyword;
    std::string Pdr::*field;
  };
  static constexpr TextRow textRows[] = {{"FILE_FORMAT", &Pdr::fileFormat_},
                                         {"SWAP_BIT", &Pdr::swapBit_},
                                         {"FILL_VALUE", &Pdr::fillValue_},
                                         {"DIRECTION", &Pdr::direction_}};
  const auto is = [&keyword](const char* name) { return UT_STR::ICompare(keyword.c_str(), name) == 0; };
  const auto field = [&]() -> std::string* {
    for (const TextRow& row : textRows)
      if (is(row.keyword)) return &(this->*row.field);
    return nullptr;
  }();
  if (field == nullptr && !is("MODE") && !is("PROM") && !is("DESIGN") && !is("DEVICE"))
    return "unknown keyword " + shown(keyword) +
           ", expected MODE, FILE_FORMAT, SWAP_BIT, FILL_VALUE, DIRECTION, PROM, DESIGN or DEVICE";
  if (value.empty()) return keyword + " has no value";
  if (field != nullptr) {
    *field = value;
  } else if (is("MODE")) {
    const auto layout = layoutOf(value);
    if (!layout) return "unknown MODE " + shown(value) + ", expected a layout such as pffserial or pffparallel";
    mode_ = *layout;
    modeSeen = true;
  } else if (is("PROM")) {
    proms_.push_back(value);
  } else if (is("DESIGN")) {
    designs_.push_back({value, {}});
  } else if (designs_.empty()) {
    return "DEVICE " + shown(value) + " stands before any DESIGN";
  } else {
    designs_.back().devices.push_back(value);
  }
  return {};
}

const char* Pdr::getPromDevice(int index) const { return textAt(proms_, index); }

const char* Pdr::getStartAddress(int design) const {
  const auto place = static_cast<std::size_t>(design);
  return design >= 0 && place < designs_.size() ? designs_[place].startAddress.c_str() : nullptr;
}

int Pdr::getNumberDevices(int design) const {
  const auto place = static_cast<std::size_t>(design);
  return design >= 0 && place < designs_.size() ? static_cast<int>(designs_[place].devices.size()) : 0;
}

const char* Pdr::getDevice(int design, int index) const {
  const auto place = static_cast<std::size_t>(design);
  return design >= 0 && place < designs_.size() ? textAt(designs_[place].devices, index) : nullptr;
}
