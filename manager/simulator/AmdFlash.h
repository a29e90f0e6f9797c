#pragma once

#include "manager/simulator/BpiFlash.h"

/// The AMD command set: commands behind unlock cycles, status by toggling bits.
class AmdFlash : public BpiFlash {
 public:
  AmdFlash(const BpiFlashPart& part, const Times& times, const BoardClock& clock, bool endless)
      : BpiFlash(part, times, clock, endless) {}

  std::uint16_t read(std::uint32_t address) override;
  void write(std::uint32_t address, std::uint16_t data) override;
  void reset() override { state_ = State::array; }

 private:
  /// What the next write cycle means, and for the first four what a read gives.
  enum class State {
    array,
    id,
    query,
    aborted,
    unlock1,
    unlock2,
    program,
    erase1,
    erase2,
    erase3,
    count,
    fill,
    confirm
  };

  static bool isCommandAddress(std::uint32_t address, std::uint32_t wanted) { return (address & 0xFFFU) == wanted; }
  std::uint16_t status();
  void begin(std::uint32_t address, std::uint16_t data);
  void command(std::uint32_t address, std::uint16_t data);
  void program(std::uint32_t address, std::uint16_t data);
  void erase(std::uint32_t address, std::uint16_t data);
  void count(std::uint32_t address, std::uint16_t data);
  void fill(std::uint32_t address, std::uint16_t data);
  void confirm(std::uint32_t address, std::uint16_t data);

  State state_ = State::array;
  std::uint32_t bufferPending_ = 0;  ///< words that the first one's address is still awaited for
  std::uint32_t sector_ = 0;         ///< that the buffer is for
  bool toggle_ = false;
  std::uint16_t lastData_ = 0;  ///< whose bit 7 shows inverted while busy
};
