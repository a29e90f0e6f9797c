#pragma once

#include <string>

/// The cable lock of a user: a file with the owner's process id, so that two sessions do not drive one
/// cable. A lock whose owner no longer runs is stale; it stays until it is cleaned, for the cable may have
/// been left in the middle of something.
class CableLock {
 public:
  /// The lock file under the user's runtime directory.
  CableLock();
  explicit CableLock(std::string path);
  ~CableLock();
  CableLock(const CableLock&) = delete;
  CableLock& operator=(const CableLock&) = delete;

  /// From now on the lock is the one of that cable: a file of its own beside the common one, which the empty name
  /// means. A lock of another name that is held is given back.
  void use(const std::string& cable);

  /// Takes the lock when nobody has it; false, without a message, when somebody does.
  bool tryLock();
  /// Takes the lock, trying up to `tries` times, a tenth of a second apart. True when it is held already;
  /// false after an error that names the owner.
  bool lock(int tries);
  /// Gives the lock back; true also when it is not held.
  bool unlock();
  /// Removes a stale lock. True when there is no lock afterwards or it is this session's; false, after an
  /// error, for a live one.
  bool clean();

  bool held() const { return held_; }
  const std::string& path() const { return path_; }

 private:
  std::string path_;
  std::string commonPath_;  ///< the file of the empty name
  bool held_ = false;
};
