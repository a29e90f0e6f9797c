#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Record.h"
#include "batch/log/TesselBatchMsgMan.h"
#include "interfaces/portability/File.h"
#include "interfaces/portability/UT_CMDARGS.h"

using Messages::failure;

namespace {

/// Opens a file for writing, which empties it; null after a message.
std::unique_ptr<Port::Stream> openForWriting(const char* path) {
  auto stream = Port::File::open(path, Port::File::write, true);
  if (stream == nullptr) Messages::error("Open file error, file %s may not exist\n", path);
  return stream;
}

}  // namespace

bool CmdParser::saveCmd(UT_CMDARGS& args) {
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return failure("File name is required\n");
  auto stream = openForWriting(file->getargtxt(0));
  if (stream == nullptr) return false;
  recordStream = std::move(stream);
  record(*this, "saveCmd -file %s", file->getargtxt(0));
  recordOn = true;
  return true;
}

bool CmdParser::setLog(UT_CMDARGS& args) {
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) {
    // Deliberate: the command succeeds after this error.
    Messages::error("File name is required\n");
    return true;
  }
  if (openForWriting(file->getargtxt(0)) == nullptr) return false;
  if (useBatchLog) {
    TesselBatchMsgMan::removeBatchLog();
    TesselBatchMsgMan::installBatchLog(file->getargtxt(0));
  }
  record(*this, "setLog -file %s", file->getargtxt(0));
  return true;
}

bool CmdParser::renameBatchCmdFile(UT_CMDARGS& args) {
  const UT_CMDSWINFO* file = args.getsw("-file", 0);
  if (file == nullptr) return failure("-file is required for this command.\n");
  deviceManager->setBatchCommandFile(file->getargtxt(0));
  return true;
}
