#pragma once

#include <string>
#include <vector>

namespace testsupport {

/// A new directory of the test's own, removed with all it holds at the end.
class TemporaryDirectory {
 public:
  TemporaryDirectory();
  ~TemporaryDirectory();
  TemporaryDirectory(const TemporaryDirectory&) = delete;
  TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

  const std::string& path() const { return path_; }
  std::string file(const std::string& name) const { return path_ + "/" + name; }

 private:
  std::string path_;
};

/// A temporary directory that is the current one while the object lives.
class WorkingDirectory : public TemporaryDirectory {
 public:
  WorkingDirectory();
  ~WorkingDirectory();

 private:
  std::string former_;
};

/// Makes or replaces a file that holds exactly these bytes.
void writeFile(const std::string& path, const std::string& content);
/// The bytes of a file; the text "(no file)" when it can't be read.
std::string readFile(const std::string& path);
bool exists(const std::string& path);
/// The names in a directory, sorted.
std::vector<std::string> listDirectory(const std::string& path);

}  // namespace testsupport
