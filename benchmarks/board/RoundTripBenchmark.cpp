// A mebibyte shifted through a chain and read back over a TCP connection within this machine, with a client that
// sends as it goes and compares what comes back. The bar is 0.15 s a round.

#include <arpa/inet.h>
#include <benchmark/benchmark.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>

#include <cstdlib>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "manager/parts/PartLibrary.h"
#include "manager/simulator/BoardServer.h"

namespace {

using Bytes = std::vector<std::uint8_t>;

constexpr std::size_t bits = std::size_t{8} << 20;
constexpr std::size_t pieceBytes = 256 * 1024;

BoardServer::Handle connectTo(const std::string& address) {
  BoardServer::Handle socket(::socket(AF_INET, SOCK_STREAM, 0));
  sockaddr_in server{};
  server.sin_family = AF_INET;
  server.sin_port = htons(static_cast<std::uint16_t>(std::atoi(address.substr(address.rfind(':') + 1).c_str())));
  server.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  if (::connect(socket.number(), reinterpret_cast<const sockaddr*>(&server), sizeof server) != 0)
    throw std::runtime_error("the board can't be reached");
  return socket;
}

/// Sends all and gets `count` answers, reading while it sends.
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
    if (read == 0) throw std::runtime_error("the board has gone");
    if (read > 0) got += static_cast<std::size_t>(read);
  }
  return in;
}

void roundTrip(benchmark::State& state) {
  PartLibrary parts;
  const auto board = SimulatedBoard::makeDefault(parts);
  BoardServer server(*board);
  if (!server.listen("127.0.0.1", "0")) throw std::runtime_error("no port is free");
  std::thread serving([&server] { static_cast<void>(server.run(true)); });
  {
    const BoardServer::Handle client = connectTo(server.address());
    const std::string start = "26262626260426260404" + [] {
      std::string ones;
      for (int i = 0; i < 23; ++i) ones += "15";
      return ones + "37";
    }() + "2626" + "0404";
    exchange(client.number(), Bytes(start.begin(), start.end()), 0);
    for (auto step : state) {
      Bytes out;
      out.reserve(bits * 3);
      std::uint32_t random = 1;
      Bytes expected(bits);
      for (std::size_t i = 0; i < bits; ++i) {
        random = random * 1664525 + 1013904223;
        const auto tdi = static_cast<std::uint8_t>(random >> 31);
        expected[i] = static_cast<std::uint8_t>('0' + tdi);
        out.push_back(static_cast<std::uint8_t>('0' + tdi));
        out.push_back('R');
        out.push_back(static_cast<std::uint8_t>('4' + tdi));
      }
      const Bytes in = exchange(client.number(), out, bits);
      // Three bypass bits lie between.
      if (!std::equal(in.begin() + 3, in.end(), expected.begin())) state.SkipWithError("other bits came back");
    }
  }
  serving.join();
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations()) * static_cast<std::int64_t>(bits / 8));
}

BENCHMARK(roundTrip)->Unit(benchmark::kMillisecond)->UseRealTime();

}  // namespace
