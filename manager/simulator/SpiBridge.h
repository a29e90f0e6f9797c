#pragma once

#include "manager/simulator/DataRegister.h"
#include "manager/simulator/SpiFlash.h"

/// The data register behind which a SPI flash stands: leading zeros, a one, 32 bits with the number of SPI bits
/// minus one, then that many bits with chip select low; all with the highest bit first. The flash's answer to a bit
/// comes out one clock later; all other bits that come out are zeros.
class SpiBridge : public DataRegister {
 public:
  /// `flash` is null when none is attached: the line is pulled up then.
  SpiBridge(SpiFlash* flash, BoardClock& clock) : flash_(flash), clock_(clock) {}

  void capture() override;
  void shift(const BitVector& in, BitVector& out) override;
  bool next() const override { return pending_; }
  void update() override { deselect(); }

 private:
  enum class Phase { search, length, transfer, done };

  void shiftBits(const BitVector& in, BitVector& out);
  std::size_t search(const BitVector& in, std::size_t place);
  void takeLengthBit(bool bit);
  /// Whole bytes from `place` on; gives the place behind them. The clock goes on with the bits.
  std::size_t transferBytes(const BitVector& in, std::size_t place, BitVector& out);
  bool transferBit(bool bit);
  void deselect();

  SpiFlash* flash_;
  BoardClock& clock_;
  Phase phase_ = Phase::search;
  bool pending_ = false;
  int lengthBits_ = 0;
  std::uint64_t left_ = 0;  ///< SPI bits still to come
  int bitOfByte_ = 0;
  std::uint8_t received_ = 0;
  std::uint8_t answer_ = 0;
};
