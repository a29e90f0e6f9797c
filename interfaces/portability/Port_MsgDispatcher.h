#pragma once

#include <functional>
#include <string>

#include "interfaces/Export.h"
#include "interfaces/portability/MsgType.h"

class Port_MsgManDefault;

/// Passes every message of the process on to the message managers on its list. The list counts: a manager
/// added twice is there until it is removed twice, and gets each message once. With an empty list the
/// built-in default manager shows the messages. Managers are borrowed. All functions may be called from
/// any thread; a manager is never called after its removal has returned.
class TESSEL_EXPORT Port_MsgDispatcher {
 public:
  /// The manager in charge: the first one on the list, or the built-in one.
  static Port_MsgManDefault* getDefaultMsgMan();
  static void addMsgMan(Port_MsgManDefault* manager);
  static void removeMsgMan(Port_MsgManDefault* manager);

  /// Takes a manager off the list however often it was added; its destructor does so.
  static void forget(Port_MsgManDefault* manager);

  /// Sees every message, debug traces included, before the managers do: the bare text, as issued.
  using Observer = std::function<void(MsgType type, const std::string& text)>;
  /// Sets the observer, or removes it when given an empty one.
  static void setObserver(Observer observer);

  /// Sends a message: `text` to the observer, then `tag + " - " + text` (errors and warnings) or `text`.
  static void dispatch(MsgType type, const char* productTag, const std::string& text);
  static bool hasObserver();
};
