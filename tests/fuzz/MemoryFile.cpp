#include "tests/fuzz/MemoryFile.h"

#include <sys/mman.h>
#include <sys/types.h>
#include <unistd.h>

#include <array>

#include "tests/fuzz/Require.h"

namespace fuzz {

MemoryFile::MemoryFile()
    : descriptor_(memfd_create("fuzz", MFD_CLOEXEC)), path_("/proc/self/fd/" + std::to_string(descriptor_)) {
  require(descriptor_ >= 0, "the system gives a file in memory");
}

MemoryFile::~MemoryFile() { ::close(descriptor_); }

void MemoryFile::fill(std::string_view text) {
  require(::ftruncate(descriptor_, 0) == 0 && ::lseek(descriptor_, 0, SEEK_SET) == 0, "a file can be emptied");
  require(::write(descriptor_, text.data(), text.size()) == static_cast<ssize_t>(text.size()), "a file can be written");
  require(::lseek(descriptor_, 0, SEEK_SET) == 0, "a file can be read from its start");
}

std::string MemoryFile::content() const {
  std::string text;
  std::array<char, 16384> buffer{};
  for (;;) {
    const ssize_t count = ::pread(descriptor_, buffer.data(), buffer.size(), static_cast<off_t>(text.size()));
    if (count <= 0) return text;
    text.append(buffer.data(), static_cast<std::size_t>(count));
  }
}

}  // namespace fuzz
