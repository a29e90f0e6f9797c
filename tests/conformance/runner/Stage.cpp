#include "tests/conformance/runner/Stage.h"

#include "interfaces/portability/ACDEntryNotFoundException.h"
#include "interfaces/portability/ConsoleControl.h"
#include "interfaces/portability/InvalidArgumentException.h"
#include "interfaces/utility/Callback.h"
#include "tests/conformance/runner/Operations.h"
#include "tests/conformance/runner/ScriptedManager.h"

namespace conformance {
namespace {

Stage* theStage = nullptr;

Value fallbackOf(std::string_view name, std::size_t arguments) {
  const Operation* const operation = findOperation(name, static_cast<int>(arguments));
  return operation->answer == Answer::none ? Value() : LineCursor(operation->fallback, {"fallback", 0}).value();
}

Value expand(Value value, const std::string& directory) {
  value.text = expandDirectory(std::move(value.text), directory);
  for (Value& item : value.items) item = expand(std::move(item), directory);
  return value;
}

/// The exceptions carry the name that was looked for: the last text among the arguments, if there is one.
[[noreturn]] void raise(const std::string& exception, std::string_view call, const std::vector<Value>& arguments) {
  std::string what(call);
  for (const Value& argument : arguments)
    if (argument.kind == Value::Kind::text) what = argument.text;
  if (exception == "ACDEntryNotFoundException") throw ACDEntryNotFoundException(what);
  throw InvalidArgumentException(what);
}

}  // namespace

Stage::Stage(const Case& script, Trace& trace) : trace_(trace), script_(script.givens, script.durings) {
  theStage = this;
}

Stage::~Stage() { theStage = nullptr; }

Stage& Stage::current() { return *theStage; }

Value Stage::call(std::string_view name, std::vector<Value> arguments) {
  const Value fallback = fallbackOf(name, arguments.size());
  return call(name, std::move(arguments), fallback);
}

Value Stage::call(std::string_view name, std::vector<Value> arguments, const Value& fallback) {
  for (Value& argument : arguments) argument = foldDirectory(std::move(argument), trace_.directory());
  const Script::Turn turn = script_.next(name, arguments);
  const Value& answer = turn.answer != nullptr ? *turn.answer : fallback;
  if (isTraced(name)) {
    Event event;
    event.name = name;
    event.arguments = arguments;
    event.value = answer;
    trace_.add(std::move(event));
  }
  for (const During* during : turn.happenings) happen(*during);
  if (answer.kind == Value::Kind::exception) raise(answer.text, name, arguments);
  return expand(answer, trace_.directory());
}

void Stage::happen(const During& during) {
  if (during.kind == During::Kind::consoleEvent) {
    const bool handled = Port::deliverConsoleEvent(during.consoleEvent);
    trace_.add(Event::Kind::handled, Value(Value::Kind::boolean, handled ? 1 : 0));
    return;
  }
  if (progressFunction_ == nullptr) return;
  Callback event(during.progress[0], during.progress[1], during.progress[2]);
  progressFunction_(event);
}

DeviceManagerInterface* Stage::deviceManager() {
  if (deviceManager_ == nullptr) deviceManager_ = std::make_unique<ScriptedManager>(*this);
  return deviceManager_.get();
}

void Stage::removeDeviceManager() { deviceManager_.reset(); }

}  // namespace conformance
