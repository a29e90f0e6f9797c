#include <algorithm>
#include <atomic>
#include <mutex>
#include <vector>

#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/Port_MsgManData.h"
#include "interfaces/portability/Port_MsgManDefault.h"
#include "interfaces/portability/UT_STR.h"

namespace {

/// The dispatcher's state. It is never destroyed: messages may come until the process has ended.
struct State {
  /// Recursive, for a manager may itself issue messages or go off the list while it writes.
  std::recursive_mutex mutex;
  std::vector<Port_MsgManDefault*> managers;
  Port_MsgManDefault* builtIn = nullptr;
  Port_MsgDispatcher::Observer observer;
  std::atomic<bool> hasObserver = false;

  Port_MsgManDefault* inCharge() {
    if (!managers.empty()) return managers.front();
    if (builtIn == nullptr) builtIn = &makeBuiltIn();
    return builtIn;
  }

 private:
  static Port_MsgManDefault& makeBuiltIn() {
    static auto* const manager = new Port_MsgManDefault("console");  // NOLINT(cppcoreguidelines-owning-memory)
    return *manager;
  }
};

State& state() {
  static auto* const instance = new State;  // NOLINT(cppcoreguidelines-owning-memory)
  return *instance;
}

}  // namespace

Port_MsgManDefault* Port_MsgDispatcher::getDefaultMsgMan() {
  const std::lock_guard lock(state().mutex);
  return state().inCharge();
}

void Port_MsgDispatcher::addMsgMan(Port_MsgManDefault* manager) {
  const std::lock_guard lock(state().mutex);
  // The built-in manager stands in for an empty list; to give it back is to leave the list empty.
  if (manager != nullptr && manager != state().builtIn) state().managers.push_back(manager);
}

void Port_MsgDispatcher::removeMsgMan(Port_MsgManDefault* manager) {
  const std::lock_guard lock(state().mutex);
  auto& managers = state().managers;
  const auto place = std::find(managers.begin(), managers.end(), manager);
  if (place != managers.end()) managers.erase(place);
}

void Port_MsgDispatcher::forget(Port_MsgManDefault* manager) {
  const std::lock_guard lock(state().mutex);
  std::erase(state().managers, manager);
}

void Port_MsgDispatcher::setObserver(Observer observer) {
  const std::lock_guard lock(state().mutex);
  state().hasObserver = static_cast<bool>(observer);
  state().observer = std::move(observer);
}

bool Port_MsgDispatcher::hasObserver() { return state().hasObserver; }

void Port_MsgDispatcher::dispatch(MsgType type, const char* productTag, const std::string& text) {
  const std::lock_guard lock(state().mutex);
  if (state().observer) state().observer(type, text);
  if (type == MsgType::debug) return;
  const bool tagged = type == MsgType::error || type == MsgType::warning;
  std::string shown = tagged ? std::string(productTag) + " - " + text : text;
  // A zero byte out of a file must not cut the message.
  std::replace(shown.begin(), shown.end(), '\0', '?');
  const std::wstring wide = UT_STR::MbstrToWstr(shown.c_str());
  std::vector<Port_MsgManDefault*> receivers = state().managers;
  if (receivers.empty()) receivers.push_back(state().inCharge());
  const auto stillThere = [](Port_MsgManDefault* manager) {
    const auto& managers = state().managers;
    return manager == state().builtIn || std::find(managers.begin(), managers.end(), manager) != managers.end();
  };
  for (auto manager = receivers.begin(); manager != receivers.end(); ++manager) {
    // Each once, and none that another one has taken off the list meanwhile.
    const bool first = std::find(receivers.begin(), manager, *manager) == manager;
    if (first && stillThere(*manager)) (*manager)->msgWrite(type, wide.c_str());
  }
}

Port_MsgManData Port_MsgManData::createObject(const char* productTag, const char* sourceFile, int line,
                                              const char* revision) {
  return Port_MsgManData(productTag, sourceFile, line, revision);
}

void Port_MsgManData::issue(MsgType type, const std::string& text) const {
  Port_MsgDispatcher::dispatch(type, productTag_, text);
}

bool Port_MsgManData::debugWanted() { return Port_MsgDispatcher::hasObserver(); }

void Port_MsgManData::issueDebug(const std::string& text) { Port_MsgDispatcher::dispatch(MsgType::debug, "", text); }
