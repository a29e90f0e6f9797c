#include <cstdint>

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "interfaces/portability/UT_STR.h"
#include "interfaces/portability/UT_TIME.h"
#include "interfaces/utility/DeviceOptionsMgr.h"

using Messages::failure;

namespace {

/// When the current operation began, in seconds.
std::int64_t operationStartTime = 0;

/// What an operation works on.
struct Target {
  bool given = false;  ///< the stored target is meant, not positions
  tESSELNS::MODE_TYPE mode = tESSELNS::NO_MODE;
  int position = -1;
  bool attached = false;
  bool spiOnly = false;
  bool bpiOnly = false;
};

bool isWord(const CommandSet& words, const char* word) { return UT_STR::IMatch(words.getCommand(0), word); }

/// Which attached flash the operation is for. What does not fit together is reported and stops nothing.
void chooseFlash(DeviceManagerInterface& manager, int position, Target& target) {
  const bool spiPart = manager.getDeviceAttribute(position, DeviceNS::SPI_PART) != nullptr;
  const bool spiFile = manager.getDeviceAttribute(position, DeviceNS::SPI_FILE) != nullptr;
  const bool bpiPart = manager.getDeviceAttribute(position, DeviceNS::BPI_PART) != nullptr;
  const bool bpiFile = manager.getDeviceAttribute(position, DeviceNS::BPI_FILE) != nullptr;
  if (spiPart && bpiPart) {
    Messages::error(
        "'%d':Both an spi and a bpi part is attached to the device simultaneously, only one of these at a time is "
        "supported at this time.\n",
        position);
  } else if (spiPart) {
    target.spiOnly = spiFile;
    if (!spiFile)
      Messages::error("'%d':An spi part is assigned to the device but no spi file is assigned to it.\n", position);
  } else if (bpiPart) {
    target.bpiOnly = bpiFile;
    if (!bpiFile)
      Messages::error("'%d':An bpi part is assigned to the device but no bpi file is assigned to it.\n", position);
  }
}

/// False after a message.
bool checkPositions(DeviceManagerInterface& manager, const UT_CMDSWINFO* positions, Target& target) {
  const int chainCount = manager.getDeviceChainCount();
  const int count = target.given ? 1 : positions->getnumargs();
  for (int i = 0; i < count; ++i) {
    const int position = target.given ? target.position : positions->getargnum(i);
    if (target.attached) chooseFlash(manager, position, target);
    if (position >= chainCount) return failure("Position specified is greater than the total number of devices.\n");
  }
  return true;
}

/// Finds the positions or the target that the command means, and checks them. False after a message.
bool resolveTarget(CmdParser& session, const UT_CMDARGS& args, const CommandSet& words, Target& target) {
  const UT_CMDSWINFO* positions = args.getsw("-p", 0);
  // Deliberate: -position alone does not count as a position here.
  const bool positionGiven = positions != nullptr;
  target.given = args.findsw("-target");
  if (target.given) {
    session.deviceManager->getTargetDevice(target.mode, target.position, target.attached);
    if (target.mode == tESSELNS::NO_MODE || target.position == -1)
      return failure(
          "No target device information found, please set target device prior to using target argument for "
          "operations.\n");
  }
  if (positions == nullptr) positions = args.getsw("-position", 0);
  if (positions != nullptr && target.given)
    Messages::warning(
        "Both position and target argument have been specified, Target information will override position "
        "arguments.\n");
  if (!target.given && !positionGiven) {
    const bool needsNone = session.checkRunning || isWord(words, "bsdebug") || isWord(words, "play");
    return needsNone || failure("Position is required.\n");
  }
  return checkPositions(*session.deviceManager, positions, target);
}

void appendAll(CommandSet& words, const std::vector<StringBase>& options, const char* countTrace,
               const char* optionTrace) {
  Messages::debug(countTrace, options.size());
  for (std::size_t i = 0; i < options.size(); ++i) {
    Messages::debug(optionTrace, i, options[i]);
    words.addCommand(options[i].c_str());
  }
}

void appendFilled(CommandSet& words, const std::vector<StringBase>& options) {
  for (std::size_t i = 0; i < options.size(); ++i) {
    Messages::debug("Option '%d' is %s.\n", i, options[i]);
    if (!options[i].empty()) words.addCommand(options[i].c_str());
  }
}

/// The words that the target's stored options add to the command.
void appendOptions(DeviceManagerInterface& manager, const Target& target, CommandSet& words) {
  const tESSELNS::MODE_TYPE mode = manager.getActiveMode();
  const DeviceOptionsMgr& options = *manager.getDeviceOptionsMgr(mode, target.position, false);
  const bool onlyFpga = options.isOptionSet(U_OptionsMgr::onlyFpga);
  const bool takesOptions =
      mode == tESSELNS::BOUNDARY_SCAN || mode == tESSELNS::DESKTOP_CONFIGURATION || mode == tESSELNS::SPI;
  if (isWord(words, "program")) {
    if (onlyFpga)
      words.addCommand("-onlyFpga");
    else if (takesOptions && target.attached)
      appendAll(words, manager.getDeviceOptionsMgr(mode, target.position, true)->getProgramOptions(),
                "Number of spi Options is '%d'\n", "SPI Option '%d' is %s.\n");
    else if (takesOptions)
      appendAll(words, options.getProgramOptions(), "Number of Options is '%d'\n", "Option '%d' is %s.\n");
  } else if (isWord(words, "verify")) {
    appendFilled(words, options.getVerifyOptions());
  } else if (isWord(words, "erase")) {
    appendFilled(words, options.getEraseOptions());
  }
}

}  // namespace

bool CmdParser::runOperation(UT_CMDARGS& args, CommandSet& words) {
  _time64(&operationStartTime);
  // The express commands work on a file alone.
  if (!isWord(words, "*express*") && !checkCableSet()) return false;
  Target target;
  if (!resolveTarget(*this, args, words, target)) return false;
  if (target.given) {
    words.addCommand("-p");
    words.addCommand(target.position);
  }
  if (target.spiOnly) words.addCommand("-spionly");
  if (target.bpiOnly) words.addCommand("-bpionly");
  if (target.given) appendOptions(*deviceManager, target, words);
  words.printCommands(false);
  const bool result = deviceManager->performOperation(words.getNumberCommands(), words.getCommands());
  const double seconds = _difftime64(_time64(nullptr), operationStartTime);
  Messages::status("Elapsed time = %6.0f sec.\n", seconds);
  return result;
}
