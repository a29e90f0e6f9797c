#pragma once

#include "interfaces/Export.h"
#include "interfaces/devicemanager/CollectionNS.h"

/// The attribute names of a collection.
class TESSEL_EXPORT Collection {
 public:
  /// The attribute of that name, in any letter case; -1 for an unknown name.
  static CollectionNS::ATTRIBUTE string2Attribute(const char* name);
};
