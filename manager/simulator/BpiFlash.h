#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "manager/parts/FlashParts.h"
#include "manager/simulator/BoardClock.h"
#include "manager/simulator/StateVisitor.h"

/// A parallel NOR flash with 16-bit words. Addresses are those of words, numbers of sectors count from 0; the first
/// byte of the memory is the low half of the first word. Programming only clears bits.
class BpiFlash {
 public:
  /// Seconds.
  struct Times {
    double program = 10e-6;  ///< a word
    double buffer = 100e-6;  ///< the write buffer
    double eraseSector = 5e-3;
    double eraseChip = 50e-3;
  };

  /// The flash with the command set of its part. With `endless` a busy time that has begun never ends.
  static std::unique_ptr<BpiFlash> make(const BpiFlashPart& part, const Times& times, const BoardClock& clock,
                                        bool endless);
  virtual ~BpiFlash() = default;
  BpiFlash(const BpiFlash&) = delete;
  BpiFlash& operator=(const BpiFlash&) = delete;

  virtual std::uint16_t read(std::uint32_t address) = 0;
  virtual void write(std::uint32_t address, std::uint16_t data) = 0;
  /// As the reset pin does.
  virtual void reset() = 0;

  std::vector<std::uint8_t>& memory() { return memory_; }
  const std::vector<std::uint8_t>& memory() const { return memory_; }
  void visit(const std::string& prefix, StateVisitor& visitor) { visitor.visit(prefix + "bpi", memory_); }

 protected:
  BpiFlash(const BpiFlashPart& part, const Times& times, const BoardClock& clock, bool endless);

  bool busy() const { return started_ && (endless_ || clock_.now() < busyUntil_); }
  void beBusy(double seconds);
  std::uint16_t word(std::uint32_t address) const;
  void programWord(std::uint32_t address, std::uint16_t data);
  void eraseSector(std::uint32_t address);
  void eraseChip();
  /// A word of the table that tells tools what the flash is (CFI); 0 beyond it.
  std::uint16_t query(std::uint32_t address) const { return address < query_.size() ? query_[address] : 0; }
  std::uint32_t sectorOf(std::uint32_t address) const { return address % words_ / sectorWords_; }
  std::uint32_t bufferWords() const { return part_.bufferSize / 2; }

  // The write buffer, which both command sets fill word by word within one of its pages.
  void startBuffer(std::uint32_t address, std::uint32_t words);
  /// False when the word lies outside the page.
  bool fillBuffer(std::uint32_t address, std::uint16_t data);
  void writeBuffer();
  std::uint32_t bufferLeft() const { return bufferLeft_; }

  const BpiFlashPart& part_;
  Times times_;

 private:
  void fillQuery();

  const BoardClock& clock_;
  bool endless_;
  bool started_ = false;
  double busyUntil_ = 0;
  std::uint32_t words_;
  std::uint32_t sectorWords_;
  std::vector<std::uint8_t> memory_;
  std::vector<std::uint16_t> query_;
  std::uint32_t bufferPage_ = 0;
  std::uint32_t bufferLeft_ = 0;
  std::vector<std::uint16_t> buffer_;
};
