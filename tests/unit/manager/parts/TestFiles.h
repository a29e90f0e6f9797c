#pragma once

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

namespace TestFiles {

/// A file of files/.
inline std::string path(const std::string& name) {
  return (std::filesystem::path(__FILE__).parent_path() / "files" / name).string();
}

inline std::string text(const std::string& path) {
  std::ostringstream result;
  result << std::ifstream(path, std::ios::binary).rdbuf();
  return result.str();
}

/// A directory that is gone with its content at the end.
class Directory {
 public:
  Directory() {
    std::string pattern = (std::filesystem::temp_directory_path() / "tessel-parts-XXXXXX").string();
    path_ = mkdtemp(pattern.data());
  }
  ~Directory() {
    std::error_code error;
    std::filesystem::remove_all(path_, error);
  }
  Directory(const Directory&) = delete;
  Directory& operator=(const Directory&) = delete;

  const std::string& path() const { return path_; }
  std::string write(const std::string& name, const std::string& text) const {
    const std::string file = path_ + '/' + name;
    std::ofstream(file, std::ios::binary) << text;
    return file;
  }

 private:
  std::string path_;
};

}  // namespace TestFiles
