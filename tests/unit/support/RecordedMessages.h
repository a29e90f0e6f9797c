#pragma once

#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include "interfaces/portability/Port_MsgDispatcher.h"
#include "tests/unit/support/ConsoleCapture.h"

namespace testsupport {

struct Message {
  MsgType type;
  std::string text;
  bool operator==(const Message&) const = default;
};

inline Message error(std::string text) { return {MsgType::error, std::move(text)}; }
inline Message warning(std::string text) { return {MsgType::warning, std::move(text)}; }
inline Message status(std::string text) { return {MsgType::status, std::move(text)}; }
inline Message debug(std::string text) { return {MsgType::debug, std::move(text)}; }

inline std::ostream& operator<<(std::ostream& out, const Message& message) {
  constexpr const char* names[] = {"error", "warning", "status", "debug"};
  return out << names[static_cast<int>(message.type)] << " \"" << message.text << '"';
}

/// Every message of the process while the object lives, as issued; nothing of it reaches the console.
class RecordedMessages {
 public:
  RecordedMessages() {
    Port_MsgDispatcher::setObserver([this](MsgType type, const std::string& text) {
      messages_.push_back({type, text});
    });
  }
  ~RecordedMessages() { Port_MsgDispatcher::setObserver({}); }
  RecordedMessages(const RecordedMessages&) = delete;
  RecordedMessages& operator=(const RecordedMessages&) = delete;

  const std::vector<Message>& all() const { return messages_; }
  /// What was recorded since the last call.
  std::vector<Message> take() { return std::exchange(messages_, {}); }

 private:
  ConsoleCapture console_;
  std::vector<Message> messages_;
};

}  // namespace testsupport
