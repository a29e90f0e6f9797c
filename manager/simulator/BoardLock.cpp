#include "manager/simulator/BoardLock.h"

#include "interfaces/portability/OwnedFile.h"
#include "manager/support/LockFile.h"

BoardLock::~BoardLock() {
  if (!path_.empty()) Port::OwnedFile::remove(path_);
}

std::string BoardLock::pathOf(const std::string& lockName) {
  return LockFile::path(LockFile::commonPath(), "board " + lockName);
}

Status BoardLock::take(const std::string& lockName) {
  if (lockName.empty()) return {};
  const std::string path = pathOf(lockName);
  Port::OwnedFile::Owner owner;
  bool taken = Port::OwnedFile::create(path, owner);
  if (!taken && owner.exists && owner.process != 0 && !owner.running && Port::OwnedFile::removeStale(path, owner))
    taken = Port::OwnedFile::create(path, owner);
  if (taken) {
    path_ = path;
    return {};
  }
  if (owner.running)
    return Failure{lockName + " is in use by process " + std::to_string(owner.process) + " (lock file " + path + ")"};
  return Failure{"the lock " + path + " of " + lockName +
                 " can't be taken: " + (owner.problem.empty() ? "its owner is not known" : owner.problem)};
}
