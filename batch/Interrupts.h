#pragma once

#include <atomic>

#include "interfaces/portability/ConsoleControl.h"

/// Byte flags that the interrupt handlers share with the sessions of the process; zero at load.
/// Atomic, because the console's thread sets what the session's thread polls between lines.
extern std::atomic<unsigned char> allowBatchCallback;  ///< the progress callback goes with every command
extern std::atomic<unsigned char> interruptRequested;  ///< Ctrl-C or a signal was seen; never cleared
extern std::atomic<unsigned char> interactive;         ///< the console is the reader, not a command file

/// The console control handler that a session registers; TRUE when it took the event.
BOOL consoleCtrlHandler(DWORD event);

/// A signal handler for hosts that want one; no session installs it.
void signalHandler(int signal);

/// Gives the cable's lock back, if there is a device manager.
void forceUnlockCable();
