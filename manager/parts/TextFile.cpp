#include "manager/parts/TextFile.h"

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>

namespace {

constexpr std::size_t mostBytes = std::size_t{8} << 20U;
constexpr std::size_t blockBytes = 65536;

}  // namespace

namespace TextFile {

Result<std::string> read(const std::string& path) {
  std::error_code error;
  if (std::filesystem::is_directory(path, error)) return Failure{.text = path + " is a directory."};
  errno = 0;
  std::ifstream file(path, std::ios::binary);
  if (!file) return Failure{.text = "Cannot read " + path + ": " + std::strerror(errno) + "."};
  std::string text;
  char block[blockBytes];
  while (file && text.size() <= mostBytes) {
    file.read(block, blockBytes);
    text.append(block, static_cast<std::size_t>(file.gcount()));
  }
  if (file.bad()) return Failure{.text = "Cannot read " + path + ": " + std::strerror(errno) + "."};
  if (text.size() > mostBytes) return Failure{.text = path + " has more than 8 MiB, too many for a description."};
  return text;
}

Result<std::optional<std::string>> readIfThere(const std::string& path) {
  std::error_code error;
  if (!std::filesystem::exists(path, error) && !error) return std::optional<std::string>();
  Result<std::string> text = read(path);
  if (!text) return text.failure();
  return std::optional<std::string>(std::move(*text));
}

}  // namespace TextFile
