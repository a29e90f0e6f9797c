#include <gtest/gtest.h>

#include <random>

#include "manager/simulator/BitbangDecoder.h"
#include "tests/unit/manager/simulator/Jtag.h"

namespace {

using Bytes = std::vector<std::uint8_t>;

constexpr const char* chain = R"({"chain": [{"part": "marlin3-1"}, {"part": "zp18v01"}, {"part": "mullet-32"}]})";

Bytes bytesOf(const std::string& text) { return {text.begin(), text.end()}; }

enum class Order { noRead, readBeforeRise, readAfterRise };

/// The bytes of clocks with these levels.
Bytes clocks(const BitVector& tms, const BitVector& tdi, Order order) {
  Bytes bytes;
  for (std::size_t i = 0; i < tms.size(); ++i) {
    const auto low = static_cast<std::uint8_t>('0' + (tms.get(i) ? 2 : 0) + (tdi.get(i) ? 1 : 0));
    bytes.push_back(low);
    if (order == Order::readBeforeRise) bytes.push_back('R');
    bytes.push_back(static_cast<std::uint8_t>(low + 4));
    if (order == Order::readAfterRise) bytes.push_back('R');
  }
  return bytes;
}

/// The protocol a byte at a time, as plainly as it is described: the reference.
class PlainDecoder {
 public:
  explicit PlainDecoder(SimulatedBoard& board) : board_(board), tdo_(board.tdo()) {}
  void feed(const Bytes& bytes, Bytes& answers) {
    for (const std::uint8_t byte : bytes) {
      if (ended_) return;
      if (byte >= '0' && byte <= '7') {
        const int pins = byte - '0';
        if ((pins & 4) != 0 && !tck_) board_.clockLevels((pins & 2) != 0 ? 1 : 0, (pins & 1) != 0 ? 1 : 0, 1);
        if ((pins & 4) == 0 && tck_) tdo_ = board_.tdo();
        tck_ = (pins & 4) != 0;
      }
      if (byte == 'R') answers.push_back(tdo_ ? '1' : '0');
      if (byte >= 'r' && byte <= 'u') board_.driveResets(byte >= 't', (byte - 'r') % 2 == 1);
      ended_ = byte == 'Q';
    }
  }

 private:
  SimulatedBoard& board_;
  bool tck_ = false;
  bool tdo_;
  bool ended_ = false;
};

/// Bytes of a client: mostly regular runs, with irregular bytes in between.
Bytes randomSession(std::mt19937& random) {
  Bytes bytes;
  for (int part = 0; part < 60; ++part) {
    if (random() % 4 == 0) {
      const std::string any = "01234567RRBbrstux\n";
      for (std::size_t i = random() % 12; i > 0; --i)
        bytes.push_back(static_cast<std::uint8_t>(any[random() % any.size()]));
      bytes.push_back('r');
      continue;
    }
    const std::size_t length = random() % 3 == 0 ? 1 + random() % 300 : 1 + random() % 4;
    const Bytes run =
        clocks(BitVector(length, random() % 2 == 0), randomBits(length, random()), static_cast<Order>(random() % 3));
    bytes.insert(bytes.end(), run.begin(), run.end());
  }
  return bytes;
}

class BitbangDecoderTest : public testing::TestWithParam<unsigned> {};

}  // namespace

TEST_P(BitbangDecoderTest, AnswersAsAPlainDecoderDoes) {
  std::mt19937 random(GetParam());
  TestBoard fast(chain);
  TestBoard plain(chain);
  BitbangDecoder decoder(*fast.board);
  PlainDecoder reference(*plain.board);
  for (int round = 0; round < 20; ++round) {
    const Bytes bytes = randomSession(random);
    Bytes expected;
    reference.feed(bytes, expected);
    Bytes answers;
    // A client's bytes arrive in pieces of any size.
    for (std::size_t place = 0; place < bytes.size();) {
      const std::size_t count = std::min<std::size_t>(1 + random() % 500, bytes.size() - place);
      decoder.feed(std::span(bytes).subspan(place, count), answers);
      place += count;
    }
    ASSERT_EQ(std::string(answers.begin(), answers.end()), std::string(expected.begin(), expected.end()));
    ASSERT_EQ(fast.board->state(), plain.board->state());
  }
}

INSTANTIATE_TEST_SUITE_P(Seeds, BitbangDecoderTest, testing::Range(1U, 31U));

TEST(BitbangDecoder, BothOrdersReadTheIdcodes) {
  for (const Order order : {Order::readBeforeRise, Order::readAfterRise}) {
    TestBoard test(chain);
    BitbangDecoder decoder(*test.board);
    Bytes answers;
    const BitVector path = *BitVector::fromBinary(
        "0010"
        "11111");  // reset, then to Shift-DR
    decoder.feed(clocks(path, BitVector(path.size()), Order::noRead), answers);
    EXPECT_TRUE(answers.empty());
    ASSERT_EQ(test.board->state(), TapState::drShift);
    decoder.feed(clocks(BitVector(96), BitVector(96, true), order), answers);
    ASSERT_EQ(answers.size(), 96U);
    const std::vector<PartPointer> parts = findParts(test.parts, {"mullet-32", "zp18v01", "marlin3-1"});
    for (std::size_t i = 0; i < parts.size(); ++i) {
      BitVector idcode;
      for (std::size_t bit = 0; bit < 32; ++bit) idcode.append(answers[i * 32 + bit] == '1');
      EXPECT_TRUE(parts[i]->matchesIdcode(idcode)) << parts[i]->name << " " << idcode.hex();
    }
  }
}

TEST(BitbangDecoder, TdoStaysUntilTheFall) {
  TestBoard test(chain);
  BitbangDecoder decoder(*test.board);
  Bytes answers;
  decoder.feed(bytesOf("262626262604"
                       "2604"
                       "04"
                       "0"),
               answers);
  ASSERT_EQ(test.board->state(), TapState::drShift);
  // The first bit of an IDCODE is 1, the second of these parts' is 0: the rise does not change what is read.
  decoder.feed(bytesOf("RR4RR0RR"), answers);
  EXPECT_EQ(std::string(answers.begin(), answers.end()), "111100");
}

TEST(BitbangDecoder, ResetLinesResetTheTaps) {
  for (const char* line : {"t", "s", "u"}) {
    TestBoard test(chain);
    BitbangDecoder decoder(*test.board);
    Bytes answers;
    decoder.feed(bytesOf("0404260404"), answers);
    EXPECT_EQ(test.board->state(), TapState::drShift);
    decoder.feed(bytesOf(line), answers);
    EXPECT_EQ(test.board->state(), TapState::reset) << line;
    decoder.feed(bytesOf("0404"), answers);
    EXPECT_EQ(test.board->state(), TapState::reset) << line;
    decoder.feed(bytesOf("r04"), answers);
    EXPECT_EQ(test.board->state(), TapState::idle) << line;
  }
}

TEST(BitbangDecoder, EndsAtQuit) {
  TestBoard test(chain);
  BitbangDecoder decoder(*test.board);
  Bytes answers;
  decoder.feed(bytesOf("RBbQRRR"), answers);
  EXPECT_EQ(answers.size(), 1U);
  EXPECT_TRUE(decoder.ended());
}

TEST(BitbangPattern, TakesOnlyWhatFitsItsPattern) {
  const BitVector tdi = randomBits(100, 4);
  for (const Order order : {Order::noRead, Order::readBeforeRise, Order::readAfterRise}) {
    for (const bool tms : {false, true}) {
      Bytes bytes = clocks(BitVector(100, tms), tdi, order);
      const std::size_t bytesOfClock = order == Order::noRead ? 2 : 3;
      const BitbangPattern* pattern = BitbangPattern::find(bytes);
      ASSERT_NE(pattern, nullptr);
      BitVector got;
      EXPECT_EQ(pattern->gather(bytes, tms, got), 96 * bytesOfClock);
      EXPECT_EQ(got, tdi.slice(0, 96));
      for (std::size_t damaged = 0; damaged < bytes.size(); ++damaged) {
        Bytes other = bytes;
        other[damaged] = 'x';
        got.clear();
        const std::size_t whole = std::min<std::size_t>(damaged / bytesOfClock / 8 * 8, 96);
        ASSERT_EQ(pattern->gather(other, tms, got), whole * bytesOfClock) << damaged;
        ASSERT_EQ(got, tdi.slice(0, whole)) << damaged;
      }
      got.clear();
      EXPECT_EQ(pattern->gather(bytes, !tms, got), 0U);
    }
  }
}
