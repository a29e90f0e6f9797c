#include "manager/scan/BitCable.h"

#include "manager/scan/ScanData.h"

namespace {

constexpr std::uint32_t resetLevels = 0x1F;
constexpr int resetClocks = 5;

}  // namespace

Status BitCable::irScan(const Scan& scanToDo) { return scan(scanToDo, TapState::irShift); }

Status BitCable::drScan(const Scan& scanToDo) { return scan(scanToDo, TapState::drShift); }

Status BitCable::runTest(std::uint64_t cycles, double seconds, TapState state, TapState end) {
  TESSEL_TRY(link());
  if (!Tap::isStable(state))
    return Failure{.text = "the TAPs cannot stay in the state " + std::string(Tap::name(state))};
  TESSEL_TRY(moveTo(state));
  if (cycles > 0) TESSEL_TRY(idleClocks(state == TapState::reset, cycles));
  if (seconds > 0) TESSEL_TRY(wait(seconds));
  return moveTo(end);
}

Status BitCable::goTo(TapState state) {
  TESSEL_TRY(link());
  if (state == TapState::reset || !stateKnown_) TESSEL_TRY(resetTaps());
  return moveTo(state);
}

Status BitCable::clock(const BitVector& tms, const BitVector& tdi, BitVector* tdo) {
  TESSEL_TRY(link());
  if (tms.size() != tdi.size())
    return Failure{.text = std::to_string(tms.size()) + " levels of TMS do not go with " + std::to_string(tdi.size()) +
                           " levels of TDI"};
  if (!stateKnown_) TESSEL_TRY(resetTaps());
  if (tdo != nullptr) *tdo = BitVector(tdi.size());
  if (tms.empty()) return {};
  TESSEL_TRY(clockLevels(tms, tdi, tdo));
  for (std::size_t i = 0; i < tms.size(); ++i) state_ = Tap::next(state_, tms.get(i));
  return {};
}

Status BitCable::resetTaps() {
  TESSEL_TRY(clockTms(resetLevels, resetClocks));
  stateKnown_ = true;
  state_ = TapState::reset;
  return {};
}

Status BitCable::moveTo(TapState state) {
  if (!stateKnown_) TESSEL_TRY(resetTaps());
  if (state == state_) return {};
  if (state == TapState::reset) return resetTaps();
  const Tap::Path path = Tap::path(state_, state);
  TESSEL_TRY(clockTms(path.tms, path.length));
  state_ = state;
  return {};
}

Status BitCable::passCapture(TapState shiftState) {
  const bool instruction = shiftState == TapState::irShift;
  TESSEL_TRY(moveTo(instruction ? TapState::irCapture : TapState::drCapture));
  return moveTo(instruction ? TapState::irExit1 : TapState::drExit1);
}

Status BitCable::shiftBits(const Scan& scan, TapState shiftState, BitVector* found) {
  TESSEL_TRY(moveTo(shiftState));
  TESSEL_TRY(shift(scan.out, true, found));
  state_ = shiftState == TapState::irShift ? TapState::irExit1 : TapState::drExit1;
  return {};
}

Status BitCable::scan(const Scan& scan, TapState shiftState) {
  TESSEL_TRY(link());
  BitVector own;
  BitVector* found = scan.in;
  if (found == nullptr && scan.expected != nullptr) found = &own;
  if (found != nullptr) *found = BitVector(scan.out.size());

  TESSEL_TRY(scan.out.empty() ? passCapture(shiftState) : shiftBits(scan, shiftState, found));
  TESSEL_TRY(moveTo(scan.end));
  return scan.expected == nullptr ? Status() : ScanData::compare(*found, *scan.expected, scan.mask);
}
