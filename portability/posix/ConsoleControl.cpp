#include "interfaces/portability/ConsoleControl.h"

#include <fcntl.h>
#include <signal.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cerrno>
#include <iterator>
#include <mutex>
#include <thread>
#include <vector>

namespace {

struct Source {
  int signal;
  DWORD event;
};
constexpr std::array<Source, 4> sources = {{{SIGINT, 0}, {SIGQUIT, 1}, {SIGHUP, 2}, {SIGTERM, 6}}};

/// The write end of the pipe to the event thread. The signal handler reads it, so it stands outside.
std::atomic<int> wakeDescriptor = -1;
static_assert(std::atomic<int>::is_always_lock_free);

/// All that runs in signal context: hand the signal's number to the thread.
void wake(int signal) {
  const int savedError = errno;
  const auto byte = static_cast<unsigned char>(signal);
  // A full pipe holds more events than anybody could press; the one that does not fit is dropped.
  [[maybe_unused]] const ssize_t written = ::write(wakeDescriptor, &byte, 1);
  errno = savedError;
}

/// The registered handlers and the thread that calls them. Never destroyed: the thread lives as long as
/// the process.
class EventThread {
 public:
  static EventThread& instance() {
    static auto* const thread = new EventThread;  // NOLINT(cppcoreguidelines-owning-memory)
    return *thread;
  }

  bool add(ConsoleCtrlHandler handler) {
    const std::lock_guard lock(mutex_);
    if (!start()) return false;
    handlers_.push_back(handler);
    return true;
  }

  bool remove(ConsoleCtrlHandler handler) {
    const std::lock_guard lock(mutex_);
    const auto place = std::find(handlers_.rbegin(), handlers_.rend(), handler);
    if (place == handlers_.rend()) return false;
    handlers_.erase(std::next(place).base());
    return true;
  }

  bool deliver(DWORD event) {
    std::vector<ConsoleCtrlHandler> handlers;
    {
      const std::lock_guard lock(mutex_);
      handlers = handlers_;
    }
    return std::any_of(handlers.rbegin(), handlers.rend(),
                       [event](ConsoleCtrlHandler handler) { return handler(event) != FALSE; });
  }

 private:
  bool start() {
    if (wakeDescriptor >= 0) return true;
    std::array<int, 2> ends{};
    if (::pipe2(ends.data(), O_CLOEXEC) != 0) return false;
    // The reading end waits; a signal handler must never wait.
    ::fcntl(ends[1], F_SETFL, O_NONBLOCK);
    // Signals go to the host's threads: this one must be free to run the handlers.
    sigset_t all;
    sigset_t before;
    sigfillset(&all);
    ::pthread_sigmask(SIG_SETMASK, &all, &before);
    try {
      std::thread([this, descriptor = ends[0]] { run(descriptor); }).detach();
    } catch (const std::system_error&) {
      ::pthread_sigmask(SIG_SETMASK, &before, nullptr);
      ::close(ends[0]);
      ::close(ends[1]);
      return false;
    }
    ::pthread_sigmask(SIG_SETMASK, &before, nullptr);
    wakeDescriptor = ends[1];
    return std::all_of(sources.begin(), sources.end(), catchSignal);
  }

  static bool catchSignal(const Source& source) {
    struct sigaction current {};
    if (::sigaction(source.signal, nullptr, &current) != 0) return false;
    if (current.sa_handler == SIG_IGN) return true;
    struct sigaction action {};
    action.sa_handler = wake;
    action.sa_flags = SA_RESTART;
    sigemptyset(&action.sa_mask);
    return ::sigaction(source.signal, &action, nullptr) == 0;
  }

  void run(int descriptor) {
    unsigned char signal = 0;
    for (;;) {
      const ssize_t count = ::read(descriptor, &signal, 1);
      if (count < 0 && errno == EINTR) continue;
      if (count != 1) return;
      const auto* source =
          std::find_if(sources.begin(), sources.end(), [signal](const Source& each) { return each.signal == signal; });
      if (source != sources.end() && !deliver(source->event)) takeDefaultAction(signal);
    }
  }

  static void takeDefaultAction(int signal) {
    struct sigaction action {};
    action.sa_handler = SIG_DFL;
    sigemptyset(&action.sa_mask);
    ::sigaction(signal, &action, nullptr);
    ::kill(::getpid(), signal);
  }

  std::mutex mutex_;
  std::vector<ConsoleCtrlHandler> handlers_;
};

}  // namespace

BOOL SetConsoleCtrlHandler(ConsoleCtrlHandler handler, BOOL add) {
  EventThread& thread = EventThread::instance();
  const bool done = add != FALSE ? thread.add(handler) : thread.remove(handler);
  return done ? TRUE : FALSE;
}

bool Port::deliverConsoleEvent(std::uint32_t event) { return EventThread::instance().deliver(event); }
