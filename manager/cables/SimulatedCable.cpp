#include "manager/cables/SimulatedCable.h"

#include <algorithm>

SimulatedCable::SimulatedCable(std::shared_ptr<SimulatedBoard> board) : board_(std::move(board)) {
  if (!board_->linkUp()) board_->reconnect();
}

Status SimulatedCable::link() const {
  if (!dropped_) return {};
  return Failure{"The link to the " + description() + " was dropped.", Failure::Kind::link};
}

Status SimulatedCable::pass(std::uint64_t clocks) {
  constexpr std::uint64_t clocksPerByte = 8;
  board_->countLinkBytes((clocks + clocksPerByte - 1) / clocksPerByte);
  dropped_ = dropped_ || !board_->linkUp();
  return link();
}

Status SimulatedCable::driveResets(bool trst, bool srst) {
  TESSEL_TRY(link());
  board_->driveResets(trst, srst);
  if (trst) setState(TapState::reset);
  return {};
}

std::string SimulatedCable::description() const { return "simulated board " + board_->name(); }

Status SimulatedCable::shift(const BitVector& tdi, bool lastTms, BitVector* tdo) {
  TESSEL_TRY(pass(tdi.size()));
  if (tdo != nullptr) tdo->clear();
  if (!lastTms) {
    board_->clock(false, tdi, tdo);
    return {};
  }
  const std::size_t last = tdi.size() - 1;
  if (last > 0) board_->clock(false, tdi.slice(0, last), tdo);
  board_->clock(true, tdi.slice(last, 1), tdo);
  return {};
}

Status SimulatedCable::clockTms(std::uint32_t tms, int count) {
  TESSEL_TRY(pass(static_cast<std::uint64_t>(count)));
  board_->clockLevels(tms, 0, count);
  return {};
}

Status SimulatedCable::idleClocks(bool tms, std::uint64_t count) {
  TESSEL_TRY(pass(count));
  board_->idleClocks(tms, count);
  return {};
}

Status SimulatedCable::clockLevels(const BitVector& tms, const BitVector& tdi, BitVector* tdo) {
  TESSEL_TRY(pass(tms.size()));
  if (tdo != nullptr) tdo->clear();
  for (std::size_t first = 0; first < tms.size(); first += BitVector::wordBits) {
    const std::size_t count = std::min(BitVector::wordBits, tms.size() - first);
    const std::uint64_t levels =
        board_->clockLevels(tms.number(first, count), tdi.number(first, count), static_cast<int>(count));
    if (tdo != nullptr) tdo->appendNumber(levels, count);
  }
  return {};
}

Status SimulatedCable::wait(double seconds) {
  TESSEL_TRY(link());
  board_->elapse(seconds);
  return {};
}
