#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Selection.h"
#include "batch/Switches.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"

using Messages::failure;

bool CmdParser::addDeviceChain(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  if (!selectCollection(*this, findSwitch(args, "-c", "-collection"))) return false;
  const UT_CMDSWINFO* design = findSwitch(args, "-d", "-design");
  if (design != nullptr && !selectDesign(*this, design->getargnum(0))) return false;
  const UT_CMDSWINFO* index = findSwitch(args, "-index", "-cspin");
  if (index == nullptr) return failure("A chain index is required.\n");
  return deviceManager->addDeviceChain(index->getargnum(0));
}

bool CmdParser::deleteDeviceChain(UT_CMDARGS& args) {
  // Deliberate: one word more than in the text of deleteDesign.
  if (!isContentMode(*this))
    return failure("A setMode to either -cf, -mpm or -pff as appropriate is required before this operation.\n");
  const UT_CMDSWINFO* index = args.getsw("-index", 0);
  if (index == nullptr) return failure("Chain index is required.\n");
  const UT_CMDSWINFO* given = args.getsw("-version", 0);
  const int version = given == nullptr ? -1 : given->getargnum(0);
  if (!selectCollection(*this, args.getsw("-collection", 0))) return false;
  if (version >= 0 && !selectDesign(*this, version)) return false;
  return deviceManager->removeDeviceChain(index->getargnum(0));
}

bool CmdParser::setCurrentDeviceChain(UT_CMDARGS& args) {
  const UT_CMDSWINFO* index = args.getsw("-index", 0);
  if (index == nullptr) return failure("Index is required.\n");
  return deviceManager->setCurrentDeviceChain(index->getargnum(0));
}
