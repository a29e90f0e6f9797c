#pragma once

#include <cstdint>
#include <span>
#include <vector>

#include "manager/simulator/BitbangPattern.h"
#include "manager/simulator/SimulatedBoard.h"

/// The board's side of the remote-bitbang protocol, for one client: bytes in, answers out. TMS and TDI are sampled
/// at the rise of TCK; TDO changes at its fall, so that clients may ask for it before or after the rise. Bytes that
/// mean nothing are passed over.
class BitbangDecoder {
 public:
  /// The client finds TCK low.
  explicit BitbangDecoder(SimulatedBoard& board);

  /// Carries out the bytes and appends the answers. Does nothing after the end.
  void feed(std::span<const std::uint8_t> bytes, std::vector<std::uint8_t>& answers);
  /// The client said that it quits.
  bool ended() const { return ended_; }

 private:
  void step(std::uint8_t byte, std::vector<std::uint8_t>& answers);
  void drivePins(unsigned levels);
  /// Carries out the regular runs that the bytes begin with. Gives the number of bytes done.
  std::size_t run(std::span<const std::uint8_t> bytes, std::vector<std::uint8_t>& answers);
  void clock(bool tms, bool reads, std::vector<std::uint8_t>& answers);

  SimulatedBoard& board_;
  bool tck_ = false;
  bool tdo_;  ///< as it was at the last fall of TCK
  bool ended_ = false;
  BitVector tdi_;
  BitVector answered_;
};
