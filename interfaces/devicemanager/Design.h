#pragma once

#include "interfaces/Export.h"
#include "interfaces/devicemanager/DesignNS.h"

/// The attribute names of a design.
class TESSEL_EXPORT Design {
 public:
  /// The attribute of that name, in any letter case; -1 for an unknown name.
  static DesignNS::ATTRIBUTE string2Attribute(const char* name);
};
