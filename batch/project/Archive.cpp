#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "interfaces/portability/UT_STR.h"
#include "interfaces/utility/FileUtility.h"

using Messages::failure;

namespace {

struct ArchivePlace {
  StringBase file;  ///< without a path
  StringBase directory;
};

/// Where the archive is. False after a message.
bool findArchive(const UT_CMDARGS& args, ArchivePlace& place) {
  const UT_CMDSWINFO* given = args.getsw("-file", 0);
  if (given == nullptr) return failure("Archive file name is required.\n");
  const StringBase file = given->getargtxt(0);
  place.file = FileUtility::getTail(file);
  const UT_CMDSWINFO* directory = args.getsw("-dir", 0);
  if (directory == nullptr) {
    place.directory = FileUtility::getHead(FileUtility::convertPath(file, StringBase()));
    return true;
  }
  place.directory = StringBase(directory->getargtxt(0));
  return UT_STR::ICompare(place.file.c_str(), file.c_str()) == 0 ||
         failure("Both -file and -dir switches are used.\nPlease exclude path name for switch -file.\n");
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
         failure("Error opening archive file , %s\n", args.getsw("-file", 0)->getargtxt(0));
}
