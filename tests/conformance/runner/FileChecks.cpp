#include "tests/conformance/runner/FileChecks.h"

#include <filesystem>
#include <fstream>
#include <iterator>

namespace conformance {
namespace {

std::string readAll(const std::filesystem::path& path) {
  std::ifstream stream(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
}

void addFileLines(std::vector<std::string>& lines, const Check& check, const std::string& directory) {
  const std::filesystem::path path = std::filesystem::path(directory) / expandDirectory(check.name, directory);
  std::error_code ignored;
  const std::filesystem::file_status status = std::filesystem::symlink_status(path, ignored);
  if (!std::filesystem::exists(status)) {
    lines.push_back("absent " + check.name);
    return;
  }
  if (check.kind == Check::Kind::absent || !std::filesystem::is_regular_file(status)) {
    lines.push_back((std::filesystem::is_directory(status) ? "directory " : "present ") + check.name);
    return;
  }
  lines.push_back(renderCheck(check, Value()));
  const std::vector<std::string> content = renderFileText(readAll(path));
  lines.insert(lines.end(), content.begin(), content.end());
}

}  // namespace

std::vector<std::string> renderFileText(const std::string& text) {
  std::vector<std::string> lines;
  for (std::size_t begin = 0; begin < text.size();) {
    const std::size_t end = std::min(text.find('\n', begin), text.size());
    lines.push_back(text.substr(begin, end - begin));
    begin = end + 1;
  }
  return renderFileLines(lines, !text.empty() && text.back() != '\n');
}

std::vector<std::string> actualCheckLines(const std::vector<Check>& checks,
                                          const std::map<std::size_t, std::string>& facts,
                                          const std::string& directory) {
  std::vector<std::string> lines;
  for (std::size_t i = 0; i < checks.size(); ++i) {
    if (checks[i].kind == Check::Kind::text || checks[i].kind == Check::Kind::absent)
      addFileLines(lines, checks[i], directory);
    else if (const auto fact = facts.find(i); fact != facts.end())
      lines.push_back(fact->second);
  }
  return lines;
}

}  // namespace conformance
