#include "manager/content/FileAccess.h"

#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <system_error>

namespace {

namespace fs = std::filesystem;

struct Closer {
  void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, Closer>;

std::string reason(int error) { return std::generic_category().message(error); }

Failure failure(const std::string& path, const std::string& what, const std::string& why) {
  return {.text = path + ": can't " + what + ": " + why, .kind = Failure::Kind::general};
}

/// The system's error number, 0 when all is written.
int writeAll(File file, std::string_view content) {
  errno = 0;
  if (std::fwrite(content.data(), 1, content.size(), file.get()) != content.size()) return errno != 0 ? errno : EIO;
  if (std::fflush(file.get()) != 0) return errno != 0 ? errno : EIO;
  return std::fclose(file.release()) == 0 ? 0 : errno;
}

/// A file that was not there before, beside `path`.
File createBeside(const std::string& path, std::string& made) {
  constexpr int tries = 100;
  for (int number = 0; number < tries; ++number) {
    made = path + ".new" + std::to_string(number);
    if (File file(std::fopen(made.c_str(), "wbx")); file || errno != EEXIST) return file;
  }
  return nullptr;
}

Status writeDirectly(const std::string& path, std::string_view content) {
  File file(std::fopen(path.c_str(), "wb"));
  if (!file) return failure(path, "open", reason(errno));
  const int error = writeAll(std::move(file), content);
  if (error != 0) return failure(path, "write", reason(error));
  return {};
}

}  // namespace

Result<std::string> FileAccess::read(const std::string& path, std::uint64_t most) {
  std::error_code error;
  const fs::file_status status = fs::status(path, error);
  if (!fs::exists(status)) return failure(path, "open", reason(error ? error.value() : ENOENT));
  if (!fs::is_regular_file(status)) return failure(path, "read", "it is no regular file");
  const std::uintmax_t size = fs::file_size(path, error);
  if (error) return failure(path, "read", error.message());
  if (size > most)
    return failure(path, "read", "it has " + std::to_string(size) + " bytes, expected at most " + std::to_string(most));
  const File file(std::fopen(path.c_str(), "rb"));
  if (!file) return failure(path, "open", reason(errno));
  std::string content(size, '\0');
  content.resize(std::fread(content.data(), 1, content.size(), file.get()));
  if (std::ferror(file.get()) != 0) return failure(path, "read", reason(errno));
  return content;
}

Status FileAccess::replace(const std::string& path, std::string_view content) {
  std::error_code error;
  const fs::file_status status = fs::status(path, error);
  if (fs::is_directory(status)) return failure(path, "write", reason(EISDIR));
  if (fs::exists(status) && !fs::is_regular_file(status)) return writeDirectly(path, content);
  // A link goes on showing the file, which is replaced where it lies.
  std::string target = path;
  if (fs::is_symlink(fs::symlink_status(path, error)))
    if (const fs::path real = fs::weakly_canonical(path, error); !error) target = real.string();

  std::string beside;
  File file = createBeside(target, beside);
  if (!file) return failure(path, "create", reason(errno));
  if (const int code = writeAll(std::move(file), content); code != 0) {
    fs::remove(beside, error);
    return failure(path, "write", reason(code));
  }
  if (fs::exists(status)) fs::permissions(beside, status.permissions(), error);
  fs::rename(beside, target, error);
  if (!error) return {};
  const std::string why = error.message();
  fs::remove(beside, error);
  return failure(path, "replace", why);
}
