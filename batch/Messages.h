#pragma once

#include <source_location>

#include "interfaces/portability/Port_MsgManData.h"

/// How the interpreter issues messages: printf formats that carry their own line ends.
namespace Messages {

/// A format with the source line that issues it.
struct Format {
  Format(const char* format, std::source_location where = std::source_location::current())
      : text(format), line(static_cast<int>(where.line())) {}

  Port_MsgManData message() const {
    return Port_MsgManData::createObject("tESSEL", "../s/CmdParser", line, "$Revision: 1.27.14.1 $");
  }

  const char* text;
  int line;
};

template <class... Arguments>
void error(Format format, const Arguments&... arguments) {
  format.message().issueError(format.text, arguments...);
}

/// `error` for a handler that stops: gives its result.
template <class... Arguments>
[[nodiscard]] bool failure(Format format, const Arguments&... arguments) {
  format.message().issueError(format.text, arguments...);
  return false;
}

template <class... Arguments>
void warning(Format format, const Arguments&... arguments) {
  format.message().issueWarning(format.text, arguments...);
}

template <class... Arguments>
void status(Format format, const Arguments&... arguments) {
  format.message().issueStatus(format.text, arguments...);
}

template <class... Arguments>
void debug(const char* format, const Arguments&... arguments) {
  Port_MsgManData::debugStub(format, arguments...);
}

}  // namespace Messages
