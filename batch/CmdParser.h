#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "interfaces/Export.h"
#include "interfaces/devicemanager/ConfigDeviceNS.h"
#include "interfaces/devicemanager/tESSELNS.h"
#include "interfaces/portability/Stream.h"
#include "interfaces/portability/StringBase.h"
#include "interfaces/utility/CommandSet.h"

class DeviceManagerInterface;
class UT_CMDARGS;

/// One session of the batch command interpreter: it reads command lines from the console or a command
/// file, checks them, reports in fixed texts and hands the work to the device manager.
///
///   CmdParser session;
///   session.setMsgWrite(false);                          // no batch log
///   const bool ok = session.runCommandFile("line.cmd");  // goes on at the prompt unless the file quits
///
/// One session at a time, used by one thread: its end releases the process-wide device manager. Ctrl-C lets the running
/// command end and stops before the next line. Errors are reported through the message dispatcher; the results tell
/// success. The control handler stays registered after the session's end. Only the first five members are exported from
/// the library.
class CmdParser {
 public:
  TESSEL_EXPORT CmdParser();
  /// Unlocks and closes the cable when a mode is set, releases the device manager, ends the batch log.
  TESSEL_EXPORT ~CmdParser();
  CmdParser(const CmdParser&) = delete;
  CmdParser& operator=(const CmdParser&) = delete;

  /// Prompts with ">" and runs lines from standard input until quit, exit, an interrupt or the end of
  /// input. The result is that of the last line before the ending one; true when there was none.
  TESSEL_EXPORT bool runCommandLine();

  /// Runs the lines of a file up to the first that fails, then goes on with `runCommandLine` unless the
  /// file quit or failed. False when the file cannot be opened or read.
  TESSEL_EXPORT bool runCommandFile(const char* path);

  /// Whether `runCommandFile` keeps a batch log. Call it before.
  TESSEL_EXPORT void setMsgWrite(bool on);

  /// The argument of every request for the cable's lock.
  static constexpr int cableLock = 5;

  // The session's state, visible to the host.

  std::unique_ptr<Port::Stream> commandFile;   ///< the command file being run
  bool recordOn = false;                       ///< the transcript goes to `recordStream` when the run ends
  bool modeSet = false;                        ///< a setMode was seen
  bool subModeSet = false;                     ///< a setsubMode succeeded
  bool cableSet = false;                       ///< a setCable succeeded
  bool infoRunning = false;                    ///< the info command runs
  bool lastIdentifyOk = true;                  ///< the result of the last identify
  bool checkRunning = false;                   ///< checkIntegrity, info or identify runs
  std::unique_ptr<Port::Stream> recordStream;  ///< where the transcript goes
  StringBase commandText{"", 2048};            ///< the transcript: every line read, each followed by "\n"
  StringBase auxText;                          ///< the host's own
  DeviceManagerInterface* deviceManager;       ///< borrowed; null when the process has none
  bool archiveSaving = false;                  ///< a saveArchive has begun and not ended well
  std::vector<CommandSet> repeatBuffer;        ///< the commands of the open repeat loop
  bool inRepeat = false;                       ///< a repeatStart waits for its repeatEnd
  std::int32_t repeatCount = 0;                ///< how often the open repeat loop is to run
  bool quitRequested = false;                  ///< the session ends; never cleared
  bool useBatchLog = true;                     ///< `runCommandFile` keeps a batch log

  // Lines.

  /// Carries out a line: blank lines, repeat loops, quit and exit here, the rest by `dispatch`.
  bool processLine(CommandSet& line);
  /// Runs the collected commands `repeatCount` times, up to the first that fails, and forgets them.
  bool runRepeatLoop();
  /// Checks a line against the command table and reports what is wrong with it.
  bool parseCommand(std::unique_ptr<UT_CMDARGS>& parsed, CommandSet& line);
  /// Puts a line into the transcript and splits it; false for a comment.
  bool recordAndTokenise(const char* line, CommandSet& command);
  /// Runs a command: positions, external utilities, parsing, progress callback, handler.
  bool dispatch(CommandSet& line);

  // Preconditions. Each reports what is missing.

  bool checkModeSet() const;
  bool checkSubModeSet() const;
  /// The result is `cableSet` (true while info runs), whatever was reported about the mode.
  bool checkCableSet() const;
  bool checkIdentify() const;
  bool isActiveMode(tESSELNS::MODE_TYPE mode) const;
  bool checkFormatterMode() const;
  bool checkChainContents(tESSELNS::MODE_TYPE mode) const;

  // Command handlers, one a command word unless said otherwise; true means success.

  bool help(UT_CMDARGS& args);

  bool setMode(UT_CMDARGS& args);
  bool setsubMode(UT_CMDARGS& args);
  bool setTargetDevice(UT_CMDARGS& args);
  bool setPreference(UT_CMDARGS& args);
  bool setMbBpiDevice(UT_CMDARGS& args);
  bool setMbBpiType(UT_CMDARGS& args);
  bool setMbBpiChain(UT_CMDARGS& args);
  bool setBpiWidth(UT_CMDARGS& args);
  bool setEnv(UT_CMDARGS& args);
  bool unsetEnv(UT_CMDARGS& args);

  bool setCable(UT_CMDARGS& args);
  bool setCableSpeed(UT_CMDARGS& args);
  bool setCableOption(UT_CMDARGS& args);
  bool runCableDiagnostics(UT_CMDARGS& args);

  bool addDevice(UT_CMDARGS& args);
  bool assignFile(UT_CMDARGS& args);
  bool attachFlash(UT_CMDARGS& args);
  bool assignFileToAttachedFlash(UT_CMDARGS& args);
  bool deleteAttachedFlash(UT_CMDARGS& args);
  bool addAdditionalConfigFile(UT_CMDARGS& args);
  bool clearAdditionalConfigFiles(UT_CMDARGS& args);
  bool defineDevice(UT_CMDARGS& args);
  bool deleteDevice(UT_CMDARGS& args);
  bool setAttribute(UT_CMDARGS& args);

  /// Runs every command that works on devices through the device manager; may add words to the line.
  bool runOperation(UT_CMDARGS& args, CommandSet& words);
  bool programEFuse(UT_CMDARGS& args, CommandSet& words);

  bool addCollection(UT_CMDARGS& args);
  bool deleteCollection(UT_CMDARGS& args);
  bool renameCollection(UT_CMDARGS& args);
  bool setCurrentCollection(UT_CMDARGS& args);
  bool addDesign(UT_CMDARGS& args);
  bool deleteDesign(UT_CMDARGS& args);
  bool setCurrentDesign(UT_CMDARGS& args);
  bool addDeviceChain(UT_CMDARGS& args);
  bool deleteDeviceChain(UT_CMDARGS& args);
  bool setCurrentDeviceChain(UT_CMDARGS& args);
  bool addConfigDevice(UT_CMDARGS& args);
  bool deleteConfigDevice(UT_CMDARGS& args);
  bool addPromDevice(UT_CMDARGS& args);
  bool deletePromDevice(UT_CMDARGS& args);
  bool generate(UT_CMDARGS& args, CommandSet& words);
  bool loadPdr(UT_CMDARGS& args);

  bool saveProjectFile(UT_CMDARGS& args);
  /// Of loadProjectFile and loadCdf.
  bool loadProjectFile(UT_CMDARGS& args);
  bool saveCdf(UT_CMDARGS& args);
  bool saveArchive(UT_CMDARGS& args);
  bool loadArchive(UT_CMDARGS& args);
  bool saveCmd(UT_CMDARGS& args);
  bool setLog(UT_CMDARGS& args);
  bool renameBatchCmdFile(UT_CMDARGS& args);

  // Operations that no command word leads to.

  /// Sets an attribute of the output configuration device; `quiet` keeps it out of the batch-command file.
  bool setConfigDeviceAttribute(ConfigDeviceNS::ATTRIBUTE attribute, const char* value, bool quiet);
  bool renamePromFile(UT_CMDARGS& args);
  bool renameMpmFile(UT_CMDARGS& args);

 private:
  struct Line;

  /// Records and carries out a line; the result stays as it is for a comment. A line with a key is wiped.
  bool runLine(Line& line, bool result);
  /// Writes the transcript to the record stream if saveCmd asked for it.
  void writeRecord();
};

/// The text after the last slash or backslash, or the whole path when it has neither.
const char* baseName(const char* path);
