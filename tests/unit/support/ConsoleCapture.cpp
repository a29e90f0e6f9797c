#include "tests/unit/support/ConsoleCapture.h"

#include <stdio_ext.h>
#include <unistd.h>

#include <array>
#include <stdexcept>

#include "interfaces/portability/Port_MsgManDefault.h"

namespace testsupport {
namespace {

using File = std::unique_ptr<std::FILE, int (*)(std::FILE*)>;

File temporaryFile() {
  File file(std::tmpfile(), &std::fclose);
  if (file == nullptr) throw std::runtime_error("can't make a temporary file");
  return file;
}

/// All bytes of a file, read past its `FILE` so that the place of the writer stays.
std::string contentOf(std::FILE* file) {
  std::fflush(file);
  std::string text;
  std::array<char, 4096> buffer{};
  for (;;) {
    const ssize_t count = ::pread(::fileno(file), buffer.data(), buffer.size(), static_cast<off_t>(text.size()));
    if (count <= 0) return text;
    text.append(buffer.data(), static_cast<std::size_t>(count));
  }
}

/// Nothing that was read ahead of the former input stays.
void replaceStandardInput(int descriptor) {
  ::dup2(descriptor, STDIN_FILENO);
  ::__fpurge(stdin);
  std::clearerr(stdin);
}

}  // namespace

ConsoleCapture::ConsoleCapture() : output_(temporaryFile()), errors_(temporaryFile()) {
  Port_MsgManDefault::setConsole(output_.get(), errors_.get());
}

ConsoleCapture::~ConsoleCapture() { Port_MsgManDefault::setConsole(stdout, stderr); }

std::string ConsoleCapture::output() const { return contentOf(output_.get()); }
std::string ConsoleCapture::errors() const { return contentOf(errors_.get()); }

StandardOutputCapture::StandardOutputCapture() : file_(temporaryFile()), former_(::dup(STDOUT_FILENO)) {
  std::fflush(stdout);
  ::dup2(::fileno(file_.get()), STDOUT_FILENO);
}

StandardOutputCapture::~StandardOutputCapture() { end(); }

void StandardOutputCapture::end() {
  if (former_ < 0) return;
  std::fflush(stdout);
  ::dup2(former_, STDOUT_FILENO);
  ::close(former_);
  former_ = -1;
}

std::string StandardOutputCapture::text() {
  end();
  return contentOf(file_.get());
}

StandardInput::StandardInput(const std::string& text) : file_(temporaryFile()), former_(::dup(STDIN_FILENO)) {
  std::fwrite(text.data(), 1, text.size(), file_.get());
  std::fflush(file_.get());
  ::lseek(::fileno(file_.get()), 0, SEEK_SET);
  replaceStandardInput(::fileno(file_.get()));
}

StandardInput::~StandardInput() {
  replaceStandardInput(former_);
  ::close(former_);
}

}  // namespace testsupport
