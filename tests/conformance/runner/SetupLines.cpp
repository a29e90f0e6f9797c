#include "tests/conformance/runner/SetupLines.h"

#include <csignal>
#include <filesystem>
#include <limits>

#include "tests/conformance/runner/Operations.h"

namespace conformance {
namespace {

struct Signal {
  const char* name;
  int number;
};
constexpr Signal signals[] = {{"SIGINT", SIGINT}, {"SIGSEGV", SIGSEGV}, {"SIGTERM", SIGTERM}, {"SIGABRT", SIGABRT}};

template <class Number>
Number bounded(LineCursor& cursor) {
  const std::int64_t number = cursor.number();
  if (number < std::numeric_limits<Number>::min() || number > std::numeric_limits<Number>::max())
    cursor.fail("the number " + std::to_string(number) + " is out of range");
  return static_cast<Number>(number);
}

/// Reads `NAME`, `NAME(ARGUMENTS)`, either with `@N`.
CallPattern parseCallPattern(LineCursor& cursor) {
  CallPattern call;
  call.name = cursor.name("the name of a call");
  if (!isOperation(call.name)) cursor.fail("unknown call '" + call.name + "'");
  if (cursor.take("(")) {
    call.arguments = cursor.valuesUpTo(")");
    if (findOperation(call.name, static_cast<int>(call.arguments->size())) == nullptr)
      cursor.fail("wrong number of arguments for '" + call.name + "'");
  }
  if (cursor.take("@")) {
    call.occurrence = bounded<int>(cursor);
    if (call.occurrence < 1) cursor.fail("calls are counted from 1");
  }
  return call;
}

int parseSignal(LineCursor& cursor) {
  if (cursor.peek() == '-' || (cursor.peek() >= '0' && cursor.peek() <= '9')) return bounded<int>(cursor);
  const std::string name = cursor.name("a signal");
  for (const Signal& signal : signals)
    if (name == signal.name) return signal.number;
  cursor.fail("unknown signal '" + name + "'");
}

/// True when a path leads out of the directory that it is relative to.
bool leadsOut(const std::string& path) {
  const std::filesystem::path normal = std::filesystem::path(path).lexically_normal();
  return normal.is_absolute() || normal.empty() || *normal.begin() == "..";
}

}  // namespace

const SetupLines::Row SetupLines::rows[] = {
    {"env", &SetupLines::environment},   {"dir", &SetupLines::directory}, {"file", &SetupLines::file},
    {"batchlog", &SetupLines::batchLog}, {"accept", &SetupLines::accept}, {"given", &SetupLines::given},
    {"during", &SetupLines::during},     {"run", &SetupLines::run},       {"run-missing", &SetupLines::runMissing},
    {"invoke", &SetupLines::invoke},
};

void SetupLines::readLine(const std::string& word, Case& target, LineCursor& cursor) {
  for (const Row& row : rows) {
    if (word != row.word) continue;
    (this->*row.reader)(target, cursor);
    cursor.requireEnd();
    return;
  }
  cursor.fail("unknown set-up word '" + word + "'");
}

void SetupLines::addRunLine(char mark, std::string line) {
  if (mark == '>') {
    pending_.kind = Run::Kind::file;
    pending_.commands.push_back(std::move(line));
  } else {
    pending_.input.push_back(std::move(line));
  }
}

void SetupLines::finish(Case& target) {
  if (!pending_.commands.empty() || !pending_.input.empty()) target.runs.push_back(std::move(pending_));
  pending_ = Run();
}

void SetupLines::environment(Case& target, LineCursor& cursor) {
  if (!target.runs.empty()) cursor.fail("'env' must stand before the first 'run'");
  std::string name = cursor.name("the name of a variable");
  cursor.require("=");
  std::string value = cursor.rest();
  if (value.starts_with('"')) {
    LineCursor quoted(value, cursor.place());
    std::string text = quoted.text();
    quoted.requireEnd();
    value = std::move(text);
  }
  target.environment.emplace_back(std::move(name), std::move(value));
}

std::string SetupLines::fixturePath(const Case& target, LineCursor& cursor) const {
  if (!target.runs.empty()) cursor.fail("files and directories must stand before the first 'run'");
  std::string path = cursor.wordOrText("a path");
  if (leadsOut(path)) cursor.fail("'" + path + "' is no path inside the working directory");
  return path;
}

void SetupLines::directory(Case& target, LineCursor& cursor) {
  target.fixtures.push_back({fixturePath(target, cursor), true, ""});
}

void SetupLines::file(Case& target, LineCursor& cursor) {
  std::string path = fixturePath(target, cursor);
  target.fixtures.push_back({std::move(path), false, cursor.atEnd() ? "" : cursor.text()});
}

void SetupLines::batchLog(Case& target, LineCursor& cursor) {
  cursor.require("on");
  target.batchLog = true;
}

void SetupLines::accept(Case& target, LineCursor& cursor) {
  target.acceptedWords.push_back(cursor.wordOrText("a command word"));
}

void SetupLines::given(Case& target, LineCursor& cursor) {
  Given given{parseCallPattern(cursor), Value()};
  cursor.require("->");
  given.answer = cursor.value();
  if (!fits(findOperation(given.call.name, -1)->answer, given.answer))
    cursor.fail("'" + given.call.name + "' cannot answer '" + render(given.answer) + "'");
  target.givens.push_back(std::move(given));
}

void SetupLines::during(Case& target, LineCursor& cursor) {
  During during;
  during.call = parseCallPattern(cursor);
  const std::string what = cursor.wordOrText("'progress' or 'console-event'");
  if (what == "progress") {
    for (std::int32_t& number : during.progress) number = bounded<std::int32_t>(cursor);
  } else if (what == "console-event") {
    during.kind = During::Kind::consoleEvent;
    during.consoleEvent = bounded<std::uint32_t>(cursor);
  } else {
    cursor.fail("expected 'progress' or 'console-event' instead of '" + what + "'");
  }
  target.durings.push_back(std::move(during));
}

void SetupLines::run(Case& target, LineCursor&) { finish(target); }

void SetupLines::runMissing(Case& target, LineCursor& cursor) {
  finish(target);
  Run run;
  run.kind = Run::Kind::missing;
  run.path = cursor.wordOrText("a path");
  target.runs.push_back(std::move(run));
}

void SetupLines::invoke(Case& target, LineCursor& cursor) {
  const std::string function = cursor.name("a function");
  if (function == "forceUnlockCable")
    target.invocations.push_back({Invocation::Function::forceUnlockCable, 0});
  else if (function == "signalHandler")
    target.invocations.push_back({Invocation::Function::signalHandler, parseSignal(cursor)});
  else
    cursor.fail("unknown function '" + function + "'");
}

}  // namespace conformance
