#pragma once

#include <atomic>
#include <memory>

#include "interfaces/portability/Port_MsgManDefault.h"
#include "interfaces/portability/Stream.h"
#include "interfaces/portability/StringBase.h"

/// The message manager of batch use: every message is shown as usual and also written, as shown, into a
/// log file. At most one exists in the process; it stands in the dispatcher in place of the manager that
/// was there before, which must not be destroyed meanwhile. Failures of the log's file are silent: messages go on being
/// shown.
class TesselBatchMsgMan : public Port_MsgManDefault {
 public:
  /// Starts the log afresh: in `_tesselbatch.log` of the current directory for the name "default" (in any
  /// letter case), else in the named file.
  explicit TesselBatchMsgMan(const char* logName);
  /// Gives the dispatcher its former manager back and closes the log.
  ~TesselBatchMsgMan() override;

  void msgWrite(MsgType type, const wchar_t* text) override;

  /// Moves what the default log holds to the user's log, which the first move replaces and later ones
  /// extend.
  void copyToUserLog();

  /// Puts the batch log in place. One that is there stays, and `logName` is then ignored.
  static void installBatchLog(const char* logName);
  static void removeBatchLog();

 private:
  void writeBanner();

  std::unique_ptr<Port::Stream> logStream;
  bool firstCopy = true;  ///< the next copy to the user's log replaces it
  StringBase userLogPath;
  StringBase defaultLogPath;
};

/// Set when the batch log is put in place, cleared by every message it gets.
extern std::atomic<unsigned char> logFreshFlag;
