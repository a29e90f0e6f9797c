#include "batch/chain/Position.h"

#include "batch/Messages.h"
#include "batch/Switches.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"

using Messages::failure;

bool positionToAdd(const CmdParser& session, const UT_CMDARGS& args, int& position) {
  position = -1;
  const UT_CMDSWINFO* given = findSwitch(args, "-position", "-p");
  if (given == nullptr) return failure("Position is required.\n");
  position = given->getargnum(0);
  if (position < 0) return failure("Position starts at 1.\n");
  const int count = session.deviceManager->getDeviceChainCount();
  if (position <= count) return true;
  if (count == 0) return failure("Since there is no device in the chain,\nyou can only add devices at position 1.\n");
  return failure(
      "Since there are only %d devices in the chain,\nyou can only add devices between positions 1 and %d.\n", count,
      count + 1);
}

bool removeEach(const UT_CMDSWINFO& positions, int chainCount, const char* missingText,
                const std::function<bool(int position)>& remove) {
  bool result = false;
  for (int i = 0; i < positions.getnumargs(); ++i) {
    const int position = positions.getargnum(i);
    if (position >= chainCount) {
      Messages::error(missingText, position + 1);
      return result;
    }
    result = remove(position);
    if (!result) return false;
  }
  return result;
}
