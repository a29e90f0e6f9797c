#pragma once

#include "interfaces/Export.h"

/// The environment of the process. Not for use while another thread reads or changes it.
class TESSEL_EXPORT Port_Env {
 public:
  /// The variable's value, null when it does not exist. Valid until the variable is changed.
  static const char* GetEnv(const char* name);
  /// Sets a variable from a text of the form NAME=VALUE. 0 on success, else the system's error number.
  static int PutEnv(const char* text);
  static int UnsetEnv(const char* name);
};
