#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Selection.h"
#include "batch/Switches.h"
#include "batch/formatter/ContentRules.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_STR.h"

using Messages::failure;

bool CmdParser::addDesign(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const tESSELNS::MODE_TYPE mode = deviceManager->getActiveMode();
  if (!isContentMode(mode)) return false;
  const UT_CMDSWINFO* version = findSwitch(args, "-version", "-v");
  if (version == nullptr) return failure("Design number is required.\n");
  const UT_CMDSWINFO* given = findSwitch(args, "-name", "-designname", "-startaddress");
  if (given == nullptr) return failure("Design name or start address is required.\n");
  const char* value = given->getargtxt(0);
  if (mode == tESSELNS::SYSTEM_OBA_CF && UT_STR::Len(value) > longestCfName)
    return failure("Design name length exceeds 8 characters.\n");
  const UT_CMDSWINFO* rs = args.getsw("-rs", 0);
  if (findSwitch(args, "-d", "-down") != nullptr) {
    // Deliberate: elsewhere the option is refused and the design is added all the same.
    if (mode == tESSELNS::PROM_FILE_FORMATTER)
      deviceManager->setAttribute(ConfigDeviceNS::DIRECTION, "DOWN");
    else
      Messages::error("This option is valid in Prom File Formatter mode only.\n");
  }
  // Deliberate: a collection that does not exist fails without a message here.
  const UT_CMDSWINFO* collection = findSwitch(args, "-c", "-collection");
  if (collection != nullptr && !deviceManager->setCurrentCollection(collection->getargtxt(0))) return false;
  return deviceManager->addDesign(version->getargnum(0), value, args.findsw("-data"),
                                  rs == nullptr ? nullptr : rs->getargtxt(0), designKind);
}

bool CmdParser::deleteDesign(UT_CMDARGS& args) {
  if (!isContentMode(*this))
    return failure("A setMode to -cf, -mpm or -pff as appropriate is required before this operation.\n");
  const UT_CMDSWINFO* version = args.getsw("-version", 0);
  if (version == nullptr) return failure("Version number is required.\n");
  if (!selectCollection(*this, findSwitch(args, "-c", "-collection"))) return false;
  return deviceManager->removeDesign(version->getargnum(0));
}

bool CmdParser::setCurrentDesign(UT_CMDARGS& args) {
  const UT_CMDSWINFO* version = args.getsw("-version", 0);
  if (version == nullptr) return failure("Version is required.\n");
  return deviceManager->setCurrentDesign(version->getargnum(0));
}
