#pragma once

#include <string>

#include "manager/support/Result.h"

/// Keeps two processes from using one board's state at a time. The file is the cable lock that a session takes which
/// has the same board in its own process, so that the two exclude each other, too.
class BoardLock {
 public:
  BoardLock() = default;
  ~BoardLock();
  BoardLock(const BoardLock&) = delete;
  BoardLock& operator=(const BoardLock&) = delete;

  /// Locks the board with this `SimulatedBoard::lockName`; an empty name needs no lock. A lock whose owner has ended
  /// is taken over. The failure names the owner.
  Status take(const std::string& lockName);

  static std::string pathOf(const std::string& lockName);

 private:
  std::string path_;  ///< empty when nothing is held
};
