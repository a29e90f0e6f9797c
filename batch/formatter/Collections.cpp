#include <cstring>

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Selection.h"
#include "batch/formatter/ContentRules.h"
#include "batch/formatter/OutputFile.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "interfaces/portability/UT_STR.h"

using Messages::failure;

namespace {

bool isReserved(const char* name) {
  for (const char* reserved : {"aux", "prn", "con"})
    if (UT_STR::ICompare(name, reserved) == 0) return true;
  return false;
}

}  // namespace

bool CmdParser::addCollection(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const tESSELNS::MODE_TYPE mode = deviceManager->getActiveMode();
  deviceManager->getSubmode();  // device managers may count on being asked; the answer plays no part
  const UT_CMDSWINFO* given = args.getsw("-name", 0);
  if (given == nullptr) return failure("Name of the collection is required.\n");
  const char* name = given->getargtxt(0);
  if (mode == tESSELNS::SYSTEM_OBA_CF) {
    if (UT_STR::Len(name) > longestCfName) return failure("Collection name length exceeds 8 characters.\n");
    if (std::strchr(name, ' ') != nullptr) return failure("Space is not allowed in ObaCF collection.\n");
    return deviceManager->addCollection(name);
  }
  if (isReserved(name)) return failure("Can't use system reserved name %s\n", name);
  if (mode == tESSELNS::SYSTEM_OBA_MPM) return renameOutputFile(*this, renameMpmFileLine, name);
  if (mode == tESSELNS::PROM_FILE_FORMATTER) return renameOutputFile(*this, renamePromFileLine, name);
  return deviceManager->addCollection(name);
}

bool CmdParser::deleteCollection(UT_CMDARGS& args) {
  if (!isContentMode(*this)) return failure("setMode to -cf, -mpm, -pff is required before this operation.\n");
  const UT_CMDSWINFO* name = args.getsw("-name", 0);
  if (name == nullptr) return failure("Collection name is required.\n");
  return deviceManager->removeCollection(name->getargtxt(0)) || failure("Invalid collection name.\n");
}

bool CmdParser::renameCollection(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const UT_CMDSWINFO* names = args.getsw("-name", 0);
  if (names == nullptr) return failure("-name is required.\n");
  if (!isActiveMode(tESSELNS::SYSTEM_OBA_CF))
    return failure("renameCollection is only valid in SystemOBA CF mode.\nPlease type setmode -cf first.\n");
  return deviceManager->renameCollection(names->getargtxt(0), names->getargtxt(1));
}

bool CmdParser::setCurrentCollection(UT_CMDARGS& args) {
  const UT_CMDSWINFO* collection = args.getsw("-collection", 0);
  if (collection == nullptr) return failure("Collection is required.\n");
  return deviceManager->setCurrentCollection(collection->getargtxt(0));
}
