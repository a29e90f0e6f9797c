#include "manager/manager/CableLock.h"

#include <chrono>
#include <thread>

#include "interfaces/portability/OwnedFile.h"
#include "manager/support/LockFile.h"
#include "manager/support/Report.h"

namespace {

constexpr std::chrono::milliseconds betweenTries{100};

bool refuse(const std::string& path, const Port::OwnedFile::Owner& owner) {
  if (owner.process == 0) return reportError("Cable lock %s can't be taken: %s.\n", path, owner.problem);
  if (owner.running) return reportError("The cable is in use by process %d (lock file %s).\n", owner.process, path);
  return reportError("The cable lock %s was left by process %d, which has ended. Use cleanCableLock to remove it.\n",
                     path, owner.process);
}

}  // namespace

CableLock::CableLock() : CableLock(LockFile::commonPath()) {}

CableLock::CableLock(std::string path) : path_(path), commonPath_(std::move(path)) {}

CableLock::~CableLock() { unlock(); }

void CableLock::use(const std::string& cable) {
  const std::string path = LockFile::path(commonPath_, cable);
  if (path == path_) return;
  unlock();
  path_ = path;
}

bool CableLock::tryLock() {
  Port::OwnedFile::Owner owner;
  held_ = held_ || Port::OwnedFile::create(path_, owner);
  return held_;
}

bool CableLock::lock(int tries) {
  if (held_) return true;
  Port::OwnedFile::Owner owner;
  for (int i = 0; i == 0 || i < tries; ++i) {
    if (i > 0) std::this_thread::sleep_for(betweenTries);
    held_ = Port::OwnedFile::create(path_, owner);
    if (held_) return true;
    if (!owner.running) break;
  }
  return refuse(path_, owner);
}

bool CableLock::unlock() {
  if (!held_) return true;
  held_ = false;
  return Port::OwnedFile::remove(path_) || reportError("Cable lock %s can't be removed.\n", path_);
}

bool CableLock::clean() {
  if (held_) return true;
  const Port::OwnedFile::Owner owner = Port::OwnedFile::owner(path_);
  if (!owner.exists) return true;
  if (owner.running) return refuse(path_, owner);
  return Port::OwnedFile::removeStale(path_, owner) || reportError("Stale cable lock %s can't be removed.\n", path_);
}
