#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "tests/conformance/runner/Event.h"
#include "tests/conformance/runner/Value.h"

namespace conformance {

/// Which calls a `given` or `during` line is about.
struct CallPattern {
  std::string name;
  std::optional<std::vector<Value>> arguments;  ///< absent: whatever the arguments
  int occurrence = 0;                           ///< the N-th matching call, from 1; 0 for every one
};

struct Given {
  CallPattern call;
  Value answer;
};

struct During {
  enum class Kind { progress, consoleEvent };
  CallPattern call;
  Kind kind = Kind::progress;
  std::array<std::int32_t, 3> progress = {};  ///< status, current count, total count
  std::uint32_t consoleEvent = 0;
};

/// A directory or a file to make before the first run.
struct Fixture {
  std::string path;
  bool directory = false;
  std::string text;
};

/// One call of `runCommandFile` or `runCommandLine`.
struct Run {
  enum class Kind { file, console, missing };
  Kind kind = Kind::console;
  std::vector<std::string> commands;
  std::vector<std::string> input;
  std::string path;  ///< of the missing file
};

struct Invocation {
  enum class Function { forceUnlockCable, signalHandler };
  Function function = Function::forceUnlockCable;
  int signal = 0;
};

/// A statement about the state, the environment or a file after the runs.
struct Check {
  enum class Kind { flag, transcript, environment, text, absent };
  Kind kind = Kind::flag;
  std::string name;                ///< of the flag or variable; the path of the file
  Value value;                     ///< of the flag, the transcript, or the variable
  std::vector<std::string> lines;  ///< of the file; `*` stands for any one line
  bool openEnd = false;            ///< the file's last line has no line end
};

/// The fields and module flags that cases may ask for. All but the number are `true` or `false`.
inline constexpr std::string_view numberFlag = "repeatCount";
inline constexpr std::array<std::string_view, 15> flagNames = {
    "modeSet",        "subModeSet",    "cableSet",           "infoRunning",        "checkRunning",
    "lastIdentifyOk", "recordOn",      "archiveSaving",      "useBatchLog",        "inRepeat",
    numberFlag,       "quitRequested", "allowBatchCallback", "interruptRequested", "interactive"};

struct Case {
  std::string title;
  std::string file;
  int line = 0;

  std::vector<std::pair<std::string, std::string>> environment;
  std::vector<Fixture> fixtures;
  std::vector<std::string> acceptedWords;
  bool batchLog = false;
  std::vector<Given> givens;
  std::vector<During> durings;
  std::vector<Run> runs;
  std::vector<Invocation> invocations;

  std::vector<Event> events;
  std::vector<Check> checks;
};

/// The first line of a check with this value in the place of the expected one. A text check has its lines
/// rendered by `renderFileLines`.
std::string renderCheck(const Check& check, const Value& value);
/// The lines of a text check: `| LINE`, and `|\` after a last line that has no line end.
std::vector<std::string> renderFileLines(const std::vector<std::string>& lines, bool openEnd);

}  // namespace conformance
