#pragma once

#include "interfaces/Export.h"

/// One mode's content inside the device manager, and the switch of its batch-command recording.
class TESSEL_EXPORT ModeInterface {
 public:
  virtual ~ModeInterface();

  /// Suspends the recording of the steps that the device manager carries out; lines handed to
  /// `DeviceManagerInterface::writeBatchCommand` are written all the same.
  static void setBatchCommandOff();
  static void setBatchCommandOn();
};
