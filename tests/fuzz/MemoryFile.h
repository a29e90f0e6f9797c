#pragma once

#include <string>
#include <string_view>

namespace fuzz {

/// A file without a place on a disk.
class MemoryFile {
 public:
  MemoryFile();
  ~MemoryFile();
  MemoryFile(const MemoryFile&) = delete;
  MemoryFile& operator=(const MemoryFile&) = delete;

  /// Makes the text the whole content; the next read from `descriptor` begins at its start.
  void fill(std::string_view text);
  std::string content() const;

  int descriptor() const { return descriptor_; }
  /// A path that opens the file once more, at its start.
  const std::string& path() const { return path_; }

 private:
  int descriptor_;
  std::string path_;
};

}  // namespace fuzz
