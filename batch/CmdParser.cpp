#include "batch/CmdParser.h"

#include <array>
#include <cstring>

#include "batch/Interrupts.h"
#include "batch/Messages.h"
#include "batch/log/TesselBatchMsgMan.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/Console.h"
#include "interfaces/portability/ConsoleControl.h"
#include "interfaces/portability/File.h"
#include "interfaces/portability/Port_Env.h"
#include "interfaces/portability/Secret.h"
#include "interfaces/utility/TesselPreference.h"

/// A line as it was read, and its words; kept from one line to the next.
struct CmdParser::Line {
  static constexpr int size = 1023;
  std::array<char, size> text{};
  CommandSet command{0};
};

CmdParser::CmdParser() : deviceManager(DeviceManagerInterface::getDeviceManager()) {
  if (Port_Env::GetEnv("ZOR_TESSEL_ALLOWBATCHMODECALLBACK") != nullptr) allowBatchCallback = 1;
  if (SetConsoleCtrlHandler(consoleCtrlHandler, TRUE) == FALSE) Messages::status("Could not set control handler.\n");
}

CmdParser::~CmdParser() {
  Port::File::close(recordStream);
  if (deviceManager != nullptr && deviceManager->getMode() != tESSELNS::NO_MODE) {
    deviceManager->unlockCable();
    deviceManager->closeCable(true);
  }
  DeviceManagerInterface::removeDeviceManager();
  if (useBatchLog) TesselBatchMsgMan::removeBatchLog();
}

void CmdParser::setMsgWrite(bool on) { useBatchLog = on; }

bool CmdParser::runCommandLine() {
  interactive = 1;
  bool result = true;
  TesselPreference::getPreferenceObject().dump();
  Line line;
  while (!quitRequested) {
    Port::Console::print(">");
    if (!Port::Console::readLine(line.text.data(), Line::size)) {
      interruptRequested = 1;
      quitRequested = true;
    } else if (interruptRequested != 0) {
      quitRequested = true;
      Port::Console::print("QUIT.\n");
    } else {
      const bool lineResult = runLine(line, result);
      // The line that ends the session leaves the result of the one before it.
      if (!quitRequested) result = lineResult;
    }
  }
  writeRecord();
  return result;
}

bool CmdParser::runCommandFile(const char* path) {
  if (useBatchLog) TesselBatchMsgMan::installBatchLog("default");
  if (path == nullptr) path = "";
  commandFile = Port::File::open(path, Port::File::read, true);
  if (commandFile == nullptr) return Messages::failure("File %s may not exist\n", path);
  interactive = 0;
  bool result = true;
  TesselPreference::getPreferenceObject().dump();
  Line line;
  while (!quitRequested && result && Port::Stream::readline(*commandFile, line.text.data(), Line::size)) {
    result = runLine(line, result);
    if (line.command.holdsKey()) commandFile->wipeRead();
  }
  if (commandFile->error() != 0)
    result = Messages::failure("Read error in file %s: %s\n", path, std::strerror(commandFile->error()));
  if (result && inRepeat) {
    Messages::warning("Missing repeatEnd command.\n");
    inRepeat = false;
    result = runRepeatLoop();
  }
  if (result && !quitRequested) result = runCommandLine();
  writeRecord();
  return result;
}

bool CmdParser::runLine(Line& line, bool result) {
  if (recordAndTokenise(line.text.data(), line.command)) result = processLine(line.command);
  if (line.command.holdsKey()) Port::Secret::wipe(line.text.data(), line.text.size());
  return result;
}

void CmdParser::writeRecord() {
  if (!recordOn) return;
  recordOn = false;
  if (recordStream == nullptr) return;
  const std::string path = recordStream->path();
  *recordStream << commandText;
  if (!Port::File::close(recordStream)) Messages::error("Write error, file %s is not complete\n", path);
}
