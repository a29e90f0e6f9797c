#include "tests/unit/manager/cables/TestServer.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <iterator>

namespace {

void require(bool holds) {
  if (!holds) std::abort();
}

int listenOnPort(std::uint16_t& port) {
  const int listener = ::socket(AF_INET, SOCK_STREAM, 0);
  require(listener >= 0);
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  auto* plain = reinterpret_cast<sockaddr*>(&address);
  require(::bind(listener, plain, sizeof address) == 0 && ::listen(listener, 1) == 0);
  socklen_t size = sizeof address;
  require(::getsockname(listener, plain, &size) == 0);
  port = ntohs(address.sin_port);
  return listener;
}

int listenOnPath(const std::string& path) {
  const int listener = ::socket(AF_UNIX, SOCK_STREAM, 0);
  require(listener >= 0);
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  require(path.size() < sizeof address.sun_path);
  std::copy(path.begin(), path.end(), std::begin(address.sun_path));
  require(::bind(listener, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0);
  require(::listen(listener, 1) == 0);
  return listener;
}

/// The pins of a chain, driven a byte at a time.
class Pins {
 public:
  explicit Pins(FakeChain& chain) : chain_(chain) {}

  void drive(unsigned value) {
    const bool tck = (value & 4U) != 0;
    if (tck && !tck_) tdo_ = chain_.clock((value & 2U) != 0, (value & 1U) != 0);
    tck_ = tck;
  }
  /// TDO changes at the fall.
  char sample() { return (tck_ ? tdo_ : chain_.peek()) ? '1' : '0'; }

 private:
  FakeChain& chain_;
  bool tck_ = false;
  bool tdo_ = false;
};

}  // namespace

TestServer::TestServer(Behaviour behaviour, const std::string& path) : path_(path) {
  std::uint16_t port = 0;
  listener_ = path.empty() ? listenOnPort(port) : listenOnPath(path);
  address_ = path.empty() ? "127.0.0.1:" + std::to_string(port) : "unix:" + path;
  thread_ = std::thread([this, behaviour = std::move(behaviour)] {
    const int client = ::accept(listener_, nullptr, nullptr);
    if (client < 0) return;
    behaviour(client);
    ::close(client);
  });
}

TestServer::~TestServer() {
  // Ends an accept that no client came to.
  ::shutdown(listener_, SHUT_RDWR);
  join();
  ::close(listener_);
  if (!path_.empty()) ::unlink(path_.c_str());
}

void TestServer::join() {
  if (thread_.joinable()) thread_.join();
}

std::string TestServer::readAll(int socket) {
  std::string result;
  std::array<char, 4096> piece{};
  while (true) {
    const ssize_t count = ::recv(socket, piece.data(), piece.size(), 0);
    if (count <= 0) return result;
    result.append(piece.data(), static_cast<std::size_t>(count));
  }
}

bool TestServer::write(int socket, const std::string& bytes) {
  for (std::size_t done = 0; done < bytes.size();) {
    const ssize_t count = ::send(socket, bytes.data() + done, bytes.size() - done, MSG_NOSIGNAL);
    if (count <= 0) return false;
    done += static_cast<std::size_t>(count);
  }
  return true;
}

void TestServer::serve(int socket, FakeChain& chain) {
  Pins pins(chain);
  std::array<char, 65536> piece{};
  while (true) {
    const ssize_t count = ::recv(socket, piece.data(), piece.size(), 0);
    if (count <= 0) return;
    std::string answers;
    for (ssize_t i = 0; i < count; ++i) {
      const char byte = piece[static_cast<std::size_t>(i)];
      if (byte == 'Q') return;
      if (byte == 'R') answers += pins.sample();
      if (byte >= '0' && byte <= '7') pins.drive(static_cast<unsigned>(byte - '0'));
    }
    if (!write(socket, answers)) return;
  }
}

std::string TestServer::answer(int socket, const std::string& answers) {
  std::string result;
  std::array<char, 4096> piece{};
  for (std::size_t given = 0; given < answers.size();) {
    const ssize_t count = ::recv(socket, piece.data(), piece.size(), 0);
    if (count <= 0) return result;
    result.append(piece.data(), static_cast<std::size_t>(count));
    const auto samples = static_cast<std::size_t>(std::count(piece.begin(), piece.begin() + count, 'R'));
    if (!write(socket, answers.substr(given, samples))) return result;
    given += samples;
  }
  return result + readAll(socket);
}

void TestServer::dropAfter(int socket, std::size_t answers) {
  std::array<char, 4096> piece{};
  while (true) {
    const ssize_t count = ::recv(socket, piece.data(), piece.size(), 0);
    if (count <= 0) return;
    const auto samples = static_cast<std::size_t>(std::count(piece.begin(), piece.begin() + count, 'R'));
    const std::size_t given = std::min(samples, answers);
    if (!write(socket, std::string(given, '0'))) return;
    answers -= given;
    if (answers == 0) break;
  }
  ::shutdown(socket, SHUT_WR);
  readAll(socket);
}

std::string addressOfNobody() {
  std::uint16_t port = 0;
  ::close(listenOnPort(port));
  return "127.0.0.1:" + std::to_string(port);
}
