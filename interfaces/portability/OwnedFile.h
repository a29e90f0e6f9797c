#pragma once

#include <string>

#include "interfaces/Export.h"

namespace Port {

/// Files that say which process owns them. The file holds the owner's process id and, behind a blank, a
/// mark of when that process started, so that a process that got the same id later is not taken for it; a
/// file with the id alone is read, too.
class TESSEL_EXPORT OwnedFile {
 public:
  struct Owner {
    bool exists = false;   ///< the file is there
    int process = 0;       ///< 0 when the file does not tell
    bool running = false;  ///< the owner has not ended
    std::string content;   ///< the file's text
    std::string problem;   ///< why the file could not be made, for an error message
  };

  /// The user's own directory for files of running programs, made when missing; no other user can write
  /// in it. Empty when there is none.
  static std::string runtimeDirectory();

  /// Makes the file with this process as its owner, in one step. False when it exists (`owner` then tells
  /// whose it is) or can't be made (`owner.problem`).
  static bool create(const std::string& path, Owner& owner);
  static Owner owner(const std::string& path);
  static bool remove(const std::string& path);
  /// Removes the file if it is still the one seen.
  static bool removeStale(const std::string& path, const Owner& seen);
};

}  // namespace Port
