// A whole session: a command file against the scripted device manager of the conformance runner.
// Input: a line that says what the manager answers (see Answers.h), then the command file. What stands behind
// "#pdr " in a comment is a line of the file board.pdr.

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <csignal>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <string>
#include <string_view>

#include "batch/CmdParser.h"
#include "batch/Interrupts.h"
#include "interfaces/portability/Port_MsgDispatcher.h"
#include "tests/conformance/runner/Stage.h"
#include "tests/fuzz/Answers.h"
#include "tests/fuzz/LineModel.h"
#include "tests/fuzz/MemoryFile.h"
#include "tests/fuzz/MessageLog.h"
#include "tests/fuzz/Require.h"
#include "tests/fuzz/Scratch.h"

namespace {

using fuzz::MemoryFile;
using fuzz::require;

constexpr std::size_t roomOfLine = 1022;
/// A key that inputs may give; it must not turn up in a message.
constexpr std::string_view key = "S3cretKey42";
constexpr std::string_view keySwitch = " -key ";
constexpr std::string_view descriptionMark = "#pdr ";
constexpr std::string_view usualDescription = "MODE pffserial\nPROM zp18v01\nDESIGN 0\nDEVICE marlin3-1\n";

/// How many commands the repeat loops of an input may run.
constexpr std::int64_t mostRepeated = 2000;

struct Input {
  explicit Input(std::string_view text)
      : answers(text.substr(0, text.find('\n'))),
        commands(text.substr(std::min(text.find('\n'), text.size() - 1) + 1)),
        lines(fuzz::linesOf(commands, roomOfLine)) {
    for (const std::string& line : lines)
      if (line.starts_with(descriptionMark)) description += line.substr(descriptionMark.size()) + "\n";
  }

  std::string_view answers;
  std::string_view commands;
  std::vector<std::string> lines;
  std::string description;
};

/// Nothing may be written outside the scratch directory.
bool staysInside(const Input& input) {
  return input.commands.find('/') == std::string_view::npos && input.commands.find("..") == std::string_view::npos;
}

bool endsSoon(const Input& input) {
  std::int64_t repeated = 0;
  for (const std::string& line : input.lines) {
    const fuzz::Words words = fuzz::wordsOf(line);
    if (words.comment || !fuzz::equalIgnoringCase(words.words.front(), "repeatStart")) continue;
    const std::int64_t loops = words.words.size() < 3 ? 1 : fuzz::leadingNumber(words.words[2].c_str());
    repeated += std::max<std::int64_t>(loops, 1) * static_cast<std::int64_t>(input.lines.size());
  }
  return repeated <= mostRepeated;
}

bool holds(std::string_view text, std::string_view part) {
  return std::search(text.begin(), text.end(), part.begin(), part.end(), [](char a, char b) {
           return fuzz::equalIgnoringCase({&a, 1}, {&b, 1});
         }) != text.end();
}

/// True when the key stands nowhere but as a word of its own behind -key.
bool keyIsSecret(const Input& input) {
  const auto isWhole = [](const std::string& line) { return line.size() < roomOfLine; };
  if (input.commands.find('"') != std::string_view::npos) return false;
  if (input.description.find(key) != std::string::npos) return false;
  if (!std::all_of(input.lines.begin(), input.lines.end(), isWhole)) return false;
  for (std::size_t at = input.commands.find(key); at != std::string_view::npos; at = input.commands.find(key, at + 1)) {
    const std::size_t end = at + key.size();
    if (at < keySwitch.size() || input.commands.substr(at - keySwitch.size(), keySwitch.size()) != keySwitch)
      return false;
    if (end < input.commands.size() && input.commands[end] != ' ' && input.commands[end] != '\n') return false;
  }
  return true;
}

int count(std::string_view text, std::string_view part) {
  int found = 0;
  for (std::size_t at = text.find(part); at != std::string_view::npos; at = text.find(part, at + 1)) ++found;
  return found;
}

void checkState(const CmdParser& session, const Input& input, bool result) {
  require(!session.infoRunning && !session.checkRunning, "no command is still running");
  require(!session.recordOn, "the transcript is written at the end of a run");
  require(session.recordStream == nullptr, "the transcript's file is closed");
  require(!result || session.quitRequested, "a run that succeeds ends the session");
  require(!result || session.repeatBuffer.empty(), "no loop is left over");
  if (holds(input.commands, "clearcmd")) return;
  std::string transcript;
  for (const std::string& line : input.lines) transcript += line + "\n";
  require(transcript.starts_with(session.commandText.view()), "the transcript holds the lines that were read");
}

/// What the calls of the session tell.
void checkTrace(const std::string& trace, const Input& input) {
  if (!holds(input.commands, "setBatchCommand"))
    require(count(trace, "call setBatchCommandOff()") == count(trace, "call setBatchCommandOn()"),
            "recording that was suspended goes on");
  require(count(trace, "\nE call removeDeviceManager()") == 1, "the session gives the device manager back");
}

/// The scripted device manager crosses a text out with `#` when the contract lets it go.
void checkLifeOfTexts(const std::string& trace, const std::string& messages, const Input& input) {
  if (input.commands.find('#') != std::string_view::npos) return;
  require(!holds(trace, "##") && !holds(messages, "##"), "no text of the device manager is used beyond its life");
}

/// The standard streams are nothing to read and nowhere to write; signals are the fuzzer's own.
void prepareProcess() {
  const fuzz::MessageLog opensWhatStaysOpen;
  require(std::freopen("/dev/null", "r", stdin) != nullptr && std::freopen("/dev/null", "w", stdout) != nullptr,
          "/dev/null can be opened");
  constexpr std::array signals = {SIGINT, SIGQUIT, SIGHUP, SIGTERM};
  std::array<struct sigaction, signals.size()> before{};
  for (std::size_t i = 0; i < signals.size(); ++i) ::sigaction(signals[i], nullptr, &before[i]);
  // The first registration in a process is the one that catches signals.
  SetConsoleCtrlHandler(consoleCtrlHandler, TRUE);
  for (std::size_t i = 0; i < signals.size(); ++i) ::sigaction(signals[i], &before[i], nullptr);
}

int lowestFreeDescriptor() {
  const int descriptor = ::dup(STDIN_FILENO);
  ::close(descriptor);
  return descriptor;
}

void runSession(const Input& input, const fuzz::Scratch& scratch, MemoryFile& commandFile, MemoryFile& reportFile) {
  commandFile.fill(input.commands);
  reportFile.fill("\n");
  ::lseek(reportFile.descriptor(), 0, SEEK_END);
  interruptRequested = interactive = allowBatchCallback = 0;

  fuzz::MessageLog messages;
  const Port_MsgManDefault* const manager = Port_MsgDispatcher::getDefaultMsgMan();
  const fuzz::Answers answers(input.answers);
  conformance::ReportWriter report(reportFile.descriptor());
  conformance::Trace trace(report, STDOUT_FILENO, scratch.path());
  conformance::Stage stage(answers.script, trace);
  {
    CmdParser session;
    session.setMsgWrite(answers.batchLog);
    const bool result = session.runCommandFile(commandFile.path().c_str());
    checkState(session, input, result);
    // Whoever calls again finds a session that is over, if it is.
    if (session.quitRequested) require(session.runCommandLine(), "a session that is over runs no line");
  }
  require(Port_MsgDispatcher::getDefaultMsgMan() == manager, "the batch log is taken down with its session");
  const std::string calls = reportFile.content();
  checkTrace(calls, input);
  checkLifeOfTexts(calls, messages.all(), input);
  if (keyIsSecret(input)) require(!holds(messages.all(), key), "a key goes into no message");
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int* /*count*/, char*** /*words*/) {
  prepareProcess();
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const fuzz::Scratch scratch;
  static MemoryFile commandFile;
  static MemoryFile reportFile;
  if (size == 0) return -1;
  const Input input({reinterpret_cast<const char*>(data), size});
  if (!staysInside(input) || !endsSoon(input)) return -1;
  const fuzz::Scratch::Visit visit(scratch, input.description.empty() ? usualDescription : input.description);
  const int descriptor = lowestFreeDescriptor();
  runSession(input, scratch, commandFile, reportFile);
  require(lowestFreeDescriptor() == descriptor, "every file is closed");
  return 0;
}
