#include "batch/chain/FileAssignment.h"

#include "batch/Files.h"
#include "batch/Messages.h"
#include "batch/Switches.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"

using Messages::failure;

bool findAssignment(const CmdParser& session, const UT_CMDARGS& args, const AssignmentTexts& texts,
                    Assignment& assignment) {
  const int count = session.deviceManager->getDeviceChainCount();
  if (count == 0) return failure("No devices on chain, can't assign file \n");
  const UT_CMDSWINFO* position = findSwitch(args, "-p", "-position");
  if (position == nullptr) return failure("Position is required\n");
  assignment.position = position->getargnum(0);
  if (assignment.position >= count) return count == 1 ? failure(texts.onlyOne) : failure(texts.upTo, count);
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return failure(texts.fileRequired);
  assignment.path = file->getargtxt(0);
  return probeFile(assignment.path);
}

bool CmdParser::assignFile(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  Assignment assignment;
  if (!findAssignment(
          *this, args,
          {"Can only assign file to device 1.\n", "Can only assign files to devices between positions 1 to %d\n",
           "A configuration data or BSDL file is required\n"},
          assignment))
    return false;
  const bool result = deviceManager->assignFile(assignment.position, assignment.path);
  if (result) lastIdentifyOk = true;
  return result;
}
