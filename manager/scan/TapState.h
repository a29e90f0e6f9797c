#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

/// The sixteen states of a TAP controller (IEEE 1149.1).
enum class TapState : std::uint8_t {
  reset,
  idle,
  drSelect,
  drCapture,
  drShift,
  drExit1,
  drPause,
  drExit2,
  drUpdate,
  irSelect,
  irCapture,
  irShift,
  irExit1,
  irPause,
  irExit2,
  irUpdate,
};

namespace Tap {

/// The TMS levels that lead from one state to another; bit 0 comes first.
struct Path {
  std::uint32_t tms = 0;
  int length = 0;
};

/// The state after one rise of TCK.
TapState next(TapState state, bool tms);
/// The shortest path; of length 0 from a state to itself.
Path path(TapState from, TapState to);
/// Whether a TAP can stay there: reset, idle, drPause, irPause (drShift and irShift do not count).
bool isStable(TapState state);
/// The names of the vector formats: RESET, IDLE, DRSELECT, ... IRUPDATE.
std::string_view name(TapState state);
std::optional<TapState> fromName(std::string_view name);

}  // namespace Tap
