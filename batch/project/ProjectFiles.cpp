#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"

using Messages::failure;

bool CmdParser::saveProjectFile(UT_CMDARGS& args) {
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return failure("Project file name is required.\n");
  return deviceManager->writeProjectRepository(StringBase(file->getargtxt(0)));
}

bool CmdParser::loadProjectFile(UT_CMDARGS& args) {
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return failure("Project file name is required.\n");
  // Deliberate: set whether the load succeeds or not.
  modeSet = subModeSet = cableSet = true;
  return deviceManager->readProjectRepository(StringBase(file->getargtxt(0)));
}

bool CmdParser::saveCdf(UT_CMDARGS& args) {
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return failure("CDF file name is required.\n");
  return deviceManager->saveCdf(file->getargtxt(0), StringBase(), false);
}
