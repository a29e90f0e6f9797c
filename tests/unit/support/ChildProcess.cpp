#include "tests/unit/support/ChildProcess.h"

#include <gtest/gtest.h>
#include <poll.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cstdio>
#include <stdexcept>
#include <utility>

namespace testsupport {
namespace {

constexpr int patience = 5000;  // milliseconds

void closeOnce(int& descriptor) {
  if (descriptor >= 0) ::close(descriptor);
  descriptor = -1;
}

}  // namespace

ChildProcess::ChildProcess(const std::vector<std::string>& command, const std::function<void()>& prepare) {
  begin([&command, &prepare] {
    if (prepare) prepare();
    std::vector<std::string> words = command;
    std::vector<char*> arguments;
    for (std::string& word : words) arguments.push_back(word.data());
    arguments.push_back(nullptr);
    ::execv(arguments.front(), arguments.data());
    return 127;
  });
}

ChildProcess::ChildProcess(const std::function<int()>& body) { begin(body); }

ChildProcess::~ChildProcess() {
  if (id_ > 0) {
    ::kill(id_, SIGKILL);
    ::waitpid(id_, nullptr, 0);
  }
  closeOnce(output_);
  closeOnce(input_);
}

void ChildProcess::begin(const std::function<int()>& body) {
  std::array<int, 2> fromChild{};
  std::array<int, 2> toChild{};
  if (::pipe(fromChild.data()) != 0 || ::pipe(toChild.data()) != 0) throw std::runtime_error("can't make a pipe");
  std::fflush(nullptr);
  id_ = ::fork();
  if (id_ == 0) {
    ::dup2(toChild[0], STDIN_FILENO);
    ::dup2(fromChild[1], STDOUT_FILENO);
    for (const int end : {fromChild[0], fromChild[1], toChild[0], toChild[1]}) ::close(end);
    const rlimit noCore{0, 0};
    ::setrlimit(RLIMIT_CORE, &noCore);
    const int code = body();
    std::fflush(stdout);
    ::_exit(code);
  }
  ::close(fromChild[1]);
  ::close(toChild[0]);
  output_ = fromChild[0];
  input_ = toChild[1];
  if (id_ < 0) throw std::runtime_error("can't fork");
}

void ChildProcess::send(int signal) const { ::kill(id_, signal); }

bool ChildProcess::fill() {
  std::array<char, 4096> buffer{};
  const ssize_t count = ::read(output_, buffer.data(), buffer.size());
  if (count > 0) pending_.append(buffer.data(), static_cast<std::size_t>(count));
  return count > 0;
}

std::string ChildProcess::readLine() {
  for (;;) {
    const std::size_t end = pending_.find('\n');
    if (end != std::string::npos) {
      std::string line = pending_.substr(0, end);
      pending_.erase(0, end + 1);
      return line;
    }
    pollfd wanted{output_, POLLIN, 0};
    if (::poll(&wanted, 1, patience) == 0) return "(silence)";
    if (!fill()) return "(end)";
  }
}

std::string ChildProcess::readAll() {
  while (fill()) continue;
  return std::exchange(pending_, {});
}

void ChildProcess::closeInput() { closeOnce(input_); }

std::string ChildProcess::wait() {
  closeInput();
  int status = 0;
  pid_t ended = 0;
  for (int waited = 0; (ended = ::waitpid(id_, &status, WNOHANG)) == 0 && waited < patience; ++waited) ::usleep(1000);
  if (ended != id_) return "goes on";
  id_ = -1;
  return WIFSIGNALED(status) ? "signal " + std::to_string(WTERMSIG(status))
                             : "exit " + std::to_string(WEXITSTATUS(status));
}

std::string runInChild(const std::function<void()>& body) {
  ChildProcess child([&body] {
    body();
    return testing::Test::HasFailure() ? 1 : 0;
  });
  const std::string printed = child.readAll();
  return printed + child.wait();
}

}  // namespace testsupport
