#pragma once

#include <cstdio>
#include <memory>
#include <string>

namespace testsupport {

/// Everything that the process's message managers write while the object lives, in place of the console.
class ConsoleCapture {
 public:
  ConsoleCapture();
  ~ConsoleCapture();
  ConsoleCapture(const ConsoleCapture&) = delete;
  ConsoleCapture& operator=(const ConsoleCapture&) = delete;

  /// What went to standard output, and what to standard error.
  std::string output() const;
  std::string errors() const;

 private:
  using File = std::unique_ptr<std::FILE, int (*)(std::FILE*)>;
  File output_;
  File errors_;
};

/// Everything that reaches standard output, whoever writes it, up to `text`. What a test finds wrong before that
/// is not shown.
class StandardOutputCapture {
 public:
  StandardOutputCapture();
  ~StandardOutputCapture();
  StandardOutputCapture(const StandardOutputCapture&) = delete;
  StandardOutputCapture& operator=(const StandardOutputCapture&) = delete;

  /// Ends the capture; what was written.
  std::string text();

 private:
  void end();

  std::unique_ptr<std::FILE, int (*)(std::FILE*)> file_;
  int former_;
};

/// A text that comes as standard input while the object lives.
class StandardInput {
 public:
  explicit StandardInput(const std::string& text);
  ~StandardInput();
  StandardInput(const StandardInput&) = delete;
  StandardInput& operator=(const StandardInput&) = delete;

 private:
  std::unique_ptr<std::FILE, int (*)(std::FILE*)> file_;
  int former_;
};

}  // namespace testsupport
