#include "tests/conformance/runner/CaseProcess.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string_view>
#include <system_error>

#include "tests/conformance/runner/CaseSession.h"
#include "tests/conformance/runner/FileChecks.h"
#include "tests/conformance/runner/Trace.h"
#include "tests/conformance/runner/Workplace.h"

namespace conformance {
namespace {

using Clock = std::chrono::steady_clock;
constexpr std::chrono::seconds timeLimit{10};
constexpr std::size_t largestReport = std::size_t{16} << 20;

[[noreturn]] void failSystem(const char* what) { throw std::system_error(errno, std::generic_category(), what); }

/// An open file descriptor, closed at the end.
class Descriptor {
 public:
  explicit Descriptor(int number) : number_(number) {}
  ~Descriptor() { close(); }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;

  int number() const { return number_; }
  void close() {
    if (number_ >= 0) ::close(number_);
    number_ = -1;
  }

 private:
  int number_;
};

/// Everything that the process writes until it ends, is out of time or writes too much.
struct Collected {
  std::string text;
  std::string overrun;  ///< which limit was passed; empty for none
};

Collected collect(int pipe) {
  Collected collected;
  const Clock::time_point deadline = Clock::now() + timeLimit;
  std::array<char, 65536> buffer;
  for (;;) {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(deadline - Clock::now());
    pollfd source{pipe, POLLIN, 0};
    const int ready = left.count() > 0 ? poll(&source, 1, static_cast<int>(left.count())) : 0;
    if (ready < 0 && errno == EINTR) continue;
    if (ready <= 0) {
      collected.overrun = "the time limit of " + std::to_string(timeLimit.count()) + " s is over";
      return collected;
    }
    const ssize_t count = read(pipe, buffer.data(), buffer.size());
    if (count < 0 && errno == EINTR) continue;
    if (count <= 0) return collected;
    collected.text.append(buffer.data(), static_cast<std::size_t>(count));
    if (collected.text.size() > largestReport) {
      collected.overrun = "the trace is too long";
      return collected;
    }
  }
}

int waitFor(pid_t process) {
  int status = 0;
  while (waitpid(process, &status, 0) < 0)
    if (errno != EINTR) failSystem("waitpid");
  return status;
}

std::string describeSignal(int signal) {
  return "the process was ended by signal " + std::to_string(signal) + " (" + strsignal(signal) + ")";
}

void addEvent(Outcome& outcome, Event::Kind kind, Value value = Value()) {
  Event& event = outcome.events.emplace_back();
  event.kind = kind;
  event.value = std::move(value);
}

/// Adds what the end of the process says: an abort is an event, any other untimely end a failure.
void judgeEnd(Outcome& outcome, const Report& report, int status) {
  if (WIFSIGNALED(status) && WTERMSIG(status) == SIGABRT) {
    addEvent(outcome, Event::Kind::abort);
  } else if (WIFSIGNALED(status)) {
    outcome.failures.push_back(describeSignal(WTERMSIG(status)));
  } else if (WEXITSTATUS(status) != 0 && outcome.failures.empty()) {
    outcome.failures.push_back("the process ended with status " + std::to_string(WEXITSTATUS(status)));
  } else if (!report.finished && outcome.failures.empty()) {
    outcome.failures.push_back("the process ended before the case did");
  }
}

/// The child's side of the fork. It leaves by the C library's exit, so that leak checks run.
[[noreturn]] void performAndExit(const Case& script, const Surroundings& surroundings) {
  std::exit(performCase(script, surroundings));
}

Outcome judge(const Collected& collected, int status, const Case& script, int output, const std::string& directory) {
  Report report = parseReport(collected.text);
  Outcome outcome;
  outcome.events = std::move(report.events);
  outcome.failures = std::move(report.failures);
  const std::string rest = foldDirectory(readFrom(output, report.outputRead), directory);
  if (!rest.empty()) addEvent(outcome, Event::Kind::standardOutput, Value(Value::Kind::text, rest));
  if (collected.overrun.empty())
    judgeEnd(outcome, report, status);
  else
    outcome.failures.push_back(collected.overrun);
  outcome.checkLines = actualCheckLines(script.checks, report.facts, directory);
  return outcome;
}

}  // namespace

Outcome runCase(const Case& script) {
  const Workplace workplace;
  const Descriptor output(open(workplace.outputFile().c_str(), O_RDWR | O_CREAT | O_APPEND | O_CLOEXEC, 0600));
  if (output.number() < 0) failSystem("cannot make the file for standard output");
  std::array<int, 2> ends{};
  if (pipe2(ends.data(), O_CLOEXEC) != 0) failSystem("cannot make a pipe");
  const Descriptor reading(ends[0]);
  Descriptor writing(ends[1]);

  // Both processes would write what is still in the buffers.
  std::fflush(nullptr);
  const pid_t process = fork();
  if (process < 0) failSystem("cannot make a process");
  if (process == 0)
    performAndExit(script, {workplace.directory(), workplace.inputFile(), writing.number(), output.number()});

  // With the last writing end the pipe ends when the process does.
  writing.close();
  const Collected collected = collect(reading.number());
  if (!collected.overrun.empty()) kill(process, SIGKILL);
  const int status = waitFor(process);
  return judge(collected, status, script, output.number(), workplace.directory());
}

}  // namespace conformance
