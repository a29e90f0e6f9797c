#include "batch/chain/ExtraFiles.h"

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Switches.h"
#include "interfaces/portability/UT_PATH.h"
#include "interfaces/portability/UT_STR.h"

using Messages::failure;

DeviceManagerInterface::CoreFiles gatherCoreFiles(const UT_CMDARGS& args) {
  DeviceManagerInterface::CoreFiles files;
  for (int i = 0; const UT_CMDSWINFO* core = args.getsw("-core", i); ++i) {
    if (core->getnumargs() == 0) continue;
    const char* file = core->getargtxt(1);
    const char* extension = UT_PATH::GetExt(file);
    if (extension == nullptr) break;
    if (!UT_STR::IMatch(extension, "bit") && !UT_STR::IMatch(extension, "rbt")) {
      Messages::error("Only .bit and .rbt files can be assigned to cores.\n");
      break;
    }
    files[core->getargnum(0)] = StringBase(file);
  }
  return files;
}

std::vector<StringBase> gatherSoftwareFiles(const UT_CMDARGS& args) {
  std::vector<StringBase> files;
  for (int i = 0; i < args.getnumsw(); ++i) {
    const UT_CMDSWINFO& each = *args.getsw(i);
    // These two names and the extensions count as typed, letter case included.
    if (UT_STR::Compare(each.getswname(), "-elf") != 0 && UT_STR::Compare(each.getswname(), "-file") != 0) continue;
    const char* first = each.getargtxt(0);
    if (UT_STR::FindString(first, ".elf") == nullptr && UT_STR::FindString(first, ".mem") == nullptr) continue;
    StringBase entry;
    for (int j = 0; j < each.getnumargs(); ++j) {
      entry += ' ';
      entry += each.getargtxt(j);
    }
    files.push_back(entry);
  }
  return files;
}

bool CmdParser::addAdditionalConfigFile(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const UT_CMDSWINFO* position = findSwitch(args, "-position", "-p");
  if (position == nullptr) return failure("Position is required.\n");
  // What was gathered before a bad core file is added all the same.
  if (args.findsw("-core")) return deviceManager->addCoreFiles(position->getargnum(0), gatherCoreFiles(args));
  if (findSwitch(args, "-elf", "-file") != nullptr)
    return deviceManager->addExtraFiles(position->getargnum(0), gatherSoftwareFiles(args));
  return failure("-elf or -core  is required for addAdditionalConfigFiles.\n");
}

bool CmdParser::clearAdditionalConfigFiles(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const UT_CMDSWINFO* given = findSwitch(args, "-position", "-p");
  if (given == nullptr) return failure("Position is required.\n");
  const int position = given->getargnum(0);
  if (position < 0) return failure("Position starts at 1.\n");
  const UT_CMDSWINFO* cores = args.getsw("-core", 0);
  if (cores == nullptr) return deviceManager->clearAdditionalConfigFiles(position);
  bool result = true;
  // Deliberate: one call more than there are numbers; the last one gets the number past the end.
  for (int i = 0; i <= cores->getnumargs(); ++i)
    result = deviceManager->clearCoreFiles(position, cores->getargnum(i)) && result;
  return result;
}
