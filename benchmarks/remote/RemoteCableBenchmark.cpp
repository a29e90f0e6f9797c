// How fast the client of remote-bitbang servers is: the work of the client alone, against a server that costs next
// to nothing, and, with a server's address as argument, against that server and its chain.
//
//   tessel-benchmark-remote [HOST:PORT]

#include <arpa/inet.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "manager/cables/RemoteCable.h"
#include "manager/scan/ChainScan.h"

namespace {

constexpr std::size_t scanBits = std::size_t{1} << 23;  // 1 MiB
constexpr int rounds = 5;

BitVector pattern() {
  BitVector result(scanBits);
  BitVector::Word state = 0x2545F4914F6CDD1D;
  for (BitVector::Word& word : result.words()) {
    state ^= state << 13;
    state ^= state >> 7;
    state ^= state << 17;
    word = state;
  }
  return result;
}

[[noreturn]] void giveUp(const std::string& why) {
  std::fprintf(stderr, "%s\n", why.c_str());
  std::exit(1);
}

/// Takes everything at once, and answers each third byte as the chain of a single wire would: no TDI is looked at.
class NullChannel : public ByteChannel {
 public:
  Result<std::size_t> send(std::span<const char> bytes) override {
    missing_ += static_cast<std::size_t>(std::count(bytes.begin(), bytes.end(), 'R'));
    return bytes.size();
  }
  Result<std::size_t> receive(std::span<char> bytes) override {
    const std::size_t count = std::min(missing_, bytes.size());
    std::fill_n(bytes.begin(), count, '0');
    missing_ -= count;
    return count;
  }
  Result<bool> wait(bool, bool, double) override { return true; }

 private:
  std::size_t missing_ = 0;
};

/// The best of some rounds, in seconds.
double best(const std::function<Status()>& round) {
  double result = 1e9;
  for (int i = 0; i < rounds; ++i) {
    const auto start = std::chrono::steady_clock::now();
    const Status status = round();
    const double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    if (!status) giveUp(status.failure().text);
    result = std::min(result, seconds);
  }
  return result;
}

void print(const char* what, std::size_t bits, double seconds) {
  std::printf("%-48s %8.2f ms  %7.1f MTCK/s\n", what, seconds * 1e3, static_cast<double>(bits) / seconds / 1e6);
}

/// Reads, and answers each sample with TDI delayed by a clock, until the client is gone.
void echo(int client) {
  constexpr std::size_t pieceSize = std::size_t{256} * 1024;
  std::vector<char> piece(pieceSize);
  std::vector<char> answers(pieceSize + 1);
  char tdo = '0';
  while (true) {
    const ssize_t count = ::recv(client, piece.data(), piece.size(), 0);
    if (count <= 0) return;
    std::size_t given = 0;
    for (const char* byte = piece.data(); byte < piece.data() + count; ++byte) {
      answers[given] = tdo;
      given += *byte == 'R' ? 1 : 0;
      tdo = (*byte & 4) != 0 ? static_cast<char>('0' + (*byte & 1)) : tdo;
    }
    for (std::size_t sent = 0; sent < given;) {
      const ssize_t part = ::send(client, answers.data() + sent, given - sent, MSG_NOSIGNAL);
      if (part <= 0) return;
      sent += static_cast<std::size_t>(part);
    }
  }
}

/// A process that echoes for one client; gives its address.
std::string forkEchoServer() {
  const int listener = ::socket(AF_INET, SOCK_STREAM, 0);
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  auto* plain = reinterpret_cast<sockaddr*>(&address);
  socklen_t size = sizeof address;
  if (listener < 0 || ::bind(listener, plain, size) != 0 || ::listen(listener, 1) != 0 ||
      ::getsockname(listener, plain, &size) != 0)
    giveUp("no server can be made");
  if (::fork() == 0) {
    const int client = ::accept(listener, nullptr, nullptr);
    const int on = 1;
    ::setsockopt(client, IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
    echo(client);
    ::_exit(0);
  }
  ::close(listener);
  return "127.0.0.1:" + std::to_string(ntohs(address.sin_port));
}

std::unique_ptr<RemoteCable> connected(const std::string& server) {
  Result<std::unique_ptr<RemoteCable>> cable = RemoteCable::connect(server);
  if (!cable) giveUp(cable.failure().text);
  return std::move(*cable);
}

/// A scan written, read and compared; `delay` bits of zero come out before the first bit that went in.
void measure(Cable& cable, const std::string& name, std::optional<std::size_t> delay) {
  const BitVector out = pattern();
  print((name + ": write 1 MiB").c_str(), scanBits, best([&]() -> Status {
          TESSEL_TRY(cable.drScan({.out = out}));
          return cable.flush();
        }));
  BitVector in;
  print((name + ": read 1 MiB").c_str(), scanBits, best([&] { return cable.drScan({.out = out, .in = &in}); }));
  BitVector expected(delay.value_or(scanBits));
  expected.append(out, 0, scanBits - expected.size());
  print((name + ": compare 1 MiB").c_str(), scanBits,
        best([&] { return cable.drScan({.out = out, .expected = &expected}); }));
  const std::size_t small = 1000;
  const double seconds = best([&]() -> Status {
    for (std::size_t i = 0; i < small; ++i) TESSEL_TRY(cable.drScan({.out = BitVector(32), .in = &in}));
    return {};
  });
  std::printf("%-48s %8.2f us\n", (name + ": a read of 32 bits").c_str(), seconds / small * 1e6);
}

}  // namespace

int main(int argc, char** argv) {
  if (argc > 1) {
    const auto cable = connected(argv[1]);
    const Result<ChainScan::Found> found = ChainScan::find(*cable);
    if (!found) giveUp(found.failure().text);
    const BitVector bypass(found->totalIrLength, true);
    if (const Status loaded = cable->irScan({.out = bypass}); !loaded) giveUp(loaded.failure().text);
    measure(*cable, argv[1], found->idcodes.size());
    return 0;
  }
  {
    RemoteCable cable(std::make_unique<NullChannel>(), "nobody", {});
    measure(cable, "client alone", std::nullopt);
  }
  measure(*connected(forkEchoServer()), "echo server", 1);
  ::wait(nullptr);
  return 0;
}
