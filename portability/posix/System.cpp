#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>

#include "portability/Descriptor.h"
#include "portability/Environment.h"
#include "portability/LocalTime.h"

namespace {

template <class Call>
auto retried(Call call) {
  for (;;) {
    const auto result = call();
    if (result >= 0 || errno != EINTR) return result;
  }
}

void note(int& error) {
  if (error == 0) error = errno;
}

/// A directory counts as a failure.
int openFile(const char* path, int flags) {
  const int descriptor = retried([path, flags] { return ::open(path, O_RDONLY | O_CLOEXEC | flags); });
  struct stat status {};
  if (descriptor < 0 || ::fstat(descriptor, &status) != 0 || !S_ISDIR(status.st_mode)) return descriptor;
  ::close(descriptor);
  errno = EISDIR;
  return -1;
}

}  // namespace

int Descriptor::openForReading(const char* path) { return openFile(path, 0); }

bool Descriptor::isReadable(const char* path) {
  const int descriptor = openFile(path, O_NONBLOCK);
  if (descriptor >= 0) ::close(descriptor);
  return descriptor >= 0;
}

int Descriptor::openForWriting(const char* path, bool append) {
  const int flags = O_WRONLY | O_CREAT | O_CLOEXEC | (append ? O_APPEND : O_TRUNC);
  return retried([path, flags] { return ::open(path, flags, 0666); });
}

long Descriptor::read(int descriptor, char* buffer, std::size_t size, int& error) {
  const long count = retried([=] { return ::read(descriptor, buffer, size); });
  if (count < 0) note(error);
  return count;
}

bool Descriptor::write(int descriptor, const char* data, std::size_t size, int& error) {
  while (size > 0) {
    const long count = retried([=] { return ::write(descriptor, data, size); });
    if (count < 0) {
      note(error);
      return false;
    }
    data += count;
    size -= static_cast<std::size_t>(count);
  }
  return true;
}

void Descriptor::close(int descriptor, int& error) {
  if (::close(descriptor) != 0) note(error);
}

int setVariable(const char* name, const char* value) { return ::setenv(name, value, 1) == 0 ? 0 : errno; }
int unsetVariable(const char* name) { return ::unsetenv(name) == 0 ? 0 : errno; }

std::tm localTime(std::int64_t time) {
  std::tm parts{};
  const auto seconds = static_cast<std::time_t>(time);
  ::localtime_r(&seconds, &parts);
  return parts;
}
