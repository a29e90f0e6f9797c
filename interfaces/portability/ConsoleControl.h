#pragma once

#include <cstdint>

#include "interfaces/Export.h"

/// Console control events, with the types and numbers of the console that has them by nature. Elsewhere
/// the signals Ctrl-C (SIGINT), Ctrl-\ (SIGQUIT), terminal hang-up (SIGHUP) and SIGTERM become the events
/// 0, 1, 2 and 6. A signal that was ignored when the first handler was registered stays ignored.
#if defined(_WIN32)
#include <windows.h>
#else
using BOOL = int;
using DWORD = std::uint32_t;
inline constexpr BOOL TRUE = 1;
inline constexpr BOOL FALSE = 0;

using ConsoleCtrlHandler = BOOL (*)(DWORD event);

/// Registers (`add` TRUE) or removes a handler; FALSE when that fails. An event goes to the handlers in
/// reverse order of registration until one returns TRUE. They run on a thread of their own and may issue
/// messages. An event that no handler takes gets the signal's default action.
TESSEL_EXPORT BOOL SetConsoleCtrlHandler(ConsoleCtrlHandler handler, BOOL add);
#endif

namespace Port {

/// Calls the registered handlers for an event on the calling thread; true when one took it.
TESSEL_EXPORT bool deliverConsoleEvent(std::uint32_t event);

}  // namespace Port
