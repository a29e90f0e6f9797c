#pragma once

#include "batch/CmdParser.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/FormatArgument.h"

/// Writes a line of the system's own into the batch-command file.
template <class... Arguments>
void record(CmdParser& session, const char* format, const Arguments&... arguments) {
  if (session.deviceManager != nullptr)
    session.deviceManager->writeBatchCommand(StringBase(Port::format(format, arguments...)));
}
