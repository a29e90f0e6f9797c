// Gets real signals in place of a test. Its words are carried out in order:
//
//   +HANDLER, -HANDLER   registers or removes a handler (see `handlers`)
//   deliver:N            hands event N to the handlers on this thread
//   talk:N               says "ready" and issues N messages
//
// It then says "ready" and waits for the end of its input. Handlers say their name and the event.

#include <poll.h>
#include <unistd.h>

#include <cstdlib>
#include <string>
#include <string_view>
#include <thread>

#include "interfaces/portability/Console.h"
#include "interfaces/portability/ConsoleControl.h"
#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/Port_MsgManData.h"

namespace {

std::thread::id mainThread;

template <class... Arguments>
void say(const char* format, const Arguments&... arguments) {
  // Not through a buffer: the process may be ending on the main thread meanwhile.
  Port::Console::printFromSignalHandler(Port::format(format, arguments...).c_str());
}

BOOL passing(DWORD event) {
  say("passing %d\n", event);
  return FALSE;
}
BOOL passing2(DWORD event) {
  say("passing2 %d\n", event);
  return FALSE;
}
BOOL taking(DWORD event) {
  say("taking %d\n", event);
  return TRUE;
}
BOOL taking2(DWORD event) {
  say("taking2 %d\n", event);
  return TRUE;
}
BOOL telling(DWORD event) {
  say("telling %d on %s thread\n", event, std::this_thread::get_id() == mainThread ? "the main" : "its own");
  return TRUE;
}
BOOL talking(DWORD event) {
  Port_MsgManData::createObject("tESSEL", "../s/Helper", __LINE__, "").issueStatus("talking %d\n", event);
  return TRUE;
}

struct Handler {
  std::string_view name;
  ConsoleCtrlHandler function;
};
constexpr Handler handlers[] = {{"passing", passing}, {"passing2", passing2}, {"taking", taking},
                                {"taking2", taking2}, {"telling", telling},   {"talking", talking}};

ConsoleCtrlHandler find(std::string_view name) {
  for (const Handler& row : handlers)
    if (row.name == name) return row.function;
  std::abort();
}

void talk(int count) {
  say("ready\n");
  const auto message = Port_MsgManData::createObject("tESSEL", "../s/Helper", __LINE__, "");
  for (int i = 0; i < count; ++i) message.issueStatus("main %d\n", i);
}

void carryOut(const std::string& word) {
  if (word.front() == '+' || word.front() == '-') {
    const bool add = word.front() == '+';
    if (SetConsoleCtrlHandler(find(std::string_view(word).substr(1)), add ? TRUE : FALSE) == FALSE)
      say("%s failed\n", word);
  } else if (word.starts_with("deliver:")) {
    const bool taken = Port::deliverConsoleEvent(static_cast<DWORD>(std::stoul(word.substr(8))));
    say(taken ? "taken\n" : "not taken\n");
  } else if (word.starts_with("talk:")) {
    talk(std::stoi(word.substr(5)));
  }
}

}  // namespace

int main(int count, char** words) {
  mainThread = std::this_thread::get_id();
  for (int i = 1; i < count; ++i) carryOut(words[i]);
  say("ready\n");
  // Waits in `poll`: the thread sanitizer lets signals through there, but not in a read.
  pollfd input{STDIN_FILENO, POLLIN, 0};
  char byte = 0;
  do {
    while (::poll(&input, 1, -1) < 0) continue;
  } while (::read(STDIN_FILENO, &byte, 1) > 0);
  return 0;
}
