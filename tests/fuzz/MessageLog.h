#pragma once

#include <string>

namespace fuzz {

/// What the message dispatcher passes on while this lives. One exists at a time. The message managers show
/// nothing from the first one on.
class MessageLog {
 public:
  MessageLog();
  ~MessageLog();
  MessageLog(const MessageLog&) = delete;
  MessageLog& operator=(const MessageLog&) = delete;

  int errors() const { return errors_; }
  int warnings() const { return warnings_; }
  /// Errors, warnings and status messages.
  int shown() const { return shown_; }
  const std::string& lastError() const { return lastError_; }
  /// The texts of all messages, debug traces included, one behind the other.
  const std::string& all() const { return all_; }
  void clear();

 private:
  int errors_ = 0;
  int warnings_ = 0;
  int shown_ = 0;
  std::string lastError_;
  std::string all_;
};

}  // namespace fuzz
