#include "batch/Interrupts.h"

#include <csignal>
#include <cstdlib>

#include "batch/Messages.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/Console.h"

std::atomic<unsigned char> allowBatchCallback = 0;
std::atomic<unsigned char> interruptRequested = 0;
std::atomic<unsigned char> interactive = 0;

namespace {

constexpr DWORD ctrlC = 0;
constexpr DWORD consoleClosing = 2;

void promiseToStop() {
  Messages::status("Ctrl-C detected. Please wait while the current batch command is being completed.\n");
}

[[noreturn]] void abortWith(const char* text) {
  Port::Console::printFromSignalHandler(text);
  std::abort();
}

void releaseCable() {
  forceUnlockCable();
  DeviceManagerInterface* manager = DeviceManagerInterface::getDeviceManager();
  if (manager == nullptr) return;
  if (manager->getMode() != tESSELNS::NO_MODE)
    manager->closeCable(false);
  else
    Port::Console::printFromSignalHandler("MODE IS NONE IN SIGABORT\n");
}

}  // namespace

BOOL consoleCtrlHandler(DWORD event) {
  switch (event) {
    case ctrlC:
      if (interactive == 0) promiseToStop();
      interruptRequested = 1;
      return TRUE;
    case consoleClosing:
      Messages::status("close handler.\n");
      return TRUE;
    default:
      return FALSE;
  }
}

void signalHandler(int signal) {
  switch (signal) {
    case SIGINT:
      if (interactive != 0) std::abort();
      promiseToStop();
      break;
    case SIGSEGV:
      abortWith("sigsegv.\n");
    case SIGTERM:
      abortWith("sigterm.\n");
    case SIGABRT:
      releaseCable();
      break;
    default:
      break;
  }
  interruptRequested = 1;
}

void forceUnlockCable() {
  DeviceManagerInterface* manager = DeviceManagerInterface::getDeviceManager();
  if (manager == nullptr) return;
  manager->unlockCable();
  Port::Console::printFromSignalHandler("Force-unlocking cable.\n");
}
