#include "tests/property/Proxy.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstdlib>

namespace {

constexpr int patience = 50;  ///< milliseconds between two looks at whether to end

sockaddr_in loopback(std::uint16_t port) {
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  address.sin_port = htons(port);
  return address;
}

[[noreturn]] void giveUp(const char* what) {
  std::perror(what);
  std::exit(2);
}

int newSocket() {
  const int result = ::socket(AF_INET, SOCK_STREAM, 0);
  if (result < 0) giveUp("socket");
  const int on = 1;
  ::setsockopt(result, IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
  return result;
}

bool sendAll(int to, const char* bytes, std::size_t count) {
  while (count > 0) {
    const ssize_t sent = ::send(to, bytes, count, MSG_NOSIGNAL);
    if (sent <= 0) return false;
    bytes += sent;
    count -= static_cast<std::size_t>(sent);
  }
  return true;
}

}  // namespace

Proxy::Proxy(std::uint16_t serverPort) : serverPort_(serverPort), listener_(newSocket()) {
  sockaddr_in address = loopback(0);
  socklen_t size = sizeof address;
  auto* plain = reinterpret_cast<sockaddr*>(&address);
  if (::bind(listener_, plain, size) != 0 || ::listen(listener_, 4) != 0) giveUp("listen");
  if (::getsockname(listener_, plain, &size) != 0) giveUp("getsockname");
  port_ = ntohs(address.sin_port);
  thread_ = std::thread([this] { serve(); });
}

Proxy::~Proxy() {
  ending_ = true;
  thread_.join();
  ::close(listener_);
}

void Proxy::serve() {
  while (!ending_) {
    pollfd wanted{listener_, POLLIN, 0};
    if (::poll(&wanted, 1, patience) <= 0) continue;
    const int client = ::accept(listener_, nullptr, nullptr);
    if (client < 0) continue;
    const int server = newSocket();
    const sockaddr_in address = loopback(serverPort_);
    if (::connect(server, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0) forward(client, server);
    ::close(server);
    ::close(client);
  }
}

void Proxy::forward(int client, int server) {
  std::uint64_t sent = 0;
  cut_ = false;
  bool open = true;
  while (open && !ending_) {
    std::array<pollfd, 2> wanted{pollfd{client, POLLIN, 0}, pollfd{server, POLLIN, 0}};
    if (::poll(wanted.data(), wanted.size(), patience) <= 0) continue;
    if (wanted[1].revents != 0) open = forwardOnce(server, client, nullptr);
    if (open && wanted[0].revents != 0) open = forwardOnce(client, server, &sent);
    cut_ = cutAfter_ != 0 && sent >= cutAfter_;
    open = open && !cut_;
  }
  sent_ = sent;
}

bool Proxy::forwardOnce(int from, int to, std::uint64_t* count) const {
  std::array<char, 4096> buffer{};
  std::size_t most = buffer.size();
  if (count != nullptr && cutAfter_ != 0) most = std::min<std::size_t>(most, cutAfter_ - *count);
  const ssize_t got = ::recv(from, buffer.data(), most, 0);
  if (got <= 0) return false;
  if (count != nullptr) *count += static_cast<std::uint64_t>(got);
  return sendAll(to, buffer.data(), static_cast<std::size_t>(got));
}
