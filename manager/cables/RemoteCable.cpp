#include "manager/cables/RemoteCable.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <thread>
#include <utility>

#include "manager/cables/BitbangText.h"
#include "manager/cables/Socket.h"

namespace {

constexpr std::size_t leastBuffer = 512;
constexpr std::size_t receiveBuffer = std::size_t{64} * 1024;
/// Room for the samples that are no clocks.
constexpr std::size_t spareBytes = 2;
/// So many bytes of text without a sample get one, so that a slow server is heard of in time.
constexpr std::size_t silenceBytes = std::size_t{16} * 1024;
/// More of those unanswered are waited for: a server that only listens is found out.
constexpr std::size_t mostUnanswered = 64;
/// Clocks under a limit go out for so long at once, in seconds.
constexpr double paceStep = 0.02;
/// What a sleep that took too long may catch up.
constexpr std::chrono::milliseconds paceSlack{2};
constexpr double longestSleep = 1e9;  // seconds

std::string shown(double seconds) {
  char text[32];
  std::snprintf(text, sizeof text, "%g", seconds);
  return text;
}

double secondsSince(std::chrono::steady_clock::time_point start) {
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

}  // namespace

Result<std::unique_ptr<RemoteCable>> RemoteCable::connect(const std::string& server, Limits limits) {
  const Result<ServerAddress> address = ServerAddress::parse(server, defaultPort);
  if (!address) return address.failure();
  Result<std::unique_ptr<ByteChannel>> channel = Socket::connect(*address, limits.connect);
  if (!channel)
    return Failure{.text = "the server " + address->text() + " does not answer: " + channel.failure().text,
                   .kind = Failure::Kind::link};
  auto cable = std::make_unique<RemoteCable>(std::move(*channel), address->text(), limits);
  cable->carriedOut_ = false;
  TESSEL_TRY(cable->barrier());
  return cable;
}

RemoteCable::RemoteCable(std::unique_ptr<ByteChannel> channel, std::string server, Limits limits)
    : channel_(std::move(channel)),
      server_(std::move(server)),
      limits_(limits),
      text_(std::max(limits.buffer, leastBuffer)),
      received_(receiveBuffer),
      paced_(Clock::now()) {}

RemoteCable::~RemoteCable() {
  if (!barrier()) return;
  const char quit = BitbangText::quit;
  // Nothing waits for this one any more.
  static_cast<void>(channel_->send({&quit, 1}));
}

Status RemoteCable::limitTck(std::uint32_t hertz) {
  TESSEL_TRY(transmit());
  tckLimit_ = hertz;
  paced_ = Clock::now();
  return {};
}

Status RemoteCable::driveResets(bool trst, bool srst) {
  TESSEL_TRY(link());
  const char byte = BitbangText::resets(trst, srst);
  if (byte != resets_) {
    const Result<std::size_t> space = room(false);
    if (!space) return space.failure();
    *end() = byte;
    wrote(end() + 1, 0, false);
    resets_ = byte;
  }
  const bool released = std::exchange(trst_, trst) && !trst;
  if (trst) setState(TapState::reset);
  // What was clocked while the line was asserted had no effect, or all of it when the line is not there.
  return released ? goTo(TapState::reset) : Status();
}

Result<std::size_t> RemoteCable::room(bool reads) {
  TESSEL_TRY(link());
  const std::size_t bytes = reads ? BitbangText::bytesPerReadClock : BitbangText::bytesPerClock;
  const double step = std::max(std::floor(tckLimit_ * paceStep), 1.0);
  const std::size_t most = tckLimit_ > 0 ? static_cast<std::size_t>(step) : text_.size();
  // A rest of less than a word is not worth it, and would take the words that follow apart.
  const bool full = text_.size() - used_ < spareBytes + BitVector::wordBits * BitbangText::bytesPerReadClock;
  if (full || clocks_ >= most) TESSEL_TRY(transmit());
  const std::size_t clocks = std::min((text_.size() - spareBytes - used_) / bytes, most - clocks_);
  return clocks > BitVector::wordBits ? clocks - clocks % BitVector::wordBits : clocks;
}

void RemoteCable::wrote(const char* newEnd, std::size_t clocks, bool reads) {
  const auto bytes = static_cast<std::size_t>(newEnd - end());
  used_ += bytes;
  clocks_ += clocks;
  sinceSample_ = reads ? 0 : sinceSample_ + bytes;
  if (reads) answers_.expect(clocks);
  carriedOut_ = false;
}

void RemoteCable::writeSample() {
  *end() = BitbangText::sample;
  ++used_;
  sinceSample_ = 0;
  answers_.expectSign();
}

template <class Write>
Status RemoteCable::reading(BitVector* tdo, const Write& write) {
  if (tdo == nullptr) return write();
  answers_.collect(tdo);
  Status status = write();
  if (status) status = exchange(true);
  answers_.collect(nullptr);
  return status;
}

Status RemoteCable::shift(const BitVector& tdi, bool lastTms, BitVector* tdo) {
  return reading(tdo, [&]() -> Status {
    const bool reads = tdo != nullptr;
    TESSEL_TRY(shiftData(tdi, tdi.size() - 1, reads));
    const Result<std::size_t> space = room(reads);
    if (!space) return space.failure();
    wrote(BitbangText::writeClock(end(), lastTms, tdi.get(tdi.size() - 1), reads), 1, reads);
    return {};
  });
}

Status RemoteCable::shiftData(const BitVector& tdi, std::size_t count, bool reads) {
  for (std::size_t place = 0; place < count;) {
    const Result<std::size_t> space = room(reads);
    if (!space) return space.failure();
    const std::size_t clocks = std::min(*space, count - place);
    char* to = end();
    for (const std::size_t last = place + clocks; place < last;) {
      const std::size_t bit = place % BitVector::wordBits;
      const std::size_t bits = std::min(BitVector::wordBits - bit, last - place);
      to = BitbangText::writeData(to, tdi.words()[place / BitVector::wordBits] >> bit, bits, reads);
      place += bits;
    }
    wrote(to, clocks, reads);
  }
  return {};
}

Status RemoteCable::clockTms(std::uint32_t tms, int count) {
  for (; count > 0; --count, tms >>= 1U) TESSEL_TRY(idleClocks((tms & 1U) != 0, 1));
  return {};
}

Status RemoteCable::idleClocks(bool tms, std::uint64_t count) {
  while (count > 0) {
    const Result<std::size_t> space = room(false);
    if (!space) return space.failure();
    const std::size_t clocks = std::min<std::uint64_t>(*space, count);
    char* to = end();
    for (std::size_t i = 0; i < clocks; ++i) to = BitbangText::writeClock(to, tms, false, false);
    wrote(to, clocks, false);
    count -= clocks;
  }
  return {};
}

Status RemoteCable::clockLevels(const BitVector& tms, const BitVector& tdi, BitVector* tdo) {
  return reading(tdo, [&]() -> Status {
    const bool reads = tdo != nullptr;
    for (std::size_t place = 0; place < tdi.size();) {
      const Result<std::size_t> space = room(reads);
      if (!space) return space.failure();
      const std::size_t clocks = std::min(*space, tdi.size() - place);
      char* to = end();
      for (std::size_t i = 0; i < clocks; ++i, ++place)
        to = BitbangText::writeClock(to, tms.get(place), tdi.get(place), reads);
      wrote(to, clocks, reads);
    }
    return {};
  });
}

Status RemoteCable::wait(double seconds) {
  TESSEL_TRY(barrier());
  std::this_thread::sleep_for(std::chrono::duration<double>(std::min(seconds, longestSleep)));
  return {};
}

Status RemoteCable::barrier() {
  TESSEL_TRY(link());
  if (carriedOut_) return {};
  writeSample();
  TESSEL_TRY(exchange(true));
  carriedOut_ = true;
  return {};
}

Status RemoteCable::transmit() {
  TESSEL_TRY(link());
  if (answers_.collecting()) return exchange(false);
  if (sinceSample_ >= silenceBytes) writeSample();
  return exchange(answers_.outstanding() > mostUnanswered);
}

void RemoteCable::pace() {
  if (tckLimit_ <= 0 || clocks_ == 0) return;
  const std::chrono::duration<double> needed(static_cast<double>(clocks_) / tckLimit_);
  paced_ = std::max(paced_, Clock::now() - paceSlack) + std::chrono::ceil<Clock::duration>(needed);
  std::this_thread::sleep_until(paced_);
}

Status RemoteCable::exchange(bool allAnswers) {
  pace();
  std::size_t sent = 0;
  Clock::time_point last = Clock::now();
  while (sent < used_ || (allAnswers && answers_.outstanding() > 0)) {
    const Result<bool> moved = progress(sent);
    if (!moved) return moved.failure();
    if (*moved) {
      last = Clock::now();
      continue;
    }
    const bool sending = sent < used_;
    const Result<bool> ready =
        channel_->wait(answers_.outstanding() > 0, sending, std::max(limits_.answer - secondsSince(last), 0.0));
    if (!ready) return lost(ready.failure().text);
    if (!*ready) return silent(sending);
  }
  used_ = 0;
  clocks_ = 0;
  return {};
}

Result<bool> RemoteCable::progress(std::size_t& sent) {
  bool moved = false;
  if (sent < used_) {
    const Result<std::size_t> count = channel_->send(std::span(text_).subspan(sent, used_ - sent));
    if (!count) return lost(count.failure().text).failure();
    sent += *count;
    moved = *count > 0;
  }
  if (answers_.outstanding() == 0) return moved;
  const Result<std::size_t> count = channel_->receive(received_);
  if (!count) return lost(count.failure().text).failure();
  if (const Status taken = answers_.take(std::span(received_).first(*count)); !taken) {
    failure_ = Failure{.text = "the server " + server_ + ' ' + taken.failure().text, .kind = Failure::Kind::link};
    return *failure_;
  }
  return moved || *count > 0;
}

Status RemoteCable::lost(const std::string& what) {
  failure_ = Failure{.text = "the server " + server_ + " dropped the connection after " +
                             std::to_string(answers_.received()) + " bytes of answers: " + what,
                     .kind = Failure::Kind::link};
  return *failure_;
}

Status RemoteCable::silent(bool sending) {
  const std::size_t missing = answers_.outstanding();
  const std::string what = sending && missing == 0 ? "it took no bytes for " : "nothing came for ";
  failure_ = Failure{.text = "the server " + server_ + " does not answer: " + what + shown(limits_.answer) +
                             " seconds" + (missing > 0 ? ", " + std::to_string(missing) + " answers are missing" : ""),
                     .kind = Failure::Kind::link};
  return *failure_;
}
