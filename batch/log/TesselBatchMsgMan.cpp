#include "batch/log/TesselBatchMsgMan.h"

#include <array>

#include "interfaces/portability/File.h"
#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/UT_STR.h"
#include "interfaces/portability/UT_TIME.h"

std::atomic<unsigned char> logFreshFlag = 0;

namespace {

std::unique_ptr<TesselBatchMsgMan> theBatchMsgMan;
Port_MsgManDefault* previousMsgMan = nullptr;

std::unique_ptr<Port::Stream> openLog(const StringBase& path) {
  return Port::File::open(path.c_str(), Port::File::write, true);
}

StringBase defaultLog() {
  std::array<char, 250> directory{};
  // A directory too deep for the buffer is still the current one.
  StringBase path(Port::File::getcwd(directory.data(), directory.size()) ? directory.data() : ".");
  path += "/_tesselbatch.log";
  return path;
}

}  // namespace

TesselBatchMsgMan::TesselBatchMsgMan(const char* logName) : Port_MsgManDefault(nullptr), defaultLogPath(defaultLog()) {
  const bool isDefault = UT_STR::IMatch(logName, "default");
  if (!isDefault) userLogPath = StringBase(logName);
  logStream = openLog(isDefault ? defaultLogPath : userLogPath);
  writeBanner();
}

TesselBatchMsgMan::~TesselBatchMsgMan() {
  Port_MsgDispatcher::addMsgMan(previousMsgMan);
  Port_MsgDispatcher::removeMsgMan(this);
  // Installed over itself the manager stands on the list twice; nothing may reach it from here on.
  Port_MsgDispatcher::forget(this);
  Port::File::close(logStream);
}

void TesselBatchMsgMan::writeBanner() {
  if (logStream == nullptr) return;
  *logStream << "tESSEL Version: " __DATE__ " " __TIME__ << Port::endl;
  *logStream << "\ntESSEL log file Started on " << UT_TIME::CTime(UT_TIME::Time()) << Port::endl;
}

void TesselBatchMsgMan::msgWrite(MsgType type, const wchar_t* text) {
  logFreshFlag = 0;
  Port_MsgManDefault::msgWrite(type, text);
  int count = 0;
  std::vector<std::wstring> lines = msgFormat(type, getClean(), getMaxLineWidth(), text, &count);
  StringBase shown;
  for (int i = 0; i < count; ++i) shown += UT_STR::WstrToMbstr(lines[static_cast<std::size_t>(i)].c_str());
  UT_STR::WDelStrings(lines, count);
  if (logStream == nullptr) return;
  if (shown.GetIndexOfString("\n", 0) < 0) {
    *logStream << shown;  // the next message goes on with this line
    return;
  }
  shown.Trim("\n", StringBase::trimEnd);
  *logStream << shown << Port::endl;
}

void TesselBatchMsgMan::copyToUserLog() {
  Port::File::close(logStream);
  if (firstCopy) {
    Port::File::remove(userLogPath.c_str());
    Port::File::copy(defaultLogPath.c_str(), userLogPath.c_str());
    firstCopy = false;
  } else {
    Port::File::append(defaultLogPath.c_str(), userLogPath.c_str());
  }
  logStream = openLog(defaultLogPath);
}

void TesselBatchMsgMan::installBatchLog(const char* logName) {
  if (theBatchMsgMan == nullptr) theBatchMsgMan = std::make_unique<TesselBatchMsgMan>(logName);
  previousMsgMan = Port_MsgDispatcher::getDefaultMsgMan();
  theBatchMsgMan->setMaxLineWidth(previousMsgMan->getMaxLineWidth());
  Port_MsgDispatcher::addMsgMan(theBatchMsgMan.get());
  Port_MsgDispatcher::removeMsgMan(previousMsgMan);
  logFreshFlag = 1;
}

void TesselBatchMsgMan::removeBatchLog() {
  if (theBatchMsgMan == nullptr) return;
  const int width = theBatchMsgMan->getMaxLineWidth();
  theBatchMsgMan.reset();
  // A line width that was set meanwhile stays in force.
  Port_MsgDispatcher::getDefaultMsgMan()->setMaxLineWidth(width);
}
