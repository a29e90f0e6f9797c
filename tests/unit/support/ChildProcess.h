#pragma once

#include <sys/types.h>

#include <functional>
#include <string>
#include <vector>

namespace testsupport {

/// A child process whose standard output the test reads line by line. A child that is still there at the
/// end is killed.
class ChildProcess {
 public:
  /// Runs a program; the words after its path are its arguments. `prepare` runs in the child before it.
  explicit ChildProcess(const std::vector<std::string>& command, const std::function<void()>& prepare = {});
  /// Runs a function in a copy of this process; the child ends with the function's result.
  explicit ChildProcess(const std::function<int()>& body);
  ~ChildProcess();
  ChildProcess(const ChildProcess&) = delete;
  ChildProcess& operator=(const ChildProcess&) = delete;

  pid_t id() const { return id_; }
  void send(int signal) const;

  /// The next line of the child's output without its line end; "(end)" when there is none, "(silence)" when
  /// none came in five seconds.
  std::string readLine();
  /// All that is left of the child's output.
  std::string readAll();
  /// Lets a child that waits for the end of its input go on.
  void closeInput();

  /// Waits for the child's end: "exit N" or "signal N"; "goes on" when it did not end in five seconds.
  std::string wait();

 private:
  void begin(const std::function<int()>& body);
  bool fill();

  pid_t id_ = -1;
  int output_ = -1;
  int input_ = -1;
  std::string pending_;
};

/// Runs a function in a copy of this process, for what can't be undone or may end it. How the copy ends, behind
/// what it prints: "exit 0" unless a check in it fails.
std::string runInChild(const std::function<void()>& body);

}  // namespace testsupport
