#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "interfaces/portability/UT_STR.h"
#include "interfaces/utility/FileUtility.h"

using Messages::failure;

namespace {

struct ArchivePlace {
  StringBase typed;  ///< what -file says
  StringBase file;   ///< without a path
  StringBase directory;
};

/// Where the archive is. False after a message.
bool findArchive(const UT_CMDARGS& args, ArchivePlace& place) {
  const UT_CMDSWINFO* given = args.getsw("-file", 0);
  if (given == nullptr) return failure("Archive file name is required.\n");
  place.typed = StringBase(given->getargtxt(0));
  place.file = FileUtility::getTail(place.typed);
  const UT_CMDSWINFO* directory = args.getsw("-dir", 0);
  if (directory == nullptr) {
    place.directory = FileUtility::getHead(FileUtility::convertPath(place.typed, StringBase()));
    return true;
  }
  if (UT_STR::ICompare(place.file.c_str(), place.typed.c_str()) != 0)
    return failure("Both -file and -dir switches are used.\nPlease exclude path name for switch -file.\n");
  place.directory = StringBase(directory->getargtxt(0));
  return true;
}

}  // namespace

bool CmdParser::saveArchive(UT_CMDARGS& args) {
  archiveSaving = true;
  ArchivePlace place;
  // Deliberate: the flag stays set on this way out.
  if (!findArchive(args, place)) return false;
  const bool result = deviceManager->createArchive(place.file, place.directory);
  archiveSaving = false;
  return result;
}

bool CmdParser::loadArchive(UT_CMDARGS& args) {
  ArchivePlace place;
  if (!findArchive(args, place)) return false;
  return deviceManager->loadArchive(place.file, place.directory) ||
         failure("Error opening archive file , %s\n", place.typed);
}
