#include "tests/fuzz/MessageLog.h"

#include <cstdio>

#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/Port_MsgManDefault.h"
#include "tests/fuzz/Require.h"

namespace fuzz {
namespace {

void silenceManagers() {
  static std::FILE* const sink = [] {
    std::FILE* const file = std::fopen("/dev/null", "w");
    require(file != nullptr, "/dev/null can be opened");
    Port_MsgManDefault::setConsole(file, file);
    return file;
  }();
  static_cast<void>(sink);
}

}  // namespace

MessageLog::MessageLog() {
  silenceManagers();
  Port_MsgDispatcher::setObserver([this](MsgType type, const std::string& text) {
    all_ += text;
    if (type == MsgType::debug) return;
    ++shown_;
    if (type == MsgType::warning) ++warnings_;
    if (type != MsgType::error) return;
    ++errors_;
    lastError_ = text;
  });
}

MessageLog::~MessageLog() { Port_MsgDispatcher::setObserver({}); }

void MessageLog::clear() {
  errors_ = warnings_ = shown_ = 0;
  lastError_.clear();
  all_.clear();
}

}  // namespace fuzz
