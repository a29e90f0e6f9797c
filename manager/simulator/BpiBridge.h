#pragma once

#include "manager/simulator/BpiFlash.h"
#include "manager/simulator/DataRegister.h"

/// The data register behind which a parallel flash stands, 64 bits: 0-31 word address, 32-47 data, 48 write strobe,
/// 49 read strobe, 51 stream. The bus cycle happens at Update-DR. Capture loads the data of the last read into bits
/// 32-47, and bit 50, ready. After an update with bit 51 the next scan, of any length, gives the words from the
/// address on, 16 bits each, lowest first.
class BpiBridge : public DataRegister {
 public:
  /// `flash` is null when none is attached: the data lines are pulled up then.
  BpiBridge(BpiFlash* flash, BoardClock& clock);

  void capture() override;
  void shift(const BitVector& in, BitVector& out) override;
  bool next() const override;
  void update() override;

 private:
  std::uint16_t read(std::uint32_t address) {
    return flash_ == nullptr ? std::uint16_t{0xFFFF} : flash_->read(address);
  }
  void cycle(std::uint64_t bits);

  BpiFlash* flash_;
  BoardClock& clock_;
  ShiftRegister register_;
  std::uint32_t address_ = 0;
  std::uint16_t data_ = 0;
  bool streamNext_ = false;
  bool streaming_ = false;
  std::uint16_t word_ = 0;  ///< the rest of the word that is streamed, next bit lowest
  std::size_t wordBits_ = 0;
};
