#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <chrono>
#include <thread>

#include "manager/simulator/BoardServer.h"
#include "tests/unit/manager/simulator/Jtag.h"

namespace {

using Handle = BoardServer::Handle;
using std::chrono::steady_clock;

Handle connectTo(const std::string& address) {
  Handle socket(::socket(AF_INET, SOCK_STREAM, 0));
  sockaddr_in server{};
  server.sin_family = AF_INET;
  server.sin_port = htons(static_cast<std::uint16_t>(std::stoi(address.substr(address.rfind(':') + 1))));
  server.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  const int connected = ::connect(socket.number(), reinterpret_cast<const sockaddr*>(&server), sizeof server);
  EXPECT_EQ(connected, 0);
  const timeval patience = {.tv_sec = 20, .tv_usec = 0};
  ::setsockopt(socket.number(), SOL_SOCKET, SO_RCVTIMEO, &patience, sizeof patience);
  return socket;
}

void send(const Handle& socket, const std::string& bytes) {
  std::size_t sent = 0;
  while (sent < bytes.size()) {
    const ssize_t count = ::send(socket.number(), bytes.data() + sent, bytes.size() - sent, MSG_NOSIGNAL);
    if (count <= 0) return;
    sent += static_cast<std::size_t>(count);
  }
}

/// As many bytes, or fewer when the server closes or is silent for long.
std::string receive(const Handle& socket, std::size_t count) {
  std::string bytes(count, '\0');
  std::size_t got = 0;
  while (got < count) {
    const ssize_t read = ::recv(socket.number(), bytes.data() + got, count - got, 0);
    if (read <= 0) break;
    got += static_cast<std::size_t>(read);
  }
  bytes.resize(got);
  return bytes;
}

bool isClosed(const Handle& socket) {
  char byte = 0;
  return ::recv(socket.number(), &byte, 1, 0) == 0 || errno == ECONNRESET;
}

std::string repeat(const std::string& text, std::size_t count) {
  std::string all;
  for (std::size_t i = 0; i < count; ++i) all += text;
  return all;
}

/// To Shift-DR from anywhere: the IDCODEs come out then.
const std::string toIdcodes =
    "2626262626042604"
    "04";

/// A board that a thread serves.
class Served {
 public:
  explicit Served(const std::string& faults = "{}", bool once = false)
      : test_(R"({"chain": [{"part": "marlin3-1"}, {"part": "zp18v01"}], "faults": )" + faults + "}"),
        server_(*test_.board) {
    const Status listening = server_.listen("127.0.0.1", "0");
    EXPECT_TRUE(listening.ok());
    thread_ = std::thread([this, once] { EXPECT_TRUE(server_.run(once).ok()); });
  }
  ~Served() {
    server_.stop();
    if (thread_.joinable()) thread_.join();
  }
  Served(const Served&) = delete;
  Served& operator=(const Served&) = delete;

  Handle connect() { return connectTo(server_.address()); }
  void join() { thread_.join(); }
  TestBoard& test() { return test_; }
  const std::string& address() const { return server_.address(); }

 private:
  TestBoard test_;
  BoardServer server_;
  std::thread thread_;
};

}  // namespace

TEST(BoardServer, TellsItsAddress) {
  Served served;
  EXPECT_TRUE(served.address().starts_with("127.0.0.1:"));
  EXPECT_NE(served.address(), "127.0.0.1:0");
}

TEST(BoardServer, ServesBothClientOrders) {
  Served served;
  for (const std::string clock : {"0R4", "04R"}) {
    const Handle client = served.connect();
    send(client, toIdcodes + repeat(clock, 64));
    const std::string answers = receive(client, 64);
    ASSERT_EQ(answers.size(), 64U);
    for (std::size_t device = 0; device < 2; ++device) {
      BitVector idcode;
      for (std::size_t i = 0; i < 32; ++i) idcode.append(answers[device * 32 + i] == '1');
      const char* name = device == 0 ? "zp18v01" : "marlin3-1";
      EXPECT_TRUE((*served.test().parts.find(name))->matchesIdcode(idcode)) << clock << " " << idcode.hex();
    }
  }
}

TEST(BoardServer, GoesOnReadingWhileAnswersQueue) {
  Served served;
  const Handle client = served.connect();
  // Far more than any socket buffers: a server that waited for its answers to be fetched would wait for ever.
  constexpr std::size_t count = 24 << 20;
  send(client, repeat("R", count));
  const std::string answers = receive(client, count);
  EXPECT_EQ(answers.size(), count);
  EXPECT_EQ(answers.find('0'), std::string::npos) << "TDO is pulled up outside the shift states";
}

TEST(BoardServer, EndsAtQuitAndGivesTheLastAnswers) {
  Served served("{}", true);
  const Handle client = served.connect();
  send(client, "RRRQRR");
  EXPECT_EQ(receive(client, 6), "111");
  EXPECT_TRUE(isClosed(client));
  served.join();
}

TEST(BoardServer, AClientThatSendsNoMoreGetsItsAnswers) {
  Served served("{}", true);
  const Handle client = served.connect();
  send(client, repeat("04R", 1000));
  ::shutdown(client.number(), SHUT_WR);
  EXPECT_EQ(receive(client, 2000).size(), 1000U);
  served.join();
}

TEST(BoardServer, AClientThatVanishesLeavesTheServerToTheNext) {
  Served served;
  for (int i = 0; i < 3; ++i) {
    const Handle client = served.connect();
    send(client, repeat("R", 100000));
  }
  std::string answer;
  // The one before may be there still when this one comes; it is refused then and has to come again.
  for (int tries = 0; tries < 100 && answer.empty(); ++tries) {
    const Handle again = served.connect();
    send(again, "R");
    answer = receive(again, 1);
  }
  EXPECT_EQ(answer, "1");
}

TEST(BoardServer, RefusesASecondClientMeanwhile) {
  Served served;
  const Handle first = served.connect();
  send(first, "R");
  ASSERT_EQ(receive(first, 1), "1");
  const Handle second = served.connect();
  EXPECT_TRUE(isClosed(second));
  send(first, "R");
  EXPECT_EQ(receive(first, 1), "1");
}

TEST(BoardServer, ALinkDropsAfterItsBytes) {
  Served served(R"({"dropAfter": 10})");
  for (int i = 0; i < 2; ++i) {
    const Handle client = served.connect();
    send(client, repeat("R", 20));
    EXPECT_EQ(receive(client, 20).size(), 10U);
    EXPECT_TRUE(isClosed(client));
  }
}

TEST(BoardServer, StopsWhileAClientIsThere) {
  auto served = std::make_unique<Served>();
  const Handle client = served->connect();
  send(client, "R");
  ASSERT_EQ(receive(client, 1), "1");
  served.reset();
  EXPECT_TRUE(isClosed(client));
}

TEST(BoardServer, RealTimePassesOnTheBoard) {
  Served served;
  const Handle client = served.connect();
  // ISC_ENABLE with its code and ISC_ERASE with its in the device next to TDO, then its status.
  const auto ir = [](const std::string& opcode) {  // bits as they are shifted
    std::string bytes =
        "2626"
        "0404";
    const std::string bits = opcode + "11111111";
    for (std::size_t i = 0; i < bits.size(); ++i) {
      const int level = (bits[i] - '0') + (i + 1 == bits.size() ? 2 : 0);
      bytes += static_cast<char>('0' + level);
      bytes += static_cast<char>('4' + level);
    }
    return bytes +
           "26"
           "04";
  };
  const auto dr = [](std::string bits, const std::string& clock) {
    std::string bytes =
        "26"
        "0404";
    bits += "0";
    for (std::size_t i = 0; i < bits.size(); ++i) {
      const int level = (bits[i] - '0') + (i + 1 == bits.size() ? 2 : 0);
      bytes += static_cast<char>('0' + level);
      if (clock == "read") bytes += 'R';
      bytes += static_cast<char>('4' + level);
    }
    return bytes +
           "26"
           "04";
  };
  send(client, "262626262604" + ir("11100001") + dr("00001011", "") + ir("11000010") + dr("10100101", ""));
  const auto status = [&] {
    send(client, ir("10011100") + dr("00000000", "read"));
    return receive(client, 9);
  };
  const steady_clock::time_point start = steady_clock::now();
  std::string answer = status();
  EXPECT_EQ(answer.substr(0, 8), "10010000") << "busy and enabled";
  while (answer.substr(0, 1) == "1" && steady_clock::now() - start < std::chrono::seconds(20)) answer = status();
  EXPECT_EQ(answer.substr(0, 8), "00010000");
  EXPECT_GT(steady_clock::now() - start, std::chrono::milliseconds(20));
}

TEST(BoardServer, ServesASocketThatIsConnectedAlready) {
  TestBoard test(R"({"chain": [{"part": "mullet-32"}]})");
  BoardServer server(*test.board);
  int ends[2];
  ASSERT_EQ(::socketpair(AF_UNIX, SOCK_STREAM, 0, ends), 0);
  const Handle client(ends[0]);
  send(client, toIdcodes + "0RQ");
  server.serve(Handle(ends[1]));
  EXPECT_EQ(receive(client, 10), "1");
}

TEST(BoardServer, APortInUseIsAFailureThatNamesIt) {
  Served served;
  TestBoard test(R"({"chain": []})");
  BoardServer server(*test.board);
  const std::string port = served.address().substr(served.address().rfind(':') + 1);
  const Status listening = server.listen("127.0.0.1", port);
  ASSERT_FALSE(listening.ok());
  EXPECT_EQ(listening.failure().text, "can't listen on 127.0.0.1:" + port + ": Address already in use");
  for (const char* bad : {"none", "65536", "-1", "80x", ""}) {
    const Status refused = server.listen("127.0.0.1", bad);
    ASSERT_FALSE(refused.ok()) << bad;
    EXPECT_EQ(refused.failure().text,
              std::string("can't listen on 127.0.0.1:") + bad + ": a port is a number up to 65535");
  }
}
