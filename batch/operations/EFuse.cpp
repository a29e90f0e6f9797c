#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Switches.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"

namespace {

/// Gives the key to the devices, up to the first position that is not on the chain. The key is a secret: it
/// goes into no message.
bool passKey(DeviceManagerInterface& manager, const UT_CMDSWINFO* positions, const char* key) {
  if (positions == nullptr) return Messages::failure("Position is required.\n");
  const int chainCount = manager.getDeviceChainCount();
  for (int i = 0; i < positions->getnumargs(); ++i) {
    const int position = positions->getargnum(i);
    if (position >= chainCount)
      return Messages::failure("Position specified is greater than the total number of devices.\n");
    manager.setDeviceAttribute(position, DeviceNS::KEY, key, true);
  }
  return true;
}

}  // namespace

bool CmdParser::programEFuse(UT_CMDARGS& args, CommandSet& words) {
  const UT_CMDSWINFO* key = args.getsw("-key", 0);
  if (key != nullptr && !passKey(*deviceManager, findSwitch(args, "-p", "-position"), key->getargtxt(0))) return false;
  return deviceManager->performOperation(words.getNumberCommands(), words.getCommands());
}
