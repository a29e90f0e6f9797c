#include "tests/conformance/runner/CaseSession.h"

#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <filesystem>
#include <fstream>
#include <memory>
#include <stdexcept>

#include "batch/CmdParser.h"
#include "batch/Interrupts.h"
#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/Port_MsgManDefault.h"
#include "interfaces/utility/TesselCmdargs.h"
#include "tests/conformance/runner/Stage.h"

namespace conformance {
namespace {

constexpr const char* commandFile = "session.cmd";
/// Set by the people who run the tests, perhaps; cases say so themselves.
constexpr const char* callbackVariable = "ZOR_TESSEL_ALLOWBATCHMODECALLBACK";
constexpr rlim_t largestFile = rlim_t{256} << 20;

/// Keeps the message managers' console output away from the standard output that the trace is made of.
class QuietConsole {
 public:
  QuietConsole() : sink_(std::fopen("/dev/null", "w"), &std::fclose) {
    Port_MsgManDefault::setConsole(sink_.get(), sink_.get());
  }
  ~QuietConsole() { Port_MsgManDefault::setConsole(stdout, stderr); }
  QuietConsole(const QuietConsole&) = delete;
  QuietConsole& operator=(const QuietConsole&) = delete;

 private:
  std::unique_ptr<std::FILE, int (*)(std::FILE*)> sink_;
};

Event::Kind kindOf(MsgType type) {
  switch (type) {
    case MsgType::error:
      return Event::Kind::error;
    case MsgType::warning:
      return Event::Kind::warning;
    case MsgType::status:
      return Event::Kind::status;
    case MsgType::debug:
      return Event::Kind::debug;
  }
  return Event::Kind::debug;
}

/// Puts all messages into the trace.
class MessageTap {
 public:
  explicit MessageTap(Trace& trace) {
    Port_MsgDispatcher::setObserver(
        [&trace](MsgType type, const std::string& text) { trace.add(kindOf(type), Value(Value::Kind::text, text)); });
  }
  ~MessageTap() { Port_MsgDispatcher::setObserver({}); }
  MessageTap(const MessageTap&) = delete;
  MessageTap& operator=(const MessageTap&) = delete;
};

struct StateFlag {
  std::string_view name;
  std::int64_t (*read)(const CmdParser& session);
};
constexpr StateFlag stateFlags[] = {
    {"modeSet", [](const CmdParser& s) -> std::int64_t { return s.modeSet; }},
    {"subModeSet", [](const CmdParser& s) -> std::int64_t { return s.subModeSet; }},
    {"cableSet", [](const CmdParser& s) -> std::int64_t { return s.cableSet; }},
    {"infoRunning", [](const CmdParser& s) -> std::int64_t { return s.infoRunning; }},
    {"checkRunning", [](const CmdParser& s) -> std::int64_t { return s.checkRunning; }},
    {"lastIdentifyOk", [](const CmdParser& s) -> std::int64_t { return s.lastIdentifyOk; }},
    {"recordOn", [](const CmdParser& s) -> std::int64_t { return s.recordOn; }},
    {"archiveSaving", [](const CmdParser& s) -> std::int64_t { return s.archiveSaving; }},
    {"useBatchLog", [](const CmdParser& s) -> std::int64_t { return s.useBatchLog; }},
    {"inRepeat", [](const CmdParser& s) -> std::int64_t { return s.inRepeat; }},
    {numberFlag, [](const CmdParser& s) -> std::int64_t { return s.repeatCount; }},
    {"quitRequested", [](const CmdParser& s) -> std::int64_t { return s.quitRequested; }},
    {"allowBatchCallback", [](const CmdParser&) -> std::int64_t { return allowBatchCallback.load(); }},
    {"interruptRequested", [](const CmdParser&) -> std::int64_t { return interruptRequested.load(); }},
    {"interactive", [](const CmdParser&) -> std::int64_t { return interactive.load(); }},
};
static_assert(std::equal(std::begin(stateFlags), std::end(stateFlags), flagNames.begin(), flagNames.end(),
                         [](const StateFlag& flag, std::string_view name) { return flag.name == name; }),
              "every flag that a case may name, in the same order");

Value readFlag(const CmdParser& session, std::string_view name) {
  const StateFlag* flag = stateFlags;
  while (flag->name != name) ++flag;
  const std::int64_t value = flag->read(session);
  return name == numberFlag ? Value(Value::Kind::number, value) : Value(Value::Kind::boolean, value != 0 ? 1 : 0);
}

void writeFile(const std::string& path, const std::string& text) {
  std::ofstream stream(path, std::ios::binary);
  stream << text;
  stream.close();
  if (!stream) throw std::runtime_error("cannot write the file " + path);
}

std::string joinLines(const std::vector<std::string>& lines) {
  std::string text;
  for (const std::string& line : lines) text += line + "\n";
  return text;
}

void limitFiles() {
  constexpr rlimit noCore{0, 0};
  constexpr rlimit bounded{largestFile, largestFile};
  setrlimit(RLIMIT_CORE, &noCore);
  setrlimit(RLIMIT_FSIZE, &bounded);
}

/// The life of one case: what stands around the session, the runs, what is left behind.
class CaseSession {
 public:
  CaseSession(const Case& script, const Surroundings& surroundings)
      : script_(script),
        surroundings_(surroundings),
        report_(surroundings.report),
        trace_(report_, surroundings.output, surroundings.directory) {}

  void prepare();
  void perform();
  ReportWriter& report() { return report_; }

 private:
  std::string expand(const std::string& text) const { return expandDirectory(text, surroundings_.directory); }
  void makeFixture(const Fixture& fixture) const;
  void carryOut(CmdParser& session, const Run& run);
  static void carryOut(const Invocation& invocation);
  void reportState(const CmdParser& session);
  void reportEnvironment();

  const Case& script_;
  const Surroundings& surroundings_;
  ReportWriter report_;
  Trace trace_;
};

void CaseSession::prepare() {
  limitFiles();
  std::filesystem::current_path(surroundings_.directory);
  unsetenv(callbackVariable);
  for (const auto& [name, value] : script_.environment) setenv(name.c_str(), expand(value).c_str(), 1);
  for (const Fixture& fixture : script_.fixtures) makeFixture(fixture);
  for (const std::string& word : script_.acceptedWords) TesselCmdargs::accept(word.c_str());
  if (dup2(surroundings_.output, STDOUT_FILENO) < 0) throw std::runtime_error("cannot redirect standard output");
  // What is printed must be in the file at once, also when the process aborts.
  std::setvbuf(stdout, nullptr, _IONBF, 0);
}

void CaseSession::makeFixture(const Fixture& fixture) const {
  const std::filesystem::path path = expand(fixture.path);
  std::filesystem::create_directories(fixture.directory ? path : std::filesystem::absolute(path).parent_path());
  if (!fixture.directory) writeFile(path, expand(fixture.text));
}

void CaseSession::perform() {
  const QuietConsole quiet;
  const MessageTap tap(trace_);
  Stage stage(script_, trace_);
  {
    CmdParser session;
    if (!script_.batchLog) session.setMsgWrite(false);
    for (const Run& run : script_.runs) carryOut(session, run);
    for (const Invocation& invocation : script_.invocations) carryOut(invocation);
    reportState(session);
    trace_.add(Event::Kind::teardown);
  }
  trace_.addOutput();
  reportEnvironment();
}

void CaseSession::carryOut(CmdParser& session, const Run& run) {
  writeFile(surroundings_.inputFile, joinLines(run.input));
  if (std::freopen(surroundings_.inputFile.c_str(), "r", stdin) == nullptr)
    throw std::runtime_error("cannot redirect standard input");
  bool result = false;
  if (run.kind == Run::Kind::console) {
    result = session.runCommandLine();
  } else if (run.kind == Run::Kind::missing) {
    result = session.runCommandFile(expand(run.path).c_str());
  } else {
    writeFile(commandFile, joinLines(run.commands));
    result = session.runCommandFile(commandFile);
  }
  trace_.add(Event::Kind::result, Value(Value::Kind::boolean, result ? 1 : 0));
}

void CaseSession::carryOut(const Invocation& invocation) {
  if (invocation.function == Invocation::Function::forceUnlockCable)
    forceUnlockCable();
  else
    signalHandler(invocation.signal);
}

void CaseSession::reportState(const CmdParser& session) {
  trace_.addOutput();
  for (std::size_t i = 0; i < script_.checks.size(); ++i) {
    const Check& check = script_.checks[i];
    if (check.kind == Check::Kind::flag) report_.fact(i, renderCheck(check, readFlag(session, check.name)));
    if (check.kind != Check::Kind::transcript) continue;
    const std::string text(session.commandText.view());
    report_.fact(i, renderCheck(check, Value(Value::Kind::text, foldDirectory(text, surroundings_.directory))));
  }
}

void CaseSession::reportEnvironment() {
  for (std::size_t i = 0; i < script_.checks.size(); ++i) {
    const Check& check = script_.checks[i];
    if (check.kind != Check::Kind::environment) continue;
    const char* const value = std::getenv(check.name.c_str());
    const Value actual = value == nullptr ? Value(Value::Kind::null) : Value(Value::Kind::text, std::string(value));
    report_.fact(i, renderCheck(check, foldDirectory(actual, surroundings_.directory)));
  }
}

}  // namespace

int performCase(const Case& script, const Surroundings& surroundings) {
  CaseSession session(script, surroundings);
  try {
    session.prepare();
    session.perform();
  } catch (const std::exception& exception) {
    session.report().failure(std::string("an exception ended the case: ") + exception.what());
    return EXIT_FAILURE;
  }
  session.report().finished();
  return EXIT_SUCCESS;
}

}  // namespace conformance
