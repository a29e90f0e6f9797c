#pragma once

#include "batch/CmdParser.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/devicemanager/ModeInterface.h"
#include "interfaces/portability/FormatArgument.h"

/// Writes a line of the system's own into the batch-command file.
template <class... Arguments>
void record(const CmdParser& session, const char* format, const Arguments&... arguments) {
  if (session.deviceManager != nullptr)
    session.deviceManager->writeBatchCommand(StringBase(Port::format(format, arguments...)));
}

/// Suspends the device manager's own recording for its life, around a call whose line was recorded already.
class RecordingPause {
 public:
  RecordingPause() { ModeInterface::setBatchCommandOff(); }
  ~RecordingPause() { ModeInterface::setBatchCommandOn(); }
  RecordingPause(const RecordingPause&) = delete;
  RecordingPause& operator=(const RecordingPause&) = delete;
};
