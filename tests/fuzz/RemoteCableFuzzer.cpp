// The client of remote-bitbang servers against a server that does anything. Input: bytes that choose in turn what the
// user calls and what the server does; when they are used up, the server behaves.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <span>
#include <string>

#include "manager/cables/RemoteCable.h"
#include "tests/fuzz/Require.h"

namespace {

using fuzz::require;

class Choices {
 public:
  explicit Choices(std::span<const std::uint8_t> bytes) : bytes_(bytes) {}

  bool empty() const { return bytes_.empty(); }
  /// 0 when there are none left.
  std::uint8_t next() {
    if (bytes_.empty()) return 0;
    const std::uint8_t result = bytes_.front();
    bytes_ = bytes_.subspan(1);
    return result;
  }

 private:
  std::span<const std::uint8_t> bytes_;
};

/// What the server did to the client so far.
struct Deeds {
  bool broke = false;     ///< it dropped the connection or fell silent
  bool misspoke = false;  ///< it answered what it was not asked, or no bit
};

/// A server on a chain that gives TDI back a clock later.
class AnyServer : public ByteChannel {
 public:
  AnyServer(Choices& choices, Deeds& deeds) : choices_(choices), deeds_(deeds) {}

  Result<std::size_t> send(std::span<const char> bytes) override {
    if (deeds_.broke && !silent_) return gone();
    const std::size_t taken =
        choices_.empty() ? bytes.size() : std::min<std::size_t>(bytes.size(), choices_.next() * std::size_t{9});
    for (const char byte : bytes.first(taken)) take(byte);
    return taken;
  }

  Result<std::size_t> receive(std::span<char> bytes) override {
    if (silent_) return std::size_t{0};
    if (deeds_.broke) return gone();
    constexpr std::uint8_t firstDeed = 248;
    const std::uint8_t choice = choices_.empty() ? std::uint8_t{100} : choices_.next();
    if (choice >= firstDeed) return misbehave(bytes, choice);
    const std::size_t count = std::min({bytes.size(), answers_.size(), choice * std::size_t{50}});
    std::copy_n(answers_.begin(), count, bytes.begin());
    answers_.erase(answers_.begin(), answers_.begin() + static_cast<std::ptrdiff_t>(count));
    return count;
  }

  Result<bool> wait(bool forReceiving, bool forSending, double /*seconds*/) override {
    if (silent_) return false;
    if (deeds_.broke) return true;
    require(forSending || forReceiving, "the client waits for something");
    require(forSending || !answers_.empty() || deeds_.misspoke, "the client waits for answers that it asked for only");
    return forSending || !answers_.empty();
  }

 private:
  static Failure gone() { return {.text = "gone", .kind = Failure::Kind::link}; }

  void take(char byte) {
    if (byte == 'R') answers_.push_back(tdo_ ? '1' : '0');
    if (byte < '0' || byte > '7') return;
    const int value = byte - '0';
    const bool tck = (value & 4) != 0;
    require(tck != tck_ || !tck, "each rise of TCK has a fall before it");
    if (tck) tdo_ = (value & 1) != 0;
    tck_ = tck;
  }

  Result<std::size_t> misbehave(std::span<char> bytes, std::uint8_t choice) {
    if (choice < 251) {  // one byte that is no bit
      bytes[0] = static_cast<char>(choice - 248 + '2');
      deeds_.misspoke = true;
      return std::size_t{1};
    }
    if (choice < 253) {  // answers that nobody asked for
      deeds_.misspoke = true;
      std::fill(bytes.begin(), bytes.end(), '1');
      return bytes.size();
    }
    deeds_.broke = true;
    silent_ = choice == 255;
    return silent_ ? Result<std::size_t>(std::size_t{0}) : gone();
  }

  Choices& choices_;
  Deeds& deeds_;
  std::deque<char> answers_;
  bool tck_ = false;
  bool tdo_ = false;
  bool silent_ = false;
};

/// The user's calls. A failure must have a reason and stay.
class User {
 public:
  User(Cable& cable, Choices& choices, const Deeds& deeds) : cable_(cable), choices_(choices), deeds_(deeds) {}

  void call() {
    switch (choices_.next() % 8) {
      case 0:
        return check(cable_.goTo(TapState::reset));
      case 1:
        return check(cable_.runTest(choices_.next() * std::uint64_t{choices_.next()}, 0));
      case 2:
        return check(cable_.driveResets((choices_.next() & 1U) != 0, (choices_.next() & 1U) != 0));
      case 3:
        return check(cable_.flush());
      case 4:
        return clockByHand();
      default:
        return scan();
    }
  }

 private:
  void check(const Status& status) {
    if (failure_) {
      require(!status && status.failure().text == *failure_, "a failure stays the same");
      return;
    }
    if (status) return;
    require(status.failure().kind == Failure::Kind::link, "the failure is the link's");
    require(deeds_.broke || deeds_.misspoke, "the failure has a reason");
    require(status.failure().text.starts_with("the server fuzzed "), "the failure names the server");
    failure_ = status.failure().text;
  }

  BitVector bits() {
    const std::size_t size = choices_.next() * std::size_t{choices_.next()} / 3;
    BitVector result(size);
    BitVector::Word word = choices_.next() * 0x9E3779B97F4A7C15U;
    for (BitVector::Word& each : result.words()) each = word = word * 0x5851F42D4C957F2DU + 1;
    result.resize(size == 0 ? 0 : size - 1);
    return result;
  }

  /// TDI was low at the clock before.
  void compare(const BitVector& sent, const BitVector& found) {
    if (failure_ || deeds_.misspoke) return;
    BitVector expected;
    if (!sent.empty()) expected.append(false);
    if (!sent.empty()) expected.append(sent, 0, sent.size() - 1);
    require(found == expected, "TDI comes back a clock later");
  }

  void scan() {
    const BitVector out = bits();
    const std::uint8_t choice = choices_.next();
    const TapState end = (choice & 1U) != 0 ? TapState::drPause : TapState::idle;
    BitVector in;
    const bool reads = (choice & 2U) != 0;
    const Scan scan{.out = out, .in = reads ? &in : nullptr, .end = end};
    check((choice & 4U) != 0 ? cable_.irScan(scan) : cable_.drScan(scan));
    if (reads) compare(out, in);
  }

  void clockByHand() {
    check(cable_.runTest(1, 0));
    const BitVector tms = bits();
    BitVector found;
    check(cable_.clock(tms, tms, &found));
    compare(tms, found);
    check(cable_.runTest(1, 0));
  }

  Cable& cable_;
  Choices& choices_;
  const Deeds& deeds_;
  std::optional<std::string> failure_;
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Choices choices(std::span(data, size));
  Deeds deeds;
  const std::size_t buffer = choices.next() * std::size_t{64};
  RemoteCable cable(std::make_unique<AnyServer>(choices, deeds), "fuzzed", {.buffer = buffer});
  User user(cable, choices, deeds);
  while (!choices.empty()) user.call();
  return 0;
}
