#include "manager/manager/CableLock.h"

#include <cctype>
#include <chrono>
#include <functional>
#include <thread>

#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/OwnedFile.h"
#include "manager/support/Report.h"

namespace {

constexpr std::chrono::milliseconds betweenTries{100};

bool refuse(const std::string& path, const Port::OwnedFile::Owner& owner) {
  if (owner.process == 0) return reportError("Cable lock %s can't be taken: %s.\n", path, owner.problem);
  if (owner.running) return reportError("The cable is in use by process %d (lock file %s).\n", owner.process, path);
  return reportError("The cable lock %s was left by process %d, which has ended. Use cleanCableLock to remove it.\n",
                     path, owner.process);
}

/// A name that may stand in a file name; what is long or odd is told apart by its hash.
std::string fileName(const std::string& name) {
  constexpr std::size_t longest = 60;
  std::string result;
  for (const char each : name) {
    const bool plain = std::isalnum(static_cast<unsigned char>(each)) != 0 || each == '.' || each == '-';
    result += plain ? each : '_';
  }
  if (result.size() > longest) result.erase(0, result.size() - longest);
  return result + Port::format("-%08x", static_cast<std::uint32_t>(std::hash<std::string>()(name)));
}

}  // namespace

CableLock::CableLock() : CableLock(Port::OwnedFile::runtimeDirectory() + "/cable.lock") {}

CableLock::CableLock(std::string path) : path_(path), commonPath_(std::move(path)) {}

CableLock::~CableLock() { unlock(); }

void CableLock::use(const std::string& cable) {
  std::string path = commonPath_;
  if (!cable.empty()) {
    const std::string ending = ".lock";
    path.resize(path.size() - ending.size());
    path += "-" + fileName(cable) + ending;
  }
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
