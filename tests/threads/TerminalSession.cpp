#include "tests/threads/TerminalSession.h"

#include <fcntl.h>
#include <poll.h>
#include <pty.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cstdlib>
#include <fstream>

namespace {

constexpr int tenthOfSecond = 100;  // milliseconds
constexpr int patience = 600;       // tenths of a second

}  // namespace

TerminalSession::TerminalSession(const std::string& testName)
    : directory_(std::filesystem::temp_directory_path() /
                 ("tessel-threads-" + testName + "-" + std::to_string(::getpid()))) {
  std::filesystem::create_directories(directory_);
}

TerminalSession::~TerminalSession() {
  if (process_ > 0 && !ended_) {
    ::kill(process_, SIGKILL);
    ::waitpid(process_, &status_, 0);
  }
  hangUp();
  std::error_code ignored;
  std::filesystem::remove_all(directory_, ignored);
}

void TerminalSession::writeFile(const std::string& name, const std::string& text) const {
  std::filesystem::create_directories((directory_ / name).parent_path());
  std::ofstream(directory_ / name) << text;
}

void TerminalSession::start(const std::vector<std::string>& arguments) {
  process_ = ::forkpty(&terminal_, nullptr, nullptr, nullptr);
  if (process_ != 0) return;
  std::filesystem::current_path(directory_);
  ::setenv("XDG_RUNTIME_DIR", directory_.c_str(), 1);
  std::vector<char*> words;
  std::string program = TESSEL_PROGRAM;
  words.push_back(program.data());
  std::vector<std::string> copies = arguments;
  for (std::string& argument : copies) words.push_back(argument.data());
  words.push_back(nullptr);
  ::execv(program.c_str(), words.data());
  ::_exit(127);
}

void TerminalSession::type(const std::string& keys) const {
  if (::write(terminal_, keys.data(), keys.size()) < 0) std::perror("terminal");
}

void TerminalSession::hangUp() {
  if (terminal_ >= 0) ::close(terminal_);
  terminal_ = -1;
}

bool TerminalSession::collect() {
  if (terminal_ < 0) return false;
  pollfd wanted{terminal_, POLLIN, 0};
  if (::poll(&wanted, 1, tenthOfSecond) == 0) return true;
  std::array<char, 4096> buffer{};
  const ssize_t count = ::read(terminal_, buffer.data(), buffer.size());
  if (count <= 0) return false;
  output_.append(buffer.data(), static_cast<std::size_t>(count));
  return true;
}

bool TerminalSession::waitFor(const std::string& text) {
  for (int i = 0; i < patience && output_.find(text) == std::string::npos; ++i)
    if (!collect()) break;
  return output_.find(text) != std::string::npos;
}

bool TerminalSession::running() {
  if (!ended_) ended_ = ::waitpid(process_, &status_, WNOHANG) == process_;
  return !ended_;
}

int TerminalSession::finish() {
  for (int i = 0; i < patience && running(); ++i)
    if (!collect()) ::usleep(tenthOfSecond * 1000);
  if (running()) return 1000;
  for (int i = 0; i < patience && collect(); ++i) continue;  // what it wrote last
  return WIFSIGNALED(status_) ? -WTERMSIG(status_) : WEXITSTATUS(status_);
}
