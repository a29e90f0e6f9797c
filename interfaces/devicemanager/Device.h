#pragma once

#include "interfaces/Export.h"
#include "interfaces/devicemanager/DeviceNS.h"

/// The attribute names of a chain device.
class TESSEL_EXPORT Device {
 public:
  /// The attribute of that name, in any letter case; -1 for an unknown name.
  static DeviceNS::ATTRIBUTE string2Attribute(const char* name);
};
