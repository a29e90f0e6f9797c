#include "manager/simulator/BoardServer.h"

#include <fcntl.h>
#include <netdb.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cerrno>
#include <charconv>
#include <cstring>
#include <span>

namespace {

constexpr std::size_t inputBytes = std::size_t{256} * 1024;
/// A client that does not fetch its answers is read no further from here on.
constexpr std::size_t mostQueued = std::size_t{64} << 20;
constexpr std::chrono::seconds patienceWithRest{5};

struct FreeAddresses {
  void operator()(addrinfo* list) const { ::freeaddrinfo(list); }
};
using Addresses = std::unique_ptr<addrinfo, FreeAddresses>;

Failure systemFailure(const std::string& what, int error) { return {.text = what + ": " + std::strerror(error)}; }

/// The system's own reading takes any number, modulo what fits.
bool isPort(const std::string& text) {
  unsigned number = 0;
  const char* end = text.data() + text.size();
  const auto [behind, problem] = std::from_chars(text.data(), end, number);
  return problem == std::errc() && behind == end && number <= 65535;
}

std::string addressOf(int socket) {
  sockaddr_storage address{};
  socklen_t length = sizeof address;
  char host[NI_MAXHOST];
  char port[NI_MAXSERV];
  auto* general = reinterpret_cast<sockaddr*>(&address);
  if (::getsockname(socket, general, &length) != 0) return "";
  if (::getnameinfo(general, length, host, sizeof host, port, sizeof port, NI_NUMERICHOST | NI_NUMERICSERV) != 0)
    return "";
  const std::string name = host;
  return (name.find(':') == std::string::npos ? name : "[" + name + "]") + ":" + port;
}

/// A listening socket, or the system's error number in `error`.
BoardServer::Handle listenAt(const addrinfo& address, int& error) {
  BoardServer::Handle socket(::socket(address.ai_family, address.ai_socktype | SOCK_CLOEXEC, address.ai_protocol));
  const int on = 1;
  if (socket.open() && ::setsockopt(socket.number(), SOL_SOCKET, SO_REUSEADDR, &on, sizeof on) == 0 &&
      ::bind(socket.number(), address.ai_addr, address.ai_addrlen) == 0 && ::listen(socket.number(), 4) == 0)
    return socket;
  error = errno;
  return BoardServer::Handle();
}

}  // namespace

BoardServer::Handle& BoardServer::Handle::operator=(Handle&& other) noexcept {
  std::swap(number_, other.number_);
  return *this;
}

BoardServer::Handle::~Handle() {
  if (open()) ::close(number_);
}

BoardServer::BoardServer(SimulatedBoard& board) : board_(board), input_(inputBytes) {
  int ends[2] = {-1, -1};
  if (::pipe2(ends, O_CLOEXEC | O_NONBLOCK) != 0) return;
  stopReader_ = Handle(ends[0]);
  stopWriter_ = Handle(ends[1]);
}

Status BoardServer::listen(const std::string& host, const std::string& port) {
  if (!isPort(port)) return Failure{"can't listen on " + host + ":" + port + ": a port is a number up to 65535"};
  addrinfo wanted{};
  wanted.ai_socktype = SOCK_STREAM;
  wanted.ai_flags = AI_PASSIVE;
  addrinfo* found = nullptr;
  const int problem = ::getaddrinfo(host.empty() ? nullptr : host.c_str(), port.c_str(), &wanted, &found);
  if (problem != 0) return Failure{"can't listen on " + host + ":" + port + ": " + ::gai_strerror(problem)};
  const Addresses addresses(found);
  int error = 0;
  for (const addrinfo* address = addresses.get(); address != nullptr && !listener_.open(); address = address->ai_next)
    listener_ = listenAt(*address, error);
  if (!listener_.open()) return systemFailure("can't listen on " + host + ":" + port, error);
  address_ = addressOf(listener_.number());
  return {};
}

Status BoardServer::run(bool once) {
  while (!stopped()) {
    if (!waitFor(-1, false, false)) continue;
    Handle client(::accept4(listener_.number(), nullptr, nullptr, SOCK_CLOEXEC));
    if (!client.open()) continue;
    serve(std::move(client));
    TESSEL_TRY(board_.save());
    if (once) break;
  }
  return {};
}

void BoardServer::stop() {
  const char byte = 0;
  // A full pipe has been told before.
  [[maybe_unused]] const ssize_t written = ::write(stopWriter_.number(), &byte, 1);
}

bool BoardServer::stopped() const {
  pollfd wait = {.fd = stopReader_.number(), .events = POLLIN, .revents = 0};
  return ::poll(&wait, 1, 0) > 0;
}

void BoardServer::serve(Handle client) {
  const int on = 1;
  ::setsockopt(client.number(), IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
  board_.reconnect();
  decoder_ = std::make_unique<BitbangDecoder>(board_);
  answers_.clear();
  sent_ = 0;
  hungUp_ = false;
  lastTime_ = std::chrono::steady_clock::now();
  while (board_.linkUp() && !decoder_->ended() && !hungUp_) {
    if (stopped()) return;
    if (!waitFor(client.number(), queued() < mostQueued, queued() > 0)) continue;
    if (readable_ && !receive(client.number())) break;
    if ((readable_ || writable_) && queued() > 0 && !send(client.number())) return;
  }
  sendRest(client.number());
}

/// Waits until something can be done; false when there is nothing for the caller. With a client, further ones are
/// refused on the way; without one (-1) it waits for the next.
bool BoardServer::waitFor(int client, bool input, bool output) {
  const auto wanted = static_cast<short>((input ? POLLIN : 0) | (output ? POLLOUT : 0));
  pollfd waits[] = {{.fd = stopReader_.number(), .events = POLLIN, .revents = 0},
                    {.fd = listener_.number(), .events = POLLIN, .revents = 0},
                    {.fd = client, .events = wanted, .revents = 0}};
  readable_ = writable_ = false;
  if (::poll(waits, 3, -1) <= 0 || waits[0].revents != 0) return false;
  if (client < 0) return waits[1].revents != 0;
  // A client that has gone, or still has something to say, may be about to make room for the next one.
  if (waits[1].revents != 0 && waits[2].revents == 0) refuseClient();
  readable_ = input && (waits[2].revents & (POLLIN | POLLHUP)) != 0;
  writable_ = (waits[2].revents & POLLOUT) != 0;
  hungUp_ = (waits[2].revents & (POLLERR | POLLNVAL)) != 0 || (!readable_ && (waits[2].revents & POLLHUP) != 0);
  return readable_ || writable_ || hungUp_;
}

void BoardServer::refuseClient() {
  const Handle further(::accept4(listener_.number(), nullptr, nullptr, SOCK_CLOEXEC));
}

bool BoardServer::receive(int client) {
  const ssize_t count = ::recv(client, input_.data(), input_.size(), MSG_DONTWAIT);
  if (count < 0) return errno == EAGAIN || errno == EINTR;
  if (count == 0) return false;
  passTime();
  const std::uint64_t carried = std::min(static_cast<std::uint64_t>(count), board_.linkBytesLeft());
  decoder_->feed(std::span(input_).first(static_cast<std::size_t>(carried)), answers_);
  board_.countLinkBytes(carried);
  return true;
}

bool BoardServer::send(int client) {
  const ssize_t count = ::send(client, answers_.data() + sent_, queued(), MSG_DONTWAIT | MSG_NOSIGNAL);
  if (count < 0) return errno == EAGAIN || errno == EINTR;
  sent_ += static_cast<std::size_t>(count);
  // Bytes that are gone are thrown away when they are most of the queue, so that each is moved rarely.
  if (sent_ < answers_.size() / 2) return true;
  answers_.erase(answers_.begin(), answers_.begin() + static_cast<std::ptrdiff_t>(sent_));
  sent_ = 0;
  return true;
}

void BoardServer::sendRest(int client) {
  using std::chrono::steady_clock;
  const steady_clock::time_point end = steady_clock::now() + patienceWithRest;
  while (queued() > 0 && !hungUp_ && steady_clock::now() < end) {
    pollfd waits[] = {{.fd = stopReader_.number(), .events = POLLIN, .revents = 0},
                      {.fd = client, .events = POLLOUT, .revents = 0}};
    if (::poll(waits, 2, 100) < 0 || waits[0].revents != 0) return;
    if (waits[1].revents != 0 && !send(client)) return;
  }
}

void BoardServer::passTime() {
  const auto now = std::chrono::steady_clock::now();
  board_.elapse(std::chrono::duration<double>(now - lastTime_).count());
  lastTime_ = now;
}
