#pragma once

#include <memory>
#include <string>

#include "interfaces/Export.h"
#include "interfaces/portability/Stream.h"
#include "interfaces/portability/StringBase.h"

namespace Port {

/// Files by name. Every function reports failure by its result and issues no message.
class TESSEL_EXPORT File {
 public:
  enum Access { read = 1, write = 2, extend = 3 };

  /// Opens a file for reading (1), for writing (2, which empties or makes it) or for adding to its end (3);
  /// `text` is true for text files. The path `-` to read is standard input. Null on failure, and for a
  /// directory.
  static std::unique_ptr<Stream> open(const char* path, int access, bool text);
  /// Writes what is pending and closes the stream, which is null afterwards. False when something that
  /// was written did not reach the file.
  static bool close(std::unique_ptr<Stream>& stream);

  /// True when the file can be opened for reading. A directory can't; a pipe is not waited for.
  static bool probe(const char* path);

  static bool remove(const char* path);
  /// False, and nothing happens, when both are one file; so with `append`.
  static bool copy(const char* from, const char* to);
  /// Adds the content of `from` to the end of `to`, which is made when missing.
  static bool append(const char* from, const char* to);

  /// The current directory, in a buffer of `size` bytes. False, and an empty text, when it does not fit.
  static bool getcwd(char* buffer, int size);
  static ::StringBase getcwd();
};

}  // namespace Port
