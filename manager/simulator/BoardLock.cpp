#include "manager/simulator/BoardLock.h"

#include <cctype>
#include <functional>

#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/OwnedFile.h"

BoardLock::~BoardLock() {
  if (!path_.empty()) Port::OwnedFile::remove(path_);
}

std::string BoardLock::pathOf(const std::string& lockName) {
  constexpr std::size_t longest = 60;
  const std::string name = "board " + lockName;
  std::string plain;
  for (const char each : name) {
    const bool kept = std::isalnum(static_cast<unsigned char>(each)) != 0 || each == '.' || each == '-';
    plain += kept ? each : '_';
  }
  if (plain.size() > longest) plain.erase(0, plain.size() - longest);
  plain += Port::format("-%08x", static_cast<std::uint32_t>(std::hash<std::string>()(name)));
  return Port::OwnedFile::runtimeDirectory() + "/cable-" + plain + ".lock";
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
