#include "manager/simulator/SpiFlash.h"

#include <algorithm>

#include "manager/parts/Sfdp.h"

namespace {

/// What the master sees while the flash does not drive the line.
constexpr std::uint8_t pulledUp = 0xFF;
constexpr std::uint8_t protectBits = 0x1C;   ///< of status register 1
constexpr std::uint8_t computedBits = 0x03;  ///< WIP and WEL

constexpr std::size_t byMode = 255;  ///< three address bytes, or four in the 4-byte mode

}  // namespace

struct SpiFlash::Command {
  std::uint8_t code;
  std::size_t addressBytes;
  std::size_t dummyBytes;
  std::uint8_t (SpiFlash::*answer)() const;
  void (SpiFlash::*act)();
  bool writes;    ///< needs write enable, which it uses up
  bool anyTime;   ///< accepted while busy
  bool fourByte;  ///< only in parts with 4-byte addresses
};

/// The commands that the flash knows; a part without 4-byte addresses lacks theirs.
struct SpiCommands {
  using F = SpiFlash;
  static constexpr SpiFlash::Command all[] = {
      {0x9F, 0, 0, &F::readId, nullptr, false, false, false},
      {0x5A, 3, 1, &F::readSfdp, nullptr, false, false, false},
      {0xAB, 3, 0, &F::readSignature, &F::wake, false, false, false},
      {0xB9, 0, 0, nullptr, &F::sleep, false, false, false},
      {0x06, 0, 0, nullptr, &F::enableWrites, false, false, false},
      {0x04, 0, 0, nullptr, &F::disableWrites, false, false, false},
      {0x05, 0, 0, &F::readStatus1, nullptr, false, true, false},
      {0x35, 0, 0, &F::readStatus2, nullptr, false, true, false},
      {0x15, 0, 0, &F::readStatus3, nullptr, false, true, false},
      {0x01, 0, 0, nullptr, &F::writeStatus1, true, false, false},
      {0x31, 0, 0, nullptr, &F::writeStatus2, true, false, false},
      {0x11, 0, 0, nullptr, &F::writeStatus3, true, false, false},
      {0x03, byMode, 0, &F::readArray, nullptr, false, false, false},
      {0x0B, byMode, 1, &F::readArray, nullptr, false, false, false},
      {0x13, 4, 0, &F::readArray, nullptr, false, false, true},
      {0x0C, 4, 1, &F::readArray, nullptr, false, false, true},
      {0x02, byMode, 0, nullptr, &F::programPage, true, false, false},
      {0x12, 4, 0, nullptr, &F::programPage, true, false, true},
      {0x20, byMode, 0, nullptr, &F::erase4k, true, false, false},
      {0x21, 4, 0, nullptr, &F::erase4k, true, false, true},
      {0x52, byMode, 0, nullptr, &F::erase32k, true, false, false},
      {0x5C, 4, 0, nullptr, &F::erase32k, true, false, true},
      {0xD8, byMode, 0, nullptr, &F::eraseSector, true, false, false},
      {0xDC, 4, 0, nullptr, &F::eraseSector, true, false, true},
      {0xC7, 0, 0, nullptr, &F::eraseChip, true, false, false},
      {0x60, 0, 0, nullptr, &F::eraseChip, true, false, false},
      {0xB7, 0, 0, nullptr, &F::enterFourByte, false, false, true},
      {0xE9, 0, 0, nullptr, &F::leaveFourByte, false, false, true},
      {0x66, 0, 0, nullptr, &F::enableReset, false, true, false},
      {0x99, 0, 0, nullptr, &F::reset, false, true, false},
  };
};

SpiFlash::SpiFlash(const SpiFlashPart& part, const Times& times, const BoardClock& clock, bool endless)
    : part_(part),
      times_(times),
      clock_(clock),
      endless_(endless),
      memory_(part.size, 0xFF),
      sfdp_(Sfdp::build(part)),
      page_(part.pageSize, 0xFF) {}

void SpiFlash::beBusy(double seconds) {
  started_ = true;
  busyUntil_ = clock_.now() + seconds;
}

void SpiFlash::select() {
  command_ = nullptr;
  first_ = true;
}

std::uint8_t SpiFlash::answer() const {
  if (command_ == nullptr || ahead_ > 0 || command_->answer == nullptr) return pulledUp;
  return (this->*command_->answer)();
}

void SpiFlash::receive(std::uint8_t byte) {
  if (first_) return start(byte);
  if (command_ == nullptr) return;
  if (ahead_ > 0) {
    if (addressLeft_ > 0) {
      address_ = address_ << 8 | byte;
      --addressLeft_;
    }
    --ahead_;
    return;
  }
  if (command_->writes) page_[static_cast<std::size_t>((address_ + received_) % page_.size())] = byte;
  ++received_;
}

void SpiFlash::deselect(bool wholeByte) {
  const Command* command = command_;
  select();
  if (command == nullptr || command->act == nullptr || !wholeByte) return;
  // Waking needs no address bytes: they are only there for the answer that follows them.
  if (ahead_ > 0 && command->act != &SpiFlash::wake) return;
  if (!command->writes) return (this->*command->act)();
  if (!writeEnabled_) return;
  (this->*command->act)();
  writeEnabled_ = false;
}

void SpiFlash::start(std::uint8_t code) {
  first_ = false;
  command_ = find(code);
  const bool resets = command_ != nullptr && command_->act == &SpiFlash::reset && resetEnabled_;
  if (command_ != nullptr && command_->act == &SpiFlash::reset && !resets) command_ = nullptr;
  resetEnabled_ = false;
  if (command_ == nullptr) return;
  addressLeft_ = command_->addressBytes == byMode ? (fourByte_ ? 4 : 3) : command_->addressBytes;
  ahead_ = addressLeft_ + command_->dummyBytes;
  address_ = 0;
  received_ = 0;
  if (command_->writes) std::fill(page_.begin(), page_.end(), std::uint8_t{0xFF});
}

const SpiFlash::Command* SpiFlash::find(std::uint8_t code) const {
  const auto* found = std::find_if(std::begin(SpiCommands::all), std::end(SpiCommands::all),
                                   [code](const Command& command) { return command.code == code; });
  if (found == std::end(SpiCommands::all)) return nullptr;
  if (found->fourByte && !part_.fourByteAddress) return nullptr;
  if (asleep_ && found->act != &SpiFlash::wake) return nullptr;
  return busy() && !found->anyTime ? nullptr : found;
}

std::uint8_t SpiFlash::statusByte() const {
  return static_cast<std::uint8_t>((status_[0] & ~computedBits) | int{busy()} | int{writeEnabled_} << 1);
}

bool SpiFlash::isProtected() const { return (status_[0] & protectBits) != 0; }

std::uint8_t SpiFlash::readArray() const { return memory_[readPlace()]; }

std::uint8_t SpiFlash::readId() const { return static_cast<std::uint8_t>(part_.jedecId >> (16 - 8 * (received_ % 3))); }

std::uint8_t SpiFlash::readSfdp() const {
  const std::uint64_t place = address_ + received_;
  return place < sfdp_.size() ? sfdp_[static_cast<std::size_t>(place)] : pulledUp;
}

void SpiFlash::writeStatus1() {
  if (received_ > 2) return;
  writeStatus(0, 0);
  if (received_ == 2) writeStatus(1, 1);
}

void SpiFlash::writeStatus(std::size_t reg, std::size_t byte) {
  if (received_ <= byte) return;
  // WIP and WEL are no stored bits.
  status_[reg] = reg == 0 ? static_cast<std::uint8_t>(page_[byte] & ~computedBits) : page_[byte];
  beBusy(times_.status);
}

void SpiFlash::programPage() {
  if (received_ == 0 || isProtected()) return;
  const std::size_t page = page_.size();
  const std::size_t first = static_cast<std::size_t>(address_ % memory_.size()) / page * page;
  for (std::size_t i = 0; i < page && first + i < memory_.size(); ++i) memory_[first + i] &= page_[i];
  beBusy(times_.program);
}

void SpiFlash::eraseBlock(std::size_t size, double time) {
  if (isProtected()) return;
  const std::size_t first = static_cast<std::size_t>(address_ % memory_.size()) / size * size;
  const std::size_t end = std::min(first + size, memory_.size());
  std::fill(memory_.begin() + static_cast<std::ptrdiff_t>(first), memory_.begin() + static_cast<std::ptrdiff_t>(end),
            std::uint8_t{0xFF});
  beBusy(time);
}

void SpiFlash::eraseChip() {
  if (isProtected()) return;
  std::fill(memory_.begin(), memory_.end(), std::uint8_t{0xFF});
  beBusy(times_.eraseChip);
}

void SpiFlash::reset() {
  writeEnabled_ = false;
  fourByte_ = false;
  asleep_ = false;
  started_ = started_ && endless_;
}

void SpiFlash::visit(const std::string& prefix, StateVisitor& visitor) {
  visitor.visit(prefix + "spi", memory_);
  visitor.visit(prefix + "spi status", status_);
}
