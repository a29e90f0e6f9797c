#include "manager/cables/Socket.h"

#include <fcntl.h>
#include <netdb.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <charconv>
#include <chrono>
#include <cmath>
#include <system_error>
#include <utility>

namespace {

using Clock = std::chrono::steady_clock;

Failure linkFailure(std::string text) { return {.text = std::move(text), .kind = Failure::Kind::link}; }

Failure systemFailure(int error) { return linkFailure(std::generic_category().message(error)); }

bool tryAgain(int error) { return error == EAGAIN || error == EWOULDBLOCK || error == EINTR; }

class Descriptor {
 public:
  explicit Descriptor(int number) : number_(number) {}
  Descriptor(Descriptor&& other) noexcept : number_(std::exchange(other.number_, -1)) {}
  Descriptor& operator=(Descriptor&&) = delete;
  ~Descriptor() {
    if (number_ >= 0) ::close(number_);
  }

  int get() const { return number_; }

 private:
  int number_;
};

/// False when nothing happened for so many seconds; signals do not shorten them.
Result<bool> pollFor(int descriptor, short events, double seconds) {
  const auto end = Clock::now() + std::chrono::duration<double>(seconds);
  while (true) {
    const double left = std::chrono::duration<double, std::milli>(end - Clock::now()).count();
    pollfd request{.fd = descriptor, .events = events, .revents = 0};
    const int count = ::poll(&request, 1, static_cast<int>(std::clamp(std::ceil(left), 0.0, 1e9)));
    if (count > 0) return true;
    if (count == 0) return false;
    if (errno != EINTR) return systemFailure(errno);
  }
}

class SocketChannel : public ByteChannel {
 public:
  explicit SocketChannel(Descriptor descriptor) : descriptor_(std::move(descriptor)) {}

  Result<std::size_t> send(std::span<const char> bytes) override {
    const ssize_t count = ::send(descriptor_.get(), bytes.data(), bytes.size(), MSG_NOSIGNAL | MSG_DONTWAIT);
    if (count >= 0) return static_cast<std::size_t>(count);
    return tryAgain(errno) ? Result<std::size_t>(std::size_t{0}) : systemFailure(errno);
  }

  Result<std::size_t> receive(std::span<char> bytes) override {
    const ssize_t count = ::recv(descriptor_.get(), bytes.data(), bytes.size(), MSG_DONTWAIT);
    if (count > 0) return static_cast<std::size_t>(count);
    if (count == 0) return linkFailure("end of stream");
    return tryAgain(errno) ? Result<std::size_t>(std::size_t{0}) : systemFailure(errno);
  }

  Result<bool> wait(bool forReceiving, bool forSending, double seconds) override {
    const int events = (forReceiving ? POLLIN : 0) | (forSending ? POLLOUT : 0);
    return pollFor(descriptor_.get(), static_cast<short>(events), seconds);
  }

 private:
  Descriptor descriptor_;
};

/// The end of a connection that does not come about at once.
Status finishConnecting(int descriptor, double seconds) {
  const Result<bool> ready = pollFor(descriptor, POLLOUT, seconds);
  if (!ready) return ready.failure();
  if (!*ready) return systemFailure(ETIMEDOUT);
  int error = 0;
  socklen_t size = sizeof error;
  if (::getsockopt(descriptor, SOL_SOCKET, SO_ERROR, &error, &size) != 0) error = errno;
  if (error != 0) return systemFailure(error);
  return {};
}

Result<std::unique_ptr<ByteChannel>> connectTo(int family, const sockaddr* address, socklen_t size, double seconds) {
  Descriptor descriptor(::socket(family, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0));
  if (descriptor.get() < 0) return systemFailure(errno);
  if (::connect(descriptor.get(), address, size) != 0) {
    if (errno != EINPROGRESS && errno != EINTR) return systemFailure(errno);
    TESSEL_TRY(finishConnecting(descriptor.get(), seconds));
  }
  if (family != AF_UNIX) {
    // What is sent stands in whole pieces; a small one must not wait for the next.
    const int on = 1;
    ::setsockopt(descriptor.get(), IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
  }
  return std::unique_ptr<ByteChannel>(std::make_unique<SocketChannel>(std::move(descriptor)));
}

Result<std::unique_ptr<ByteChannel>> connectToPath(const std::string& path, double seconds) {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  if (path.size() >= sizeof address.sun_path) return systemFailure(ENAMETOOLONG);
  std::copy(path.begin(), path.end(), std::begin(address.sun_path));
  return connectTo(AF_UNIX, reinterpret_cast<const sockaddr*>(&address), sizeof address, seconds);
}

/// The addresses of a host, given back at the end.
class Addresses {
 public:
  Addresses(const std::string& host, std::uint16_t port) {
    addrinfo hints{};
    hints.ai_socktype = SOCK_STREAM;
    hints.ai_flags = AI_NUMERICSERV;
    const int error = ::getaddrinfo(host.c_str(), std::to_string(port).c_str(), &hints, &first_);
    if (error != 0) problem_ = error == EAI_SYSTEM ? std::generic_category().message(errno) : ::gai_strerror(error);
  }
  Addresses(const Addresses&) = delete;
  Addresses& operator=(const Addresses&) = delete;
  ~Addresses() {
    if (first_ != nullptr) ::freeaddrinfo(first_);
  }

  const addrinfo* first() const { return first_; }
  int count() const {
    int result = 0;
    for (const addrinfo* each = first_; each != nullptr; each = each->ai_next) ++result;
    return result;
  }
  /// Why there are none.
  const std::string& problem() const { return problem_; }

 private:
  addrinfo* first_ = nullptr;
  std::string problem_;
};

/// Empty for a text that is no port.
std::uint16_t portOf(std::string_view text) {
  std::uint16_t port = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), port);
  return error == std::errc() && end == text.data() + text.size() ? port : std::uint16_t{0};
}

Failure badAddress(std::string_view text) {
  return {.text = "the server \"" + std::string(text) +
                  "\" is not HOST, HOST:PORT with a port from 1 to 65535, [ADDRESS]:PORT or unix:PATH"};
}

}  // namespace

Result<ServerAddress> ServerAddress::parse(std::string_view text, std::uint16_t defaultPort) {
  constexpr std::string_view unixWord = "unix:";
  if (text.starts_with(unixWord)) {
    const std::string_view path = text.substr(unixWord.size());
    if (path.empty()) return badAddress(text);
    return ServerAddress{.host = "", .port = 0, .path = std::string(path)};
  }
  std::string_view host = text;
  std::string_view rest;
  if (text.starts_with('[')) {
    const std::size_t end = text.find(']');
    if (end == std::string_view::npos) return badAddress(text);
    host = text.substr(1, end - 1);
    rest = text.substr(end + 1);
  } else if (const std::size_t colon = text.find(':'); colon != std::string_view::npos && colon == text.rfind(':')) {
    host = text.substr(0, colon);
    rest = text.substr(colon);
  }
  if (host.empty() || host.find('\0') != std::string_view::npos) return badAddress(text);
  if (rest.empty()) return ServerAddress{.host = std::string(host), .port = defaultPort, .path = ""};
  const std::uint16_t port = rest.starts_with(':') ? portOf(rest.substr(1)) : std::uint16_t{0};
  if (port == 0) return badAddress(text);
  return ServerAddress{.host = std::string(host), .port = port, .path = ""};
}

std::string ServerAddress::text() const {
  if (host.empty()) return "unix:" + path;
  const bool address = host.find(':') != std::string::npos;
  return (address ? '[' + host + ']' : host) + ':' + std::to_string(port);
}

Result<std::unique_ptr<ByteChannel>> Socket::connect(const ServerAddress& address, double seconds) {
  if (address.host.empty()) return connectToPath(address.path, seconds);
  const auto end = Clock::now() + std::chrono::duration<double>(seconds);
  const Addresses addresses(address.host, address.port);
  if (addresses.first() == nullptr) return linkFailure(addresses.problem());
  Failure problem;
  int left = addresses.count();
  for (const addrinfo* each = addresses.first(); each != nullptr; each = each->ai_next, --left) {
    const double share = std::chrono::duration<double>(end - Clock::now()).count() / left;
    Result<std::unique_ptr<ByteChannel>> channel =
        connectTo(each->ai_family, each->ai_addr, each->ai_addrlen, std::max(share, 0.0));
    if (channel) return channel;
    problem = channel.failure();
  }
  return problem;
}

std::unique_ptr<ByteChannel> Socket::over(int descriptor) {
  return std::make_unique<SocketChannel>(Descriptor(descriptor));
}

std::string Socket::resolved(const ServerAddress& address) {
  if (address.host.empty()) return address.text();
  const Addresses addresses(address.host, address.port);
  std::string first;
  for (const addrinfo* each = addresses.first(); each != nullptr; each = each->ai_next) {
    std::array<char, NI_MAXHOST> host{};
    if (::getnameinfo(each->ai_addr, each->ai_addrlen, host.data(), host.size(), nullptr, 0, NI_NUMERICHOST) != 0)
      continue;
    const std::string name = host.data();
    if (name == "::1" || name.starts_with("127.")) return "loopback:" + std::to_string(address.port);
    if (first.empty()) first = name + ":" + std::to_string(address.port);
  }
  return first.empty() ? address.text() : first;
}
