#pragma once

#include "interfaces/Export.h"

/// Functions on path texts. Both `/` and `\` separate components, whatever the platform.
class TESSEL_EXPORT UT_PATH {
 public:
  /// The extension of a path: what follows the last dot of its last component, without the dot. It points
  /// into `path` and is null when that component holds no dot.
  static const char* GetExt(const char* path);

  /// Copies the extension into a buffer of `size` characters, the terminating zero included; a path
  /// without one gives an empty text. False when it does not fit; the buffer is then empty.
  static bool GetExt(const char* path, char* buffer, int size);

  /// The text after the last separator, or the whole path when it has none.
  static const char* GetTail(const char* path);
};
