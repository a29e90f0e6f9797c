#pragma once

#include "interfaces/Export.h"
#include "interfaces/devicemanager/tESSELNS.h"

/// What goes with what: modes by their keywords.
class TESSEL_EXPORT ConstraintsManager {
 public:
  /// The mode that a keyword of `setMode` names, in any letter case; `NO_MODE` for any other text.
  static tESSELNS::MODE_TYPE modeString2Type(const char* keyword);
};
