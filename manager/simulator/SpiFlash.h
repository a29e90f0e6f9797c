#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "manager/parts/FlashParts.h"
#include "manager/simulator/BoardClock.h"
#include "manager/simulator/StateVisitor.h"

/// A SPI NOR flash, byte by byte: for each byte of a transaction, `answer` is what it sends meanwhile, and then
/// `receive` takes the byte. A command that writes is carried out when the transaction ends on a whole byte.
class SpiFlash {
 public:
  /// Seconds.
  struct Times {
    double program = 50e-6;  ///< a page
    double erase4k = 1e-3;
    double erase32k = 2e-3;
    double erase64k = 3e-3;
    double eraseChip = 50e-3;
    double status = 1e-3;
  };

  /// With `endless` a busy time that has begun never ends.
  SpiFlash(const SpiFlashPart& part, const Times& times, const BoardClock& clock, bool endless);

  void select();
  std::uint8_t answer() const;
  void receive(std::uint8_t byte);
  void deselect(bool wholeByte);

  std::vector<std::uint8_t>& memory() { return memory_; }
  const std::vector<std::uint8_t>& memory() const { return memory_; }
  void visit(const std::string& prefix, StateVisitor& visitor);

 private:
  friend struct SpiCommands;
  struct Command;

  bool busy() const { return started_ && (endless_ || clock_.now() < busyUntil_); }
  void beBusy(double seconds);
  const Command* find(std::uint8_t code) const;
  void start(std::uint8_t code);
  std::uint8_t statusByte() const;
  std::size_t readPlace() const { return static_cast<std::size_t>((address_ + received_) % memory_.size()); }
  bool isProtected() const;

  // What commands answer, and what they do at the end.
  std::uint8_t readArray() const;
  std::uint8_t readId() const;
  std::uint8_t readSfdp() const;
  std::uint8_t readStatus1() const { return statusByte(); }
  std::uint8_t readStatus2() const { return status_[1]; }
  std::uint8_t readStatus3() const { return status_[2]; }
  std::uint8_t readSignature() const { return static_cast<std::uint8_t>((part_.jedecId & 0xFFU) - 1); }
  void enableWrites() { writeEnabled_ = true; }
  void disableWrites() { writeEnabled_ = false; }
  void writeStatus1();
  void writeStatus2() { writeStatus(1, 0); }
  void writeStatus3() { writeStatus(2, 0); }
  void writeStatus(std::size_t reg, std::size_t byte);
  void programPage();
  void erase4k() { eraseBlock(4096, times_.erase4k); }
  void erase32k() { eraseBlock(32768, times_.erase32k); }
  /// The part's sector, 64 KiB in most parts.
  void eraseSector() { eraseBlock(part_.eraseCommand == 0xD8 ? part_.sectorSize : 65536, times_.erase64k); }
  void eraseBlock(std::size_t size, double time);
  void eraseChip();
  void enterFourByte() { fourByte_ = true; }
  void leaveFourByte() { fourByte_ = false; }
  void enableReset() { resetEnabled_ = true; }
  void reset();
  void sleep() { asleep_ = true; }
  void wake() { asleep_ = false; }

  const SpiFlashPart& part_;
  Times times_;
  const BoardClock& clock_;
  bool endless_;
  std::vector<std::uint8_t> memory_;
  std::vector<std::uint8_t> sfdp_;
  std::vector<std::uint8_t> status_ = {0, 0, 0};  ///< the stored bits of the status registers
  bool writeEnabled_ = false;
  bool fourByte_ = false;
  bool asleep_ = false;
  bool resetEnabled_ = false;
  bool started_ = false;
  double busyUntil_ = 0;

  const Command* command_ = nullptr;
  bool first_ = true;      ///< the next byte is the command
  std::size_t ahead_ = 0;  ///< address and dummy bytes still to come
  std::size_t addressLeft_ = 0;
  std::uint64_t address_ = 0;
  std::uint64_t received_ = 0;      ///< data bytes so far
  std::vector<std::uint8_t> page_;  ///< the last data bytes, by their place in the page
};
