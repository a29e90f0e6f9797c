#pragma once

#include "interfaces/Export.h"

namespace Port {

/// Text that goes to standard output past the message manager.
class TESSEL_EXPORT Console {
 public:
  /// Prints the text and flushes.
  static void print(const char* text);
  /// `print` for signal handlers: hands the text to the system at once, touching no buffer.
  static void printFromSignalHandler(const char* text);
  /// Reads a line of standard input, with its line end if it fits, into a buffer of `size` bytes. A zero
  /// byte is given as 0x1A (substitute). False at the end of input and on a read error.
  static bool readLine(char* buffer, int size);
};

}  // namespace Port
