#include "manager/support/LockFile.h"

#include <cctype>
#include <cstdint>
#include <functional>
#include <string_view>

#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/OwnedFile.h"

namespace {

constexpr std::string_view ending = ".lock";

/// A name that may stand in a file name; what is long or odd is told apart by its hash.
std::string fileName(const std::string& name) {
  constexpr std::size_t longest = 60;
  std::string result;
  for (const char each : name) {
    const bool plain = std::isalnum(static_cast<unsigned char>(each)) != 0 || each == '.' || each == '-';
    result += plain ? each : '_';
  }
  if (result.size() > longest) result.erase(0, result.size() - longest);
  return result + Port::format("-%08x", static_cast<std::uint32_t>(std::hash<std::string>()(name)));
}

}  // namespace

std::string LockFile::commonPath() { return Port::OwnedFile::runtimeDirectory() + "/cable.lock"; }

std::string LockFile::path(const std::string& commonPath, const std::string& cable) {
  if (cable.empty()) return commonPath;
  return commonPath.substr(0, commonPath.size() - ending.size()) + "-" + fileName(cable) + std::string(ending);
}
