#include "batch/Selection.h"

#include "batch/Messages.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"

using Messages::failure;

bool selectCollection(CmdParser& session, const UT_CMDSWINFO* collection) {
  const char* name = collection == nullptr ? nullptr : collection->getargtxt(0);
  if (name == nullptr) return true;
  return session.deviceManager->setCurrentCollection(name) || failure("Collection %s does not exist.\n", name);
}

bool selectDesign(CmdParser& session, int version) {
  return session.deviceManager->setCurrentDesign(version) || failure("Design %d does not exist.\n", version);
}

bool isContentMode(tESSELNS::MODE_TYPE mode) {
  return mode == tESSELNS::SYSTEM_OBA_CF || mode == tESSELNS::SYSTEM_OBA_MPM || mode == tESSELNS::PROM_FILE_FORMATTER;
}

bool isContentMode(const CmdParser& session) { return isContentMode(session.deviceManager->getActiveMode()); }
