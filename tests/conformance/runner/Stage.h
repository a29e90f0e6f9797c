#pragma once

#include <memory>
#include <string_view>
#include <vector>

#include "tests/conformance/runner/Case.h"
#include "tests/conformance/runner/Script.h"
#include "tests/conformance/runner/Trace.h"

class Callback;
class DeviceManagerInterface;

namespace conformance {

/// Where the calls of the interpreter end: it answers them as the case says and writes them into the trace.
/// One exists at a time; the static functions that stand in for other libraries find it by `current`.
class Stage {
 public:
  /// Both are borrowed.
  Stage(const Case& script, Trace& trace);
  ~Stage();
  Stage(const Stage&) = delete;
  Stage& operator=(const Stage&) = delete;

  static Stage& current();

  /// Carries out a call and gives its answer, texts with the real working directory in them; without a
  /// `given` line the operation's own fallback. Throws what a `given` line throws.
  Value call(std::string_view name, std::vector<Value> arguments);
  Value call(std::string_view name, std::vector<Value> arguments, const Value& fallback);

  using ProgressFunction = bool (*)(Callback&);
  void setProgressFunction(ProgressFunction function) { progressFunction_ = function; }

  /// The device manager of the process, made when there is none.
  DeviceManagerInterface* deviceManager();
  void removeDeviceManager();

 private:
  void happen(const During& during);

  Trace& trace_;
  Script script_;
  ProgressFunction progressFunction_ = nullptr;
  std::unique_ptr<DeviceManagerInterface> deviceManager_;
};

}  // namespace conformance
