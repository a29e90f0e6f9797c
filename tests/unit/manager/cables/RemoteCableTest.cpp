#include "tests/unit/manager/cables/RemoteCableTest.h"

#include <unistd.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <random>

namespace {

std::vector<FakeTap> someTaps() {
  std::vector<FakeTap> taps{FakeTap(4, 0x10000001), FakeTap(6, std::nullopt), FakeTap(5, 0x20000003)};
  for (FakeTap& tap : taps)
    for (std::uint64_t opcode = 4; opcode < 12; ++opcode) tap.addRegister(opcode, 1 + opcode * opcode * 3);
  return taps;
}

TEST(RemoteCable, ReadsThroughTheServer) {
  FakeChain chain(someTaps());
  TestServer server([&](int socket) { TestServer::serve(socket, chain); });
  {
    const auto cable = connected(server);
    ASSERT_NE(cable, nullptr);
    EXPECT_EQ(cable->description(), "remote server " + server.address());
    BitVector in;
    ASSERT_TRUE(cable->goTo(TapState::reset));
    ASSERT_TRUE(cable->drScan({.out = BitVector(65), .in = &in}));
    EXPECT_EQ(in.slice(0, 32).hex(), "20000003");
    EXPECT_EQ(in.slice(33, 32).hex(), "10000001");
  }
  server.join();
  EXPECT_EQ(chain.state, TapState::idle);
}

/// Random calls go to two chains: by the network, and bit by bit.
class Pair {
 public:
  Pair(RemoteCable& remote, FakeCable& plain, std::uint32_t seed) : remote_(remote), plain_(plain), random_(seed) {}

  void step() {
    static constexpr std::array calls = {&Pair::scan, &Pair::scan, &Pair::scan, &Pair::run, &Pair::move, &Pair::clock};
    (this->*calls[upTo(calls.size() - 1)])();
  }

 private:
  std::size_t upTo(std::size_t most) { return std::uniform_int_distribution<std::size_t>(0, most)(random_); }
  std::size_t length() { return upTo(9) == 0 ? upTo(3000) : upTo(200); }
  BitVector bits(std::size_t count) {
    BitVector result(count);
    for (std::size_t i = 0; i < count; ++i) result.set(i, upTo(1) == 1);
    return result;
  }
  TapState stable() {
    constexpr std::array states = {TapState::idle,  TapState::idle,    TapState::idle,
                                   TapState::reset, TapState::drPause, TapState::irPause};
    return states[upTo(states.size() - 1)];
  }

  void scan() {
    const bool ir = upTo(2) == 0;
    const BitVector out = bits(length());
    const TapState end = stable();
    const auto call = ir ? &Cable::irScan : &Cable::drScan;
    if (upTo(2) == 0) {
      EXPECT_TRUE((remote_.*call)({.out = out, .end = end}));
      EXPECT_TRUE((plain_.*call)({.out = out, .end = end}));
      return;
    }
    BitVector found;
    BitVector foundPlain;
    const BitVector expected = bits(out.size());
    const bool compares = upTo(1) == 1;
    const Status remote = (remote_.*call)(
        {.out = out, .in = &found, .expected = compares ? &expected : nullptr, .mask = nullptr, .end = end});
    const Status plain = (plain_.*call)(
        {.out = out, .in = &foundPlain, .expected = compares ? &expected : nullptr, .mask = nullptr, .end = end});
    EXPECT_EQ(found, foundPlain);
    ASSERT_EQ(remote.ok(), plain.ok()) << remote.failure().text;
    if (!plain) {
      EXPECT_EQ(remote.failure().text, plain.failure().text);
    }
  }

  void run() {
    const std::uint64_t cycles = upTo(500);
    const TapState state = stable();
    EXPECT_TRUE(remote_.runTest(cycles, 0, state, TapState::idle));
    EXPECT_TRUE(plain_.runTest(cycles, 0, state, TapState::idle));
  }

  void move() {
    const TapState state = stable();
    EXPECT_TRUE(remote_.goTo(state));
    EXPECT_TRUE(plain_.goTo(state));
  }

  void clock() {
    const BitVector tms = bits(upTo(150));
    const BitVector tdi = bits(tms.size());
    BitVector found;
    BitVector foundPlain;
    const bool reads = upTo(1) == 1;
    EXPECT_TRUE(remote_.clock(tms, tdi, reads ? &found : nullptr));
    EXPECT_TRUE(plain_.clock(tms, tdi, reads ? &foundPlain : nullptr));
    EXPECT_EQ(found, foundPlain);
  }

  RemoteCable& remote_;
  FakeCable& plain_;
  std::mt19937 random_;
};

class RemoteCableRandom : public testing::TestWithParam<std::size_t> {};

TEST_P(RemoteCableRandom, DoesWhatABitLevelCableDoes) {
  FakeChain chain(someTaps());
  FakeChain twin(someTaps());
  TestServer server([&](int socket) { TestServer::serve(socket, chain); });
  {
    const auto remote = connected(server, {.buffer = GetParam()});
    ASSERT_NE(remote, nullptr);
    FakeCable plain(twin);
    Pair pair(*remote, plain, 77);
    for (int i = 0; i < 300 && !testing::Test::HasFailure(); ++i) pair.step();
  }
  server.join();
  EXPECT_EQ(chain.state, twin.state);
  EXPECT_EQ(chain.clocks, twin.clocks);
  EXPECT_EQ(chain.levels, twin.levels);
  for (std::size_t i = 0; i < chain.taps.size(); ++i) {
    EXPECT_EQ(chain.taps[i].instruction(), twin.taps[i].instruction());
    for (std::uint64_t opcode = 4; opcode < 12; ++opcode)
      EXPECT_EQ(chain.taps[i].stored(opcode), twin.taps[i].stored(opcode)) << i << ", " << opcode;
  }
}

INSTANTIATE_TEST_SUITE_P(Buffers, RemoteCableRandom, testing::Values(0, 513, 1000, 65536));

TEST(RemoteCable, ALongScanComesBackWhole) {
  FakeChain chain({FakeTap(4, std::nullopt), FakeTap(4, std::nullopt)});
  TestServer server([&](int socket) { TestServer::serve(socket, chain); });
  const auto cable = connected(server);
  ASSERT_NE(cable, nullptr);
  std::mt19937_64 random(5);
  BitVector out(1000003);
  for (BitVector::Word& word : out.words()) word = random();
  out.resize(1000001);
  BitVector expected(2);
  expected.append(out, 0, out.size() - 2);
  ASSERT_TRUE(cable->goTo(TapState::reset));
  const Status status = cable->drScan({.out = out, .expected = &expected});
  EXPECT_TRUE(status) << status.failure().text;
}

TEST(RemoteCable, SendsLowThenHighAndSamplesBetween) {
  std::string text;
  TestServer server([&](int socket) { text = TestServer::answer(socket, "010110"); });
  {
    const auto cable = connected(server);
    ASSERT_NE(cable, nullptr);
    BitVector tdo;
    ASSERT_TRUE(cable->goTo(TapState::reset));
    ASSERT_TRUE(cable->clock(*BitVector::fromBinary("0010"), *BitVector::fromBinary("0110"), &tdo));
    EXPECT_EQ(tdo.binary(), "1101");
    ASSERT_TRUE(cable->driveResets(false, true));
    ASSERT_TRUE(cable->driveResets(false, true));
    ASSERT_TRUE(cable->flush());
    ASSERT_TRUE(cable->flush());
  }
  server.join();
  EXPECT_EQ(text,
            "R"
            "2626262626"
            "0R43R71R50R4"
            "s"
            "RQ");
}

TEST(RemoteCable, TheResetLinesHaveALetterEach) {
  std::string text;
  TestServer server([&](int socket) { text = TestServer::answer(socket, "00"); });
  {
    const auto cable = connected(server);
    ASSERT_NE(cable, nullptr);
    ASSERT_TRUE(cable->driveResets(false, false));
    ASSERT_TRUE(cable->driveResets(false, true));
    ASSERT_TRUE(cable->driveResets(true, true));
    ASSERT_TRUE(cable->driveResets(true, false));
    ASSERT_TRUE(cable->driveResets(false, false));
  }
  server.join();
  EXPECT_EQ(text, "Rrsutr2626262626RQ");
}

TEST(RemoteCable, AUnixSocketWillDo) {
  FakeChain chain(someTaps());
  const std::string path = "/tmp/tessel-remote-" + std::to_string(::getpid());
  TestServer server([&](int socket) { TestServer::serve(socket, chain); }, path);
  const auto cable = connected(server);
  ASSERT_NE(cable, nullptr);
  EXPECT_EQ(cable->description(), "remote server unix:" + path);
  BitVector in;
  ASSERT_TRUE(cable->goTo(TapState::reset));
  ASSERT_TRUE(cable->drScan({.out = BitVector(32), .in = &in}));
  EXPECT_EQ(in.hex(), "20000003");
}

TEST(RemoteCable, ALimitOfTckIsKept) {
  FakeChain chain({FakeTap(4, std::nullopt)});
  TestServer server([&](int socket) { TestServer::serve(socket, chain); });
  const auto cable = connected(server);
  ASSERT_NE(cable, nullptr);
  ASSERT_TRUE(cable->goTo(TapState::idle));
  ASSERT_TRUE(cable->limitTck(100000));
  ASSERT_TRUE(cable->flush());
  const Stopwatch watch;
  ASSERT_TRUE(run(*cable, 10000, 0));
  ASSERT_TRUE(cable->flush());
  EXPECT_GE(watch.seconds(), 0.098);
  BitVector in;
  ASSERT_TRUE(cable->drScan({.out = BitVector(10000), .in = &in}));
  EXPECT_GE(watch.seconds(), 0.196);
  ASSERT_TRUE(cable->limitTck(0));
  const Stopwatch unlimited;
  ASSERT_TRUE(run(*cable, 200000, 0));
  ASSERT_TRUE(cable->flush());
  EXPECT_LT(unlimited.seconds(), 1.5);
}

TEST(RemoteCable, WaitingBeginsWhenEverythingIsCarriedOut) {
  std::atomic<std::size_t> heard = 0;
  TestServer server([&](int socket) {
    std::array<char, 4096> piece{};
    for (ssize_t count = 1; count > 0;) {
      count = ::read(socket, piece.data(), piece.size());
      const auto samples = std::count(piece.begin(), piece.begin() + std::max<ssize_t>(count, 0), 'R');
      heard += static_cast<std::size_t>(std::max<ssize_t>(count, 0));
      TestServer::write(socket, std::string(static_cast<std::size_t>(samples), '0'));
    }
  });
  const auto cable = connected(server);
  ASSERT_NE(cable, nullptr);
  const Stopwatch watch;
  ASSERT_TRUE(run(*cable, 1000, 0.05));
  EXPECT_GE(watch.seconds(), 0.05);
  EXPECT_EQ(heard, 1 + (5 + 1 + 1000) * 2 + 1U);
}

TEST(RemoteCable, ASlowReaderIsWaitedFor) {
  // The answers of one scan fill the buffers of both sides unless they are read while sending.
  FakeChain chain({FakeTap(4, std::nullopt)});
  TestServer server([&](int socket) {
    std::this_thread::sleep_for(std::chrono::milliseconds(100));
    TestServer::serve(socket, chain);
  });
  const auto cable = connected(server, {.connect = 1, .answer = 5});
  ASSERT_NE(cable, nullptr);
  BitVector out(700000, true);
  BitVector in;
  ASSERT_TRUE(cable->goTo(TapState::reset));
  ASSERT_TRUE(cable->drScan({.out = out, .in = &in}));
  EXPECT_EQ(in.count(), out.size() - 1);
}

}  // namespace
