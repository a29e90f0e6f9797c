#include <gtest/gtest.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <chrono>

#include "manager/cables/Socket.h"

namespace {

std::string parsed(std::string_view text) {
  const Result<ServerAddress> address = ServerAddress::parse(text, 3335);
  return address ? address->text() : address.failure().text;
}

TEST(ServerAddress, TakesHostsAddressesAndPaths) {
  EXPECT_EQ(parsed("localhost"), "localhost:3335");
  EXPECT_EQ(parsed("board.lab:1"), "board.lab:1");
  EXPECT_EQ(parsed("10.0.0.7:65535"), "10.0.0.7:65535");
  EXPECT_EQ(parsed("[::1]"), "[::1]:3335");
  EXPECT_EQ(parsed("[fe80::2]:99"), "[fe80::2]:99");
  EXPECT_EQ(parsed("::1"), "[::1]:3335");
  EXPECT_EQ(parsed("unix:/run/board:1"), "unix:/run/board:1");
}

TEST(ServerAddress, RefusesTheRest) {
  for (const char* text : {"", ":", ":3335", "host:", "host:0", "host:65536", "host:-1", "host:+1", "host:12x",
                           "host: 12", "[::1", "[]", "[]:12", "[::1]12", "[::1]:", "[::1]x:12", "unix:"}) {
    EXPECT_EQ(parsed(text), "the server \"" + std::string(text) +
                                "\" is not HOST, HOST:PORT with a port from 1 to 65535, [ADDRESS]:PORT or unix:PATH");
  }
}

TEST(Socket, AHostWithoutAddressIsALinkFailure) {
  const auto channel = Socket::connect({.host = "no such host", .port = 1, .path = ""}, 1);
  ASSERT_FALSE(channel);
  EXPECT_EQ(channel.failure().kind, Failure::Kind::link);
  EXPECT_FALSE(channel.failure().text.empty());
}

/// A channel, and the other end of it.
class SocketPair : public testing::Test {
 protected:
  void SetUp() override {
    std::array<int, 2> ends{};
    ASSERT_EQ(::socketpair(AF_UNIX, SOCK_STREAM, 0, ends.data()), 0);
    channel = Socket::over(ends[0]);
    peer = ends[1];
  }
  void TearDown() override { closePeer(); }
  void closePeer() {
    if (peer >= 0) ::close(peer);
    peer = -1;
  }

  std::unique_ptr<ByteChannel> channel;
  int peer = -1;
  std::array<char, 100> bytes{};
};

TEST_F(SocketPair, ReceivesWhatIsThereAndDoesNotWait) {
  EXPECT_EQ(*channel->receive(bytes), 0U);
  EXPECT_FALSE(*channel->wait(true, false, 0.02));
  EXPECT_TRUE(*channel->wait(true, true, 0.02));
  ASSERT_EQ(::write(peer, "abc", 3), 3);
  EXPECT_TRUE(*channel->wait(true, false, 1));
  EXPECT_EQ(*channel->receive(bytes), 3U);
  EXPECT_EQ(std::string(bytes.data(), 3), "abc");
}

TEST_F(SocketPair, SendsWhatFitsAndDoesNotWait) {
  std::size_t total = 0;
  while (const std::size_t count = *channel->send(bytes)) total += count;
  EXPECT_GT(total, 1000U);
  const auto start = std::chrono::steady_clock::now();
  EXPECT_FALSE(*channel->wait(false, true, 0.05));
  EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(50));
}

TEST_F(SocketPair, APeerThatIsGoneIsAFailureAndNoSignal) {
  closePeer();
  const auto sent = channel->send(bytes);
  ASSERT_FALSE(sent);
  EXPECT_EQ(sent.failure().text, "Broken pipe");
  EXPECT_EQ(sent.failure().kind, Failure::Kind::link);
  const auto received = channel->receive(bytes);
  ASSERT_FALSE(received);
  EXPECT_EQ(received.failure().text, "end of stream");
  EXPECT_EQ(received.failure().kind, Failure::Kind::link);
}

}  // namespace
