#pragma once

#include <cstddef>

#include "interfaces/Export.h"

namespace Port {

/// Care for device keys that pass through the process.
class TESSEL_EXPORT Secret {
 public:
  /// Whether a word of a command line says that a key follows: `-key` in any letter case.
  static bool announces(const char* word) {
    return word[0] == '-' && (word[1] == 'k' || word[1] == 'K') && (word[2] == 'e' || word[2] == 'E') &&
           (word[3] == 'y' || word[3] == 'Y') && word[4] == '\0';
  }

  /// Overwrites memory with zeros, also when nothing reads it afterwards.
  static void wipe(void* memory, std::size_t size);

  /// Keeps the process from writing a core dump for the rest of its life.
  static void forbidCoreDump();
};

}  // namespace Port
