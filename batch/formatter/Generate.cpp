#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"

using Messages::failure;

bool CmdParser::generate(UT_CMDARGS& args, CommandSet& words) {
  const tESSELNS::MODE_TYPE mode = deviceManager->getActiveMode();
  const StringBase collection = deviceManager->getCurrentCollectionName();
  if ((mode == tESSELNS::SYSTEM_OBA_MPM || mode == tESSELNS::PROM_FILE_FORMATTER) && !checkSubModeSet()) return false;
  UT_CMDARGS* switches = &args;
  std::unique_ptr<UT_CMDARGS> completed;
  if (mode == tESSELNS::SYSTEM_OBA_CF && !args.findsw("-active")) {
    // Generation for CompactFlash always names the active collection.
    if (collection.empty())
      return failure("There is no current collection. Use setCurrentCollection, or -active with a name.\n");
    words.addCommand("-active");
    words.addCommand(collection.c_str());
    if (!parseCommand(completed, words)) return false;
    switches = completed.get();
  }
  // Deliberate: -path alone brings the warning, whether -output is there or not.
  if (mode == tESSELNS::PROM_FILE_FORMATTER && switches->findsw("-path"))
    Messages::warning("-ouput switch will override -path switch.\n");
  if (switches->findsw("-compressed")) {
    const bool mpm = isActiveMode(tESSELNS::SYSTEM_OBA_MPM);
    const bool version = deviceManager->getSubmode() == tESSELNS::PFF_VERSION;
    if (!mpm && !version) return failure("Option -compressed is only available in SystemOBA MPM mode./n");
  }
  return deviceManager->generate(switches);
}
