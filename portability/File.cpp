#include "interfaces/portability/File.h"

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <system_error>

#include "portability/Descriptor.h"

namespace Port {

namespace {

/// Two names of one file, which can't be read and written at once.
bool isSame(const char* from, const char* to) {
  std::error_code error;
  return std::filesystem::equivalent(from, to, error);
}

/// Copies everything from one descriptor to another and closes both (-1 counts as a failure).
bool pump(int from, int to) {
  int error = from < 0 || to < 0 ? EIO : 0;
  std::vector<char> buffer(65536);
  for (long count = 1; error == 0 && count > 0;) {
    count = Descriptor::read(from, buffer.data(), buffer.size(), error);
    if (count > 0) Descriptor::write(to, buffer.data(), static_cast<std::size_t>(count), error);
  }
  if (from >= 0) Descriptor::close(from, error);
  if (to >= 0) Descriptor::close(to, error);
  return error == 0;
}

}  // namespace

std::unique_ptr<Stream> File::open(const char* path, int access, bool /*text*/) {
  const bool writing = access != read;
  if (!writing && std::strcmp(path, "-") == 0) return std::make_unique<Stream>(path, 0, false, false);
  const int descriptor =
      writing ? Descriptor::openForWriting(path, access == extend) : Descriptor::openForReading(path);
  if (descriptor < 0) return nullptr;
  return std::make_unique<Stream>(path, descriptor, writing, true);
}

bool File::close(std::unique_ptr<Stream>& stream) {
  const bool ok = stream == nullptr || stream->close();
  stream.reset();
  return ok;
}

bool File::probe(const char* path) { return Descriptor::isReadable(path); }

bool File::remove(const char* path) {
  std::error_code error;
  return std::filesystem::remove(path, error);
}

bool File::copy(const char* from, const char* to) {
  if (isSame(from, to)) return false;
  const int source = Descriptor::openForReading(from);
  return source >= 0 && pump(source, Descriptor::openForWriting(to));
}

bool File::append(const char* from, const char* to) {
  if (isSame(from, to)) return false;
  const int source = Descriptor::openForReading(from);
  return source >= 0 && pump(source, Descriptor::openForWriting(to, true));
}

::StringBase File::getcwd() {
  std::error_code error;
  return ::StringBase(std::filesystem::current_path(error).string());
}

bool File::getcwd(char* buffer, int size) {
  const ::StringBase directory = getcwd();
  if (size < 1) return false;
  buffer[0] = '\0';
  if (directory.empty() || directory.size() >= static_cast<std::size_t>(size)) return false;
  std::memcpy(buffer, directory.c_str(), directory.size() + 1);
  return true;
}

}  // namespace Port
