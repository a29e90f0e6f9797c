#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "manager/cables/BitbangAnswers.h"
#include "manager/cables/ByteChannel.h"
#include "manager/scan/BitCable.h"

/// The client of a remote-bitbang server. Clocks are gathered as text and sent in pieces; a scan that reads is sent
/// whole while its answers come in, so that the way to the server and back is waited for once a scan.
///
/// A server that is gone, is silent, or answers what is no answer is a failure of kind `link`, and all calls after
/// it fail alike.
class RemoteCable : public BitCable {
 public:
  struct Limits {
    double connect = 5;          ///< seconds
    double answer = 10;          ///< seconds without any progress
    std::size_t buffer = 65536;  ///< bytes of text gathered, at least 512
  };

  static constexpr std::uint16_t defaultPort = 3335;

  /// `server` is as ServerAddress has it. The server has answered once when this succeeds.
  static Result<std::unique_ptr<RemoteCable>> connect(const std::string& server, Limits limits);
  static Result<std::unique_ptr<RemoteCable>> connect(const std::string& server) { return connect(server, Limits()); }
  /// Over a channel that is there; `server` is its name in messages.
  RemoteCable(std::unique_ptr<ByteChannel> channel, std::string server, Limits limits);
  /// Sends what is left, waits until it is carried out, and takes leave.
  ~RemoteCable() override;
  RemoteCable(const RemoteCable&) = delete;
  RemoteCable& operator=(const RemoteCable&) = delete;

  Status flush() override { return barrier(); }
  Status limitTck(std::uint32_t hertz) override;
  Status driveResets(bool trst, bool srst) override;
  std::string description() const override { return "remote server " + server_; }

 protected:
  Status shift(const BitVector& tdi, bool lastTms, BitVector* tdo) override;
  Status clockTms(std::uint32_t tms, int count) override;
  Status idleClocks(bool tms, std::uint64_t count) override;
  Status clockLevels(const BitVector& tms, const BitVector& tdi, BitVector* tdo) override;
  Status wait(double seconds) override;
  Status link() const override { return failure_ ? Status(*failure_) : Status(); }

 private:
  using Clock = std::chrono::steady_clock;

  /// Room for clocks in the text, some at least: sends what is there when it is full. Whole words when it is large.
  Result<std::size_t> room(bool reads);
  /// To be written to, then ended by `wrote`.
  char* end() { return &text_[used_]; }
  void wrote(const char* newEnd, std::size_t clocks, bool reads);
  void writeSample();
  Status shiftData(const BitVector& tdi, std::size_t count, bool reads);
  /// Collects the answers of what `clocks` writes.
  template <class Write>
  Status reading(BitVector* tdo, const Write& write);

  /// Sends the text.
  Status transmit();
  /// Sends the text, and takes the answers that come meanwhile, or all that are missing.
  Status exchange(bool allAnswers);
  /// False when nothing could be sent and nothing came.
  Result<bool> progress(std::size_t& sent);
  /// Returns when the server has carried out everything.
  Status barrier();
  /// Holds the text back until its clocks are due.
  void pace();

  Status lost(const std::string& what);
  Status silent(bool sending);

  std::unique_ptr<ByteChannel> channel_;
  std::string server_;
  Limits limits_;
  std::vector<char> text_;
  std::vector<char> received_;
  std::size_t used_ = 0;         ///< bytes of `text_`
  std::size_t clocks_ = 0;       ///< in the text
  std::size_t sinceSample_ = 0;  ///< bytes of text since the last sample
  bool carriedOut_ = true;       ///< whether the server has answered after the last clock
  BitbangAnswers answers_;
  std::optional<Failure> failure_;
  double tckLimit_ = 0;      ///< Hz
  Clock::time_point paced_;  ///< when the clocks that were sent are over
  std::optional<char> resets_;
  bool trst_ = false;
};
