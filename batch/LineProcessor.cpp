#include "batch/CmdParser.h"
#include "batch/Interrupts.h"
#include "batch/Messages.h"
#include "batch/Record.h"
#include "interfaces/portability/UT_PATH.h"
#include "interfaces/portability/UT_STR.h"
#include "interfaces/utility/TesselCmdargs.h"

namespace {

bool isWord(const CommandSet& line, const char* word) { return UT_STR::ICompare(line.getCommand(0), word) == 0; }

bool startRepeat(CmdParser& session, CommandSet& line) {
  std::unique_ptr<UT_CMDARGS> parsed;
  if (!session.parseCommand(parsed, line)) return false;
  if (session.inRepeat) return Messages::failure("Can't have nested repeatStart commands\n");
  session.inRepeat = true;
  // The count is the third word of the line, whatever the second one is.
  session.repeatCount = UT_STR::AToL(line.getCommand(2));
  if (session.repeatCount == 0) {
    session.repeatCount = 1;
    Messages::warning("Loop count should be >= 1, repeat loop will be executed only once.\n");
  }
  record(session, "repeatStart -loop %d", session.repeatCount);
  return true;
}

bool endRepeat(CmdParser& session, CommandSet& line) {
  std::unique_ptr<UT_CMDARGS> parsed;
  if (!session.parseCommand(parsed, line)) return false;
  if (!session.inRepeat) {
    Messages::warning("Missing repeatStart command\n");
    return true;
  }
  session.inRepeat = false;
  const bool result = session.runRepeatLoop();
  record(session, "repeatEnd");
  return result;
}

bool quit(CmdParser& session) {
  session.quitRequested = true;
  if (session.inRepeat) Messages::warning("Missing repeatEnd command.\n");
  const bool result = session.runRepeatLoop();
  record(session, "quit");
  return result;
}

}  // namespace

bool CmdParser::processLine(CommandSet& line) {
  if (interruptRequested != 0) {
    quitRequested = true;
    return false;
  }
  if (*line.getCommand(0) == '\0' && line.getNumberCommands() == 1) return true;
  if (isWord(line, "repeatStart")) return startRepeat(*this, line);
  if (isWord(line, "repeatEnd")) return endRepeat(*this, line);
  if (isWord(line, "quit") || isWord(line, "exit")) return quit(*this);
  if (!inRepeat) return dispatch(line);
  repeatBuffer.push_back(line);
  return true;
}

bool CmdParser::runRepeatLoop() {
  bool result = true;
  // A command may add words to its line, so each run works on a copy.
  CommandSet line(0);
  for (std::int32_t iteration = 0; iteration < repeatCount && result && !repeatBuffer.empty(); ++iteration) {
    for (const CommandSet& command : repeatBuffer) {
      line = command;
      result = dispatch(line);
      if (!result) break;
    }
  }
  repeatBuffer.clear();
  inRepeat = false;
  return result;
}

bool CmdParser::parseCommand(std::unique_ptr<UT_CMDARGS>& parsed, CommandSet& line) {
  try {
    parsed = TesselCmdargs::getCmdargs(line.getNumberCommands(), line.getCommands(), true);
    return true;
  } catch (const ACDEntryNotFoundException&) {
    return Messages::failure("Invalid command, %s.\n", line.getCommand(0));
  } catch (const InvalidArgumentException&) {
    return false;  // the command table has reported
  }
}

bool CmdParser::recordAndTokenise(const char* line, CommandSet& command) {
  commandText += line;
  commandText += '\n';
  return CommandSet::string2CommandSet(line, command);
}

const char* baseName(const char* path) { return UT_PATH::GetTail(path); }
