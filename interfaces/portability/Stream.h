#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "interfaces/Export.h"
#include "interfaces/portability/StringBase.h"

namespace Port {

/// An open file, read or written in order through a buffer. Opened by `File::open`; closing it is the
/// owner's business (`File::close`, or the destructor). One thread at a time.
class TESSEL_EXPORT Stream {
 public:
  /// Takes over an open file descriptor. `ownsDescriptor` false leaves it open at the end.
  Stream(std::string path, int descriptor, bool writing, bool ownsDescriptor);
  ~Stream();
  Stream(const Stream&) = delete;
  Stream& operator=(const Stream&) = delete;

  /// Reads the next line into `buffer`, without its line end (`\n` or `\r\n`) and with a terminating zero.
  /// `size` is the buffer's length in bytes; a longer line comes in pieces of `size - 1` bytes. A zero
  /// byte in the file is given as 0x1A (substitute), so that what follows it is not lost.
  /// False at the end of the file and after a read error (see `error`).
  static bool readline(Stream& stream, char* buffer, int size);

  Stream& write(std::string_view text);
  Stream& operator<<(const ::StringBase& text) { return write(text.view()); }
  Stream& operator<<(const char* text) { return write(text); }
  Stream& operator<<(Stream& (*manipulator)(Stream&)) { return manipulator(*this); }
  /// Hands everything written so far to the system.
  Stream& flush();

  /// Wipes what was read so far out of the buffer.
  void wipeRead();

  const std::string& path() const { return path_; }
  /// The system's error number of the first failure of this stream; 0 when there was none.
  int error() const { return error_; }

 private:
  friend class File;
  bool fill();
  /// Passes over a line end, if one comes next; its length.
  std::size_t takeLineEnd();
  bool close();

  std::string path_;
  int descriptor_;
  bool writing_;
  bool ownsDescriptor_;
  int error_ = 0;
  std::vector<char> buffer_;
  std::size_t begin_ = 0;
  std::size_t end_ = 0;
  std::size_t wiped_ = 0;  ///< `wipeRead` was here
};

/// Ends the line and flushes.
TESSEL_EXPORT Stream& endl(Stream& stream);

}  // namespace Port
