#include <gtest/gtest.h>

#include <set>
#include <vector>

#include "manager/scan/TapState.h"

namespace {

std::vector<TapState> allStates() {
  std::vector<TapState> result;
  for (int i = 0; i < 16; ++i) result.push_back(static_cast<TapState>(i));
  return result;
}

TapState walk(TapState from, std::uint32_t tms, int length) {
  for (int i = 0; i < length; ++i) from = Tap::next(from, (tms >> i & 1U) != 0);
  return from;
}

/// By trial of every row of TMS levels up to a length; -1 when none leads there.
int shortest(TapState from, TapState to) {
  for (int length = 0; length < 9; ++length)
    for (std::uint32_t tms = 0; tms < 1U << length; ++tms)
      if (walk(from, tms, length) == to) return length;
  return -1;
}

TEST(TapState, FollowsTheDiagramAroundAScan) {
  using enum TapState;
  const std::vector<std::pair<bool, TapState>> steps = {
      {false, idle},    {true, drSelect},   {false, drCapture}, {false, drShift}, {false, drShift}, {true, drExit1},
      {false, drPause}, {true, drExit2},    {false, drShift},   {true, drExit1},  {true, drUpdate}, {true, drSelect},
      {true, irSelect}, {false, irCapture}, {true, irExit1},    {false, irPause}, {true, irExit2},  {true, irUpdate},
      {false, idle},    {true, drSelect},   {true, irSelect},   {true, reset},    {true, reset}};
  TapState state = reset;
  for (const auto& [tms, expected] : steps) {
    state = Tap::next(state, tms);
    EXPECT_EQ(Tap::name(state), Tap::name(expected));
  }
}

TEST(TapState, FiveHighLevelsResetFromAnywhere) {
  for (const TapState state : allStates()) EXPECT_EQ(walk(state, 0x1F, 5), TapState::reset) << Tap::name(state);
}

TEST(TapState, PathsLeadThereAndAreTheShortest) {
  for (const TapState from : allStates()) {
    for (const TapState to : allStates()) {
      const Tap::Path path = Tap::path(from, to);
      EXPECT_EQ(walk(from, path.tms, path.length), to) << Tap::name(from) << " to " << Tap::name(to);
      EXPECT_EQ(path.length, shortest(from, to)) << Tap::name(from) << " to " << Tap::name(to);
      EXPECT_EQ(path.tms >> path.length, 0U);
    }
  }
}

TEST(TapState, FourStatesAreStable) {
  std::set<TapState> stable;
  for (const TapState state : allStates())
    if (Tap::isStable(state)) stable.insert(state);
  EXPECT_EQ(stable, (std::set<TapState>{TapState::reset, TapState::idle, TapState::drPause, TapState::irPause}));
}

TEST(TapState, NamesComeBack) {
  std::set<std::string_view> names;
  for (const TapState state : allStates()) {
    names.insert(Tap::name(state));
    EXPECT_EQ(Tap::fromName(Tap::name(state)), state);
  }
  EXPECT_EQ(names.size(), 16U);
  EXPECT_EQ(Tap::name(TapState::irExit2), "IREXIT2");
  EXPECT_EQ(Tap::fromName("DRPAUSE"), TapState::drPause);
  for (const char* none : {"", "drpause", "DR", "DRPAUSE ", "RUN"})
    EXPECT_EQ(Tap::fromName(none), std::nullopt) << none;
}

}  // namespace
