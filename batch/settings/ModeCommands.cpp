#include <string>

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Switches.h"
#include "interfaces/constraints/ConstraintsManager.h"
#include "interfaces/constraints/ModeKeywords.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_STR.h"

using Messages::failure;

bool CmdParser::setMode(UT_CMDARGS& args) {
  const UT_CMDSWINFO* first = args.getsw(0);
  if (first == nullptr) return failure("Mode string is required\n");
  const char* keyword = first->getswname() + 1;
  const tESSELNS::MODE_TYPE mode = ConstraintsManager::modeString2Type(keyword);
  const bool result = mode != tESSELNS::NO_MODE && deviceManager->setMode(mode, true);
  // Deliberate: an unknown or refused mode counts as set, too.
  modeSet = true;
  return mode == tESSELNS::NO_MODE ? failure("Unknown mode %d.\n", keyword) : result;
}

bool CmdParser::setsubMode(UT_CMDARGS& args) {
  const UT_CMDSWINFO* first = args.getsw(0);
  if (first == nullptr) return failure("Mode string is required.\n");
  const char* keyword = first->getswname() + 1;
  const tESSELNS::MODE_TYPE mode = deviceManager->getActiveMode();
  for (const ModeKeywords::Submode& row : ModeKeywords::submodes) {
    if (row.requiredMode != mode || UT_STR::ICompare(keyword, row.keyword) != 0) continue;
    deviceManager->setSubmode(row.submode);
    subModeSet = true;
    return true;
  }
  return failure("Set to correct mode before this operation.\n");
}

bool CmdParser::setTargetDevice(UT_CMDARGS& args) {
  const UT_CMDSWINFO* position = findSwitch(args, "-position", "-p");
  if (position == nullptr) return failure("switch -position is required.\n");
  deviceManager->setTargetDevice(deviceManager->getMode(), position->getargnum(0), args.findsw("-attached"));
  return true;
}

bool CmdParser::setPreference(UT_CMDARGS& args) {
  const UT_CMDSWINFO* preference = args.getsw("-pref", 0);
  if (preference == nullptr) return failure("switch -pref is required.\n");
  const std::string text = preference->getargtxt(0);
  const std::size_t colon = text.find(':');
  if (colon == std::string::npos) return failure("Colon is missing in setPreference.\n");
  if (text.compare(colon, 2, "::") == 0) return failure("Extra colon in setPreference.\n");
  return deviceManager->setPreference(TesselPreference::string2Pref(text.substr(0, colon).c_str()),
                                      text.c_str() + colon + 1);
}
