#pragma once

#include "interfaces/portability/Port_MsgManData.h"

/// Issues an error of the device manager; false, as the result of what failed.
template <class... Arguments>
bool reportError(const char* format, const Arguments&... arguments) {
  Port_MsgManData::createObject("tESSEL", "../s/DeviceManager", 0, "").issueError(format, arguments...);
  return false;
}

template <class... Arguments>
void reportWarning(const char* format, const Arguments&... arguments) {
  Port_MsgManData::createObject("tESSEL", "../s/DeviceManager", 0, "").issueWarning(format, arguments...);
}

template <class... Arguments>
void reportStatus(const char* format, const Arguments&... arguments) {
  Port_MsgManData::createObject("tESSEL", "../s/DeviceManager", 0, "").issueStatus(format, arguments...);
}
