#include <arpa/inet.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>

#include <algorithm>
#include <cstdio>
#include <string>
#include <thread>
#include <vector>

#include "benchmarks/board/Rate.h"
#include "manager/parts/PartLibrary.h"
#include "manager/simulator/BoardServer.h"

namespace {

using Bytes = std::vector<std::uint8_t>;

constexpr std::size_t bits = std::size_t{8} << 20;
constexpr std::size_t pieceBytes = std::size_t{256} * 1024;
constexpr int rounds = 10;
constexpr double bar = 0.15;  // seconds

/// Not open when the server can't be reached.
BoardServer::Handle connectTo(const std::string& address) {
  BoardServer::Handle socket(::socket(AF_INET, SOCK_STREAM, 0));
  sockaddr_in server{};
  server.sin_family = AF_INET;
  server.sin_port = htons(static_cast<std::uint16_t>(std::stoi(address.substr(address.rfind(':') + 1))));
  server.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  const bool connected = ::connect(socket.number(), reinterpret_cast<const sockaddr*>(&server), sizeof server) == 0;
  return connected ? std::move(socket) : BoardServer::Handle();
}

/// Sends all and gets `count` answers, reading while it sends; fewer when the server goes.
Bytes exchange(int socket, const Bytes& out, std::size_t count) {
  Bytes in(count);
  std::size_t sent = 0;
  std::size_t got = 0;
  while (sent < out.size() || got < count) {
    const auto wanted = static_cast<short>((sent < out.size() ? POLLOUT : 0) | POLLIN);
    pollfd wait = {.fd = socket, .events = wanted, .revents = 0};
    ::poll(&wait, 1, -1);
    if ((wait.revents & POLLOUT) != 0) {
      const ssize_t written =
          ::send(socket, out.data() + sent, std::min(pieceBytes, out.size() - sent), MSG_DONTWAIT | MSG_NOSIGNAL);
      if (written > 0) sent += static_cast<std::size_t>(written);
    }
    if ((wait.revents & (POLLIN | POLLHUP)) == 0) continue;
    const ssize_t read = ::recv(socket, in.data() + got, count - got, MSG_DONTWAIT);
    if (read == 0) break;
    if (read > 0) got += static_cast<std::size_t>(read);
  }
  in.resize(got);
  return in;
}

/// From anywhere to Shift-DR with BYPASS in the default board's three devices of eight bits each.
Bytes toBypass() {
  std::string bytes =
      "2626262626"
      "04"
      "2626"
      "0404";
  for (int i = 0; i < 23; ++i) bytes += "15";
  bytes +=
      "37"
      "2626"
      "0404";
  return {bytes.begin(), bytes.end()};
}

/// One round as a client does it: makes the bytes, exchanges them, compares. False when other bits come back.
bool goRound(int socket) {
  Bytes out(bits * 3);
  Bytes expected(bits);
  std::uint32_t random = 1;
  for (std::size_t i = 0; i < bits; ++i) {
    random = random * 1664525 + 1013904223;
    const auto tdi = static_cast<std::uint8_t>(random >> 31);
    expected[i] = static_cast<std::uint8_t>('0' + tdi);
    out[3 * i] = expected[i];
    out[3 * i + 1] = 'R';
    out[3 * i + 2] = static_cast<std::uint8_t>('4' + tdi);
  }
  const Bytes in = exchange(socket, out, bits);
  // Three bypass bits lie between.
  return in.size() == bits && std::equal(in.begin() + 3, in.end(), expected.begin());
}

}  // namespace

bool reportRoundTrip() {
  PartLibrary parts;
  const auto board = SimulatedBoard::makeDefault();
  BoardServer server(*board);
  if (!server.listen("127.0.0.1", "0")) return false;
  std::thread serving([&server] { static_cast<void>(server.run(true)); });
  bool right = true;
  double seconds = 0;
  {
    const BoardServer::Handle client = connectTo(server.address());
    exchange(client.number(), toBypass(), 0);
    seconds = fastest(rounds, [&] { right = right && goRound(client.number()); });
  }
  server.stop();
  serving.join();
  std::printf("1 MiB there and back over TCP, compared: %.3f s (bar %.2f)%s\n", seconds, bar,
              right ? "" : "   WRONG BITS");
  return right && seconds <= bar;
}
