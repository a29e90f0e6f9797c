#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Selection.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"

using Messages::failure;

bool CmdParser::checkModeSet() const { return modeSet || failure("setMode is required before this operation.\n"); }

bool CmdParser::checkSubModeSet() const {
  return subModeSet || failure("setSubMode is required before this operation.\n");
}

bool CmdParser::checkCableSet() const {
  if (infoRunning) return true;
  if (!modeSet)
    Messages::error("setMode is required before this operation.\n");
  else if (!cableSet)
    Messages::error("setCable must be set before this operation.\n");
  // Deliberate: a session that has a cable passes, even when the missing mode was just reported.
  return cableSet;
}

bool CmdParser::checkIdentify() const {
  return lastIdentifyOk || failure("Use defineDevice to describe unknown devices on the boundary-scan chain\n");
}

bool CmdParser::isActiveMode(tESSELNS::MODE_TYPE mode) const { return deviceManager->getActiveMode() == mode; }

bool CmdParser::checkFormatterMode() const {
  return isContentMode(*this) || failure("Mode has to be either CF, MPM or PFF\n");
}

bool CmdParser::checkChainContents(tESSELNS::MODE_TYPE mode) const {
  if (mode == tESSELNS::SYSTEM_OBA_CF && deviceManager->getNumberCollections() == 0)
    return failure("At least one collection has to be added.\n");
  if (deviceManager->getNumberDesigns() == 0)
    return failure("At least one design and a device chain are required to add a device.\n");
  if (deviceManager->getNumberDeviceChains() == 0)
    return failure("At least one device chain is required to add  a device.\n");
  return true;
}
