#pragma once

#include <atomic>
#include <cstdio>
#include <string>
#include <vector>

#include "interfaces/Export.h"
#include "interfaces/portability/MsgType.h"

/// The message manager that shows messages on the console: errors and warnings on standard error, the
/// rest on standard output. The shown form is `ERROR:` or `WARNING:` and the text, or the text alone.
/// The dispatcher calls a manager from one thread at a time; destroying one takes it off the dispatcher.
class TESSEL_EXPORT Port_MsgManDefault {
 public:
  /// The name is the host's own, for telling managers apart; null for none.
  explicit Port_MsgManDefault(const char* name);
  virtual ~Port_MsgManDefault();
  Port_MsgManDefault(const Port_MsgManDefault&) = delete;
  Port_MsgManDefault& operator=(const Port_MsgManDefault&) = delete;

  /// Whether messages are shown without the word that tells their kind.
  virtual void setClean(bool clean);
  virtual bool getClean() const;
  /// A wish of the host to stop after an error; kept here for it, the manager itself goes on.
  virtual void setAbortFlag(bool abort);
  virtual bool getAbortFlag() const;
  /// Writes one formatted line to the console as it stands.
  virtual void output(MsgType type, const wchar_t* line);
  /// Shows a message: formats it and puts each of its lines out.
  virtual void msgWrite(MsgType type, const wchar_t* text);
  /// The shown form of a message, in `*count` lines: more than one when a line width is set and the text
  /// is wider. A line holds its own line end, if any; a wrap point carries none.
  virtual std::vector<std::wstring> msgFormat(MsgType type, bool clean, int maxWidth, const wchar_t* text,
                                              int* count) const;
  /// The line width in characters at which messages are wrapped, between words; 0 for never.
  virtual void setMaxLineWidth(int width);
  virtual int getMaxLineWidth() const;
  virtual void flush();

  const std::string& name() const { return name_; }

  /// Where all default managers of the process write, instead of standard output and standard error.
  static void setConsole(std::FILE* output, std::FILE* errors);

 private:
  std::string name_;
  // Set by the session's thread, read by whichever thread issues a message.
  std::atomic<bool> clean_ = false;
  std::atomic<bool> abort_ = false;
  std::atomic<int> maxLineWidth_ = 0;
};
