#include "batch/formatter/OutputFile.h"

#include "batch/Messages.h"
#include "batch/Record.h"
#include "interfaces/portability/UT_CMDARGS.h"

bool renameOutputFile(CmdParser& session, const char* line, const char* name) {
  record(session, line, name);
  return session.setConfigDeviceAttribute(ConfigDeviceNS::FILE_NAME, name, true);
}

namespace {

bool renameFromSwitch(CmdParser& session, const UT_CMDARGS& args, const char* missing, const char* line) {
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return Messages::failure(missing);
  return renameOutputFile(session, line, file->getargtxt(0));
}

}  // namespace

bool CmdParser::renamePromFile(UT_CMDARGS& args) {
  return renameFromSwitch(*this, args, "Prom file name is required.\n", renamePromFileLine);
}

bool CmdParser::renameMpmFile(UT_CMDARGS& args) {
  return renameFromSwitch(*this, args, "Mpm file name is required.\n", renameMpmFileLine);
}
