#pragma once

#include "interfaces/Export.h"
#include "interfaces/portability/StringBase.h"

/// Operations on path names; none looks at the file system but for the current directory.
class TESSEL_EXPORT FileUtility {
 public:
  /// A full path as it is; another one joined to `base`, or to the current directory when `base` is empty.
  static StringBase convertPath(const StringBase& path, const StringBase& base);
  /// The directory part of a path, without a trailing slash (but for the root); empty when it has none.
  static StringBase getHead(const StringBase& path);
  /// The last component of a path.
  static StringBase getTail(const StringBase& path);
};
