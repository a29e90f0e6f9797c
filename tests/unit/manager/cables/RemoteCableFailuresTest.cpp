// Servers that are not there, go away, fall silent or talk nonsense.

#include <unistd.h>

#include <array>
#include <atomic>
#include <thread>

#include "tests/unit/manager/cables/RemoteCableTest.h"

namespace {

TEST(RemoteCableFailures, NobodyListens) {
  const std::string address = addressOfNobody();
  const auto cable = RemoteCable::connect(address, quick);
  ASSERT_FALSE(cable);
  EXPECT_EQ(cable.failure().text, "the server " + address + " does not answer: Connection refused");
  EXPECT_EQ(cable.failure().kind, Failure::Kind::link);
}

TEST(RemoteCableFailures, NoSuchPath) {
  const auto cable = RemoteCable::connect("unix:/nowhere/socket", quick);
  ASSERT_FALSE(cable);
  EXPECT_EQ(cable.failure().text, "the server unix:/nowhere/socket does not answer: No such file or directory");
  const auto longPath = RemoteCable::connect("unix:/" + std::string(200, 'x'), quick);
  ASSERT_FALSE(longPath);
  EXPECT_TRUE(longPath.failure().text.ends_with("File name too long")) << longPath.failure().text;
}

TEST(RemoteCableFailures, ASilentServerIsGivenUp) {
  TestServer server([](int socket) { TestServer::readAll(socket); });
  const Stopwatch watch;
  const auto cable = RemoteCable::connect(server.address(), quick);
  ASSERT_FALSE(cable);
  EXPECT_EQ(cable.failure().text,
            "the server " + server.address() + " does not answer: nothing came for 0.5 seconds, 1 answers are missing");
  EXPECT_EQ(cable.failure().kind, Failure::Kind::link);
  EXPECT_GE(watch.seconds(), 0.5);
  EXPECT_LT(watch.seconds(), 5);
}

TEST(RemoteCableFailures, AServerThatGetsStuckIsGivenUpOnceForAll) {
  TestServer server([](int socket) { TestServer::answer(socket, "0010"); });
  const auto cable = connected(server, quick);
  ASSERT_NE(cable, nullptr);
  BitVector in;
  const Status status = cable->drScan({.out = BitVector(100), .in = &in});
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "the server " + server.address() +
                                       " does not answer: nothing came for 0.5 seconds, 97 answers are missing");
  const Stopwatch watch;
  const std::vector<Status> later = {cable->drScan({.out = BitVector(5)}),
                                     cable->irScan({.out = BitVector(5), .in = &in}),
                                     cable->goTo(TapState::reset),
                                     run(*cable, 10, 1),
                                     run(*cable, 0, 0),
                                     cable->goTo(TapState::idle),
                                     cable->flush(),
                                     cable->limitTck(5),
                                     cable->driveResets(true, true),
                                     cable->clock(BitVector(3), BitVector(3), &in)};
  for (const Status& each : later) {
    ASSERT_FALSE(each);
    EXPECT_EQ(each.failure().text, status.failure().text);
    EXPECT_EQ(each.failure().kind, Failure::Kind::link);
  }
  EXPECT_LT(watch.seconds(), 0.4);
}

TEST(RemoteCableFailures, AServerThatTakesNothingIsGivenUp) {
  std::atomic<bool> over = false;
  TestServer server([&](int socket) {
    TestServer::write(socket, "0");
    while (!over) std::this_thread::sleep_for(std::chrono::milliseconds(5));
    static_cast<void>(socket);
  });
  const auto cable = connected(server, quick);
  ASSERT_NE(cable, nullptr);
  Status status;
  for (int i = 0; i < 200 && status; ++i) status = cable->drScan({.out = BitVector(1000000)});
  over = true;
  ASSERT_FALSE(status);
  EXPECT_NE(status.failure().text.find("does not answer: nothing came for 0.5 seconds, "), std::string::npos)
      << status.failure().text;
}

TEST(RemoteCableFailures, AServerThatOnlyListensIsFoundOutWhileItIsWrittenTo) {
  TestServer server([](int socket) { TestServer::answer(socket, "0"); });
  const auto cable = connected(server, quick);
  ASSERT_NE(cable, nullptr);
  const Status status = run(*cable, 20000000, 0);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "the server " + server.address() +
                                       " does not answer: nothing came for 0.5 seconds, 65 answers are missing");
}

TEST(RemoteCableFailures, ADroppedConnectionIsToldWithItsPlace) {
  for (const std::size_t answers : {1U, 2U, 50U, 64U, 1000U, 4999U, 5000U}) {
    TestServer server([&](int socket) { TestServer::dropAfter(socket, answers); });
    const auto cable = connected(server);
    ASSERT_NE(cable, nullptr);
    BitVector in;
    const Status status = cable->drScan({.out = BitVector(5000), .in = &in});
    ASSERT_FALSE(status);
    EXPECT_EQ(status.failure().text, "the server " + server.address() + " dropped the connection after " +
                                         std::to_string(answers) + " bytes of answers: end of stream");
    EXPECT_EQ(status.failure().kind, Failure::Kind::link);
    EXPECT_EQ(cable->flush().failure().text, status.failure().text);
  }
}

TEST(RemoteCableFailures, AConnectionDroppedWhileSendingEndsTheScan) {
  TestServer server([&](int socket) { TestServer::write(socket, "0"); });
  const auto cable = connected(server);
  ASSERT_NE(cable, nullptr);
  server.join();
  Status status;
  for (int i = 0; i < 100 && status; ++i) status = cable->drScan({.out = BitVector(1000000)});
  ASSERT_FALSE(status);
  EXPECT_TRUE(status.failure().text.starts_with("the server " + server.address() +
                                                " dropped the connection after 1 bytes of answers: "))
      << status.failure().text;
}

TEST(RemoteCableFailures, GarbageIsNamed) {
  struct Case {
    std::string answers;
    std::string text;
  };
  const std::vector<Case> cases = {
      {"0A", "answered the byte 0x41 where 0 or 1 was expected"},
      {"0" + std::string(63, '1') + "2" + std::string(135, '1'), "answered the byte 0x32 where 0 or 1 was expected"},
      {"0" + std::string(199, '1') + "\xFF", "answered the byte 0xFF where 0 or 1 was expected"},
      {"0" + std::string(200, '1') + "111", "answered 3 bytes more than it was asked for"},
  };
  for (const Case& each : cases) {
    TestServer server([&](int socket) {
      TestServer::write(socket, each.answers.substr(0, 1));
      // The client has asked for all when the last clock of the scan is there.
      std::array<char, 16384> piece{};
      for (std::size_t got = 0; got < 1 + 5 * 2 + 4 * 2 + 200 * 3;) {
        const ssize_t count = ::read(socket, piece.data(), piece.size());
        if (count <= 0) return;
        got += static_cast<std::size_t>(count);
      }
      TestServer::write(socket, each.answers.substr(1));
      TestServer::readAll(socket);
    });
    const auto cable = connected(server, quick);
    ASSERT_NE(cable, nullptr);
    BitVector in;
    const Status status = cable->drScan({.out = BitVector(200), .in = &in});
    ASSERT_FALSE(status) << each.text;
    EXPECT_EQ(status.failure().text, "the server " + server.address() + ' ' + each.text);
    EXPECT_EQ(status.failure().kind, Failure::Kind::link);
  }
}

TEST(RemoteCableFailures, AServerOfAnotherKindIsNoticedAtOnce) {
  TestServer server([](int socket) {
    TestServer::write(socket, "SSH-2.0\r\n");
    TestServer::readAll(socket);
  });
  const auto cable = RemoteCable::connect(server.address(), quick);
  ASSERT_FALSE(cable);
  EXPECT_TRUE(cable.failure().text.starts_with("the server " + server.address() + " answered "))
      << cable.failure().text;
}

}  // namespace
