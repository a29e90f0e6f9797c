#pragma once

#include <span>

#include "interfaces/Export.h"
#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/MsgType.h"

/// One message on its way: where it comes from, and the functions that issue it. Texts are printf formats
/// that carry their own line ends; the arguments are type-safe (see `Port::format`).
///
///   Port_MsgManData::createObject("tESSEL", "../s/CmdParser", __LINE__, revision)
///       .issueError("Design %d does not exist.\n", design);
///
/// Any thread may issue messages; the dispatcher passes them on one at a time.
class TESSEL_EXPORT Port_MsgManData {
 public:
  /// The texts are borrowed for the life of the object.
  static Port_MsgManData createObject(const char* productTag, const char* sourceFile, int line, const char* revision);

  template <class... Arguments>
  void issueError(const char* format, const Arguments&... arguments) const {
    issueFormatted(MsgType::error, format, arguments...);
  }
  template <class... Arguments>
  void issueWarning(const char* format, const Arguments&... arguments) const {
    issueFormatted(MsgType::warning, format, arguments...);
  }
  template <class... Arguments>
  void issueStatus(const char* format, const Arguments&... arguments) const {
    issueFormatted(MsgType::status, format, arguments...);
  }

  /// A debug trace: not shown, seen only by the dispatcher's observer.
  template <class... Arguments>
  static void debugStub(const char* format, const Arguments&... arguments) {
    if (debugWanted()) issueDebug(Port::format(format, arguments...));
  }

  const char* sourceFile() const { return sourceFile_; }
  int line() const { return line_; }
  const char* revision() const { return revision_; }

 private:
  Port_MsgManData(const char* productTag, const char* sourceFile, int line, const char* revision)
      : productTag_(productTag), sourceFile_(sourceFile), revision_(revision), line_(line) {}

  template <class... Arguments>
  void issueFormatted(MsgType type, const char* format, const Arguments&... arguments) const {
    issue(type, Port::format(format, arguments...));
  }
  void issue(MsgType type, const std::string& text) const;
  static bool debugWanted();
  static void issueDebug(const std::string& text);

  const char* productTag_;
  const char* sourceFile_;
  const char* revision_;
  int line_;
};
