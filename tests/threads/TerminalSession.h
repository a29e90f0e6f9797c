#pragma once

#include <sys/types.h>

#include <filesystem>
#include <string>
#include <vector>

/// The program tessel on a pseudo-terminal of its own, in an empty directory of its own that is also its
/// runtime directory.
class TerminalSession {
 public:
  explicit TerminalSession(const std::string& testName);
  ~TerminalSession();
  TerminalSession(const TerminalSession&) = delete;
  TerminalSession& operator=(const TerminalSession&) = delete;

  const std::filesystem::path& directory() const { return directory_; }
  void writeFile(const std::string& name, const std::string& text) const;

  void start(const std::vector<std::string>& arguments);
  void type(const std::string& keys) const;
  /// Closes the terminal, as when its window goes away.
  void hangUp();
  pid_t process() const { return process_; }

  /// Collects output until it holds the text; false when the program ends or a minute passes without it.
  bool waitFor(const std::string& text);
  /// Collects what comes within a tenth of a second; false when the terminal is closed.
  bool collect();
  bool running();
  /// Waits for the program's end: its exit code, or minus the number of the signal that ended it.
  int finish();
  const std::string& output() const { return output_; }

 private:
  std::filesystem::path directory_;
  int terminal_ = -1;
  pid_t process_ = -1;
  int status_ = 0;
  bool ended_ = false;
  std::string output_;
};
