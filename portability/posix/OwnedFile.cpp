#include "interfaces/portability/OwnedFile.h"

#include <fcntl.h>
#include <signal.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <sstream>

#include "portability/Descriptor.h"

namespace Port {
namespace {

std::string readAll(const std::string& path, bool& exists) {
  const int descriptor = Descriptor::openForReading(path.c_str());
  exists = descriptor >= 0 || errno != ENOENT;
  if (descriptor < 0) return {};
  std::string text;
  std::array<char, 1024> buffer{};
  int error = 0;
  // /proc gives its texts in pieces; an owner's line is far below this bound.
  while (text.size() < buffer.size()) {
    const long count = Descriptor::read(descriptor, buffer.data(), buffer.size(), error);
    if (count <= 0) break;
    text.append(buffer.data(), static_cast<std::size_t>(count));
  }
  Descriptor::close(descriptor, error);
  return text;
}

/// When a process started, in clock ticks since the system's start; empty when the system does not tell.
std::string startMark(int process) {
  bool exists = false;
  const std::string status = readAll("/proc/" + std::to_string(process) + "/stat", exists);
  // The program's name stands in parentheses and may hold anything: count from behind it.
  const std::size_t nameEnd = status.rfind(')');
  if (nameEnd == std::string::npos) return {};
  std::istringstream fields(status.substr(nameEnd + 1));
  std::string field;
  constexpr int startField = 20;  // the 22nd of the line, the name being the 2nd
  for (int i = 0; i < startField; ++i) fields >> field;
  return fields ? field : std::string();
}

bool isRunning(int process, const std::string& mark) {
  if (process <= 0 || (::kill(process, 0) != 0 && errno == ESRCH)) return false;
  const std::string current = startMark(process);
  return mark.empty() || current.empty() || current == mark;
}

bool isOwnDirectory(const std::string& path) {
  struct stat status {};
  return ::lstat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode) && status.st_uid == ::getuid() &&
         (status.st_mode & (S_IWGRP | S_IWOTH)) == 0;
}

std::string ownDirectory(const std::string& path) {
  ::mkdir(path.c_str(), S_IRWXU);
  return isOwnDirectory(path) ? path : std::string();
}

}  // namespace

std::string OwnedFile::runtimeDirectory() {
  const char* runtime = std::getenv("XDG_RUNTIME_DIR");
  if (runtime != nullptr && *runtime == '/') {
    const std::string directory = ownDirectory(std::string(runtime) + "/tessel");
    if (!directory.empty()) return directory;
  }
  return ownDirectory("/tmp/tessel-" + std::to_string(::getuid()));
}

OwnedFile::Owner OwnedFile::owner(const std::string& path) {
  Owner owner;
  owner.content = readAll(path, owner.exists);
  std::istringstream fields(owner.content);
  std::string mark;
  if (!(fields >> owner.process)) owner.process = 0;
  fields >> mark;
  owner.running = isRunning(owner.process, mark);
  if (owner.exists && owner.process == 0) owner.problem = "it exists and names no process";
  return owner;
}

bool OwnedFile::create(const std::string& path, Owner& owner) {
  // Written beside and linked into place: whoever sees the file sees its owner.
  std::string temporary = path + ".XXXXXX";
  const int descriptor = ::mkostemp(temporary.data(), O_CLOEXEC);
  if (descriptor < 0) {
    owner = {};
    owner.problem = std::strerror(errno);
    return false;
  }
  const std::string content = std::to_string(::getpid()) + " " + startMark(::getpid()) + "\n";
  int error = 0;
  Descriptor::write(descriptor, content.data(), content.size(), error);
  Descriptor::close(descriptor, error);
  bool made = error == 0 && ::link(temporary.c_str(), path.c_str()) == 0;
  if (!made) {
    if (error == 0) error = errno;
    owner = OwnedFile::owner(path);
    if (owner.problem.empty() && owner.process == 0) owner.problem = std::strerror(error);
  }
  ::unlink(temporary.c_str());
  return made;
}

bool OwnedFile::remove(const std::string& path) { return ::unlink(path.c_str()) == 0; }

bool OwnedFile::removeStale(const std::string& path, const Owner& seen) {
  // Moved aside before it is looked at again: two sessions that clean at once can't remove a fresh lock.
  const std::string aside = path + "." + std::to_string(::getpid());
  if (::rename(path.c_str(), aside.c_str()) != 0) return errno == ENOENT;
  bool exists = false;
  const bool same = readAll(aside, exists) == seen.content;
  const bool done = same || ::link(aside.c_str(), path.c_str()) != 0;
  ::unlink(aside.c_str());
  return done && same;
}

}  // namespace Port
