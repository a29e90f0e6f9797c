#include "manager/scan/TapState.h"

#include <array>
#include <cstddef>
#include <utility>

namespace {

using enum TapState;
constexpr std::size_t states = 16;

constexpr std::size_t index(TapState state) { return static_cast<std::size_t>(state); }

struct Row {
  std::string_view name;
  std::array<TapState, 2> next;  ///< by TMS
};

/// By state.
constexpr std::array<Row, states> rows = {{
    {"RESET", {idle, reset}},
    {"IDLE", {idle, drSelect}},
    {"DRSELECT", {drCapture, irSelect}},
    {"DRCAPTURE", {drShift, drExit1}},
    {"DRSHIFT", {drShift, drExit1}},
    {"DREXIT1", {drPause, drUpdate}},
    {"DRPAUSE", {drPause, drExit2}},
    {"DREXIT2", {drShift, drUpdate}},
    {"DRUPDATE", {idle, drSelect}},
    {"IRSELECT", {irCapture, reset}},
    {"IRCAPTURE", {irShift, irExit1}},
    {"IRSHIFT", {irShift, irExit1}},
    {"IREXIT1", {irPause, irUpdate}},
    {"IRPAUSE", {irPause, irExit2}},
    {"IREXIT2", {irShift, irUpdate}},
    {"IRUPDATE", {idle, drSelect}},
}};

using Paths = std::array<std::array<Tap::Path, states>, states>;

/// From one state to all others, nearest first.
constexpr std::array<Tap::Path, states> pathsFrom(TapState from) {
  std::array<Tap::Path, states> paths{};
  std::array<bool, states> known{};
  std::array<TapState, states> queue{};
  std::size_t end = 0;
  queue[end++] = from;
  known[index(from)] = true;
  for (std::size_t first = 0; first < end; ++first) {
    const TapState state = queue[first];
    const Tap::Path path = paths[index(state)];
    for (std::uint32_t tms = 0; tms < 2; ++tms) {
      const TapState next = rows[index(state)].next[tms];
      if (known[index(next)]) continue;
      known[index(next)] = true;
      paths[index(next)] = {.tms = path.tms | tms << path.length, .length = path.length + 1};
      queue[end++] = next;
    }
  }
  return paths;
}

constexpr Paths allPaths() {
  Paths paths{};
  for (std::size_t from = 0; from < states; ++from) paths[from] = pathsFrom(static_cast<TapState>(from));
  return paths;
}

constexpr Paths paths = allPaths();

}  // namespace

namespace Tap {

TapState next(TapState state, bool tms) { return rows[index(state)].next[tms ? 1 : 0]; }

Path path(TapState from, TapState to) { return paths[index(from)][index(to)]; }

bool isStable(TapState state) { return state == reset || state == idle || state == drPause || state == irPause; }

std::string_view name(TapState state) { return rows[index(state)].name; }

std::optional<TapState> fromName(std::string_view name) {
  for (std::size_t i = 0; i < states; ++i)
    if (rows[i].name == name) return static_cast<TapState>(i);
  return std::nullopt;
}

}  // namespace Tap
