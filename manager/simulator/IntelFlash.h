#pragma once

#include "manager/simulator/BpiFlash.h"

/// The Intel command set: single-cycle commands and a status register.
class IntelFlash : public BpiFlash {
 public:
  IntelFlash(const BpiFlashPart& part, const Times& times, const BoardClock& clock, bool endless)
      : BpiFlash(part, times, clock, endless), locked_(part.size / part.sectorSize, false) {}

  std::uint16_t read(std::uint32_t address) override;
  void write(std::uint32_t address, std::uint16_t data) override;
  void reset() override;

 private:
  enum class View { array, id, query, status };
  /// What the next write cycle means.
  enum class Await { command, eraseConfirm, programData, lockAction, count, fill, confirm };

  void command(std::uint32_t address, std::uint16_t data);
  void eraseConfirm(std::uint32_t address, std::uint16_t data);
  void programData(std::uint32_t address, std::uint16_t data);
  void lockAction(std::uint32_t address, std::uint16_t data);
  void count(std::uint32_t address, std::uint16_t data);
  void fill(std::uint32_t address, std::uint16_t data);
  void confirm(std::uint32_t address, std::uint16_t data);
  /// Whether the sector of the address may change; sets the bits of the status register when not.
  bool mayChange(std::uint32_t address, std::uint16_t problem);

  View view_ = View::array;
  Await await_ = Await::command;
  std::uint16_t problems_ = 0;  ///< the bits of the status register beside "ready"
  std::vector<bool> locked_;    ///< by sector
  std::uint32_t bufferPending_ = 0;
  std::uint32_t sector_ = 0;
};
