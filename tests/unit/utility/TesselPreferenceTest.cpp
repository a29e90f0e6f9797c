#include <gtest/gtest.h>

#include <limits>

#include "interfaces/utility/TesselPreference.h"
#include "tests/unit/support/RecordedMessages.h"

namespace {

using Preference = TesselPreference::PREFERENCE;

TEST(TesselPreference, EveryNameFindsItsPreferenceInAnyLetterCase) {
  EXPECT_EQ(TesselPreference::string2Pref("lineWidth"), TesselPreference::lineWidth);
  EXPECT_EQ(TesselPreference::string2Pref("LINEWIDTH"), TesselPreference::lineWidth);
  EXPECT_EQ(TesselPreference::string2Pref("recordsteps"), TesselPreference::recordSteps);
  EXPECT_EQ(TesselPreference::string2Pref("cableLockTries"), TesselPreference::cableLockTries);
  for (int i = 0; i < TesselPreference::count; ++i) {
    const auto preference = static_cast<Preference>(i);
    EXPECT_EQ(TesselPreference::string2Pref(TesselPreference::pref2String(preference)), preference);
    EXPECT_STRNE(TesselPreference::expectedValue(preference), "");
  }
}

TEST(TesselPreference, AnUnknownNameIsMinusOneWithoutAMessage) {
  const testsupport::RecordedMessages messages;
  for (const char* name : {"", "line", "lineWidths", " lineWidth", "colour"})
    EXPECT_EQ(int{TesselPreference::string2Pref(name)}, -1) << name;
  EXPECT_EQ(int{TesselPreference::string2Pref(nullptr)}, -1);
  EXPECT_TRUE(messages.all().empty());
}

TEST(TesselPreference, AnUnknownPreferenceHasNoNameAndTakesNoValue) {
  for (const int number : {-1, -100, TesselPreference::count, 100}) {
    const auto preference = static_cast<Preference>(number);
    EXPECT_STREQ(TesselPreference::pref2String(preference), "");
    EXPECT_STREQ(TesselPreference::expectedValue(preference), "");
    TesselPreference preferences;
    EXPECT_FALSE(preferences.set(preference, "1"));
    EXPECT_STREQ(preferences.get(preference), "");
    EXPECT_EQ(preferences.getNumber(preference), 0);
  }
}

struct Row {
  Preference preference;
  const char* value;
  bool accepted;
  int number;
};

TEST(TesselPreference, TakesOnlyValuesThatFit) {
  constexpr int largest = std::numeric_limits<int>::max();
  constexpr Row rows[] = {{TesselPreference::lineWidth, "0", true, 0},
                          {TesselPreference::lineWidth, "100", true, 100},
                          {TesselPreference::lineWidth, "99999999999", true, largest},
                          {TesselPreference::lineWidth, "", false, 0},
                          {TesselPreference::lineWidth, nullptr, false, 0},
                          {TesselPreference::lineWidth, "-1", false, 0},
                          {TesselPreference::lineWidth, "+1", false, 0},
                          {TesselPreference::lineWidth, "80 ", false, 0},
                          {TesselPreference::lineWidth, "wide", false, 0},
                          {TesselPreference::recordSteps, "true", true, 0},
                          {TesselPreference::recordSteps, "FALSE", true, 0},
                          {TesselPreference::recordSteps, "1", false, 0},
                          {TesselPreference::recordSteps, "yes", false, 0},
                          {TesselPreference::recordSteps, "", false, 0},
                          {TesselPreference::recordSteps, "true ", false, 0},
                          {TesselPreference::cableLockTries, "1", true, 1},
                          {TesselPreference::cableLockTries, "30", true, 30},
                          {TesselPreference::cableLockTries, "many", false, 1},
                          {TesselPreference::cableLockTries, "-3", false, 1}};
  for (const Row& row : rows) {
    TesselPreference preferences;
    SCOPED_TRACE(TesselPreference::pref2String(row.preference) + std::string(":") +
                 (row.value == nullptr ? "null" : row.value));
    const std::string before = preferences.get(row.preference);
    EXPECT_EQ(preferences.set(row.preference, row.value), row.accepted);
    EXPECT_EQ(preferences.get(row.preference), row.accepted ? std::string(row.value) : before);
    EXPECT_EQ(preferences.getNumber(row.preference), row.number);
  }
}

TEST(TesselPreference, AtLeastOneTryIsNeededForTheCableLock) {
  EXPECT_STREQ(TesselPreference::expectedValue(TesselPreference::cableLockTries), "a number of tries, 1 or more");
  TesselPreference preferences;
  EXPECT_FALSE(preferences.set(TesselPreference::cableLockTries, "0"));
}

TEST(TesselPreference, BeginsWithDefaults) {
  const TesselPreference preferences;
  EXPECT_STREQ(preferences.get(TesselPreference::lineWidth), "0");
  EXPECT_STREQ(preferences.get(TesselPreference::recordSteps), "true");
  EXPECT_STREQ(preferences.get(TesselPreference::cableLockTries), "1");
}

TEST(TesselPreference, DumpPrintsWhatWasSet) {
  TesselPreference preferences;
  testsupport::StandardOutputCapture output;
  preferences.dump();
  EXPECT_EQ(output.text(), "");
  preferences.set(TesselPreference::cableLockTries, "3");
  preferences.set(TesselPreference::lineWidth, "80");
  preferences.set(TesselPreference::lineWidth, "wide");
  testsupport::StandardOutputCapture more;
  preferences.dump();
  EXPECT_EQ(more.text(), "Preference lineWidth is 80\nPreference cableLockTries is 3\n");
}

TEST(TesselPreference, TheProcessHasOneObject) {
  EXPECT_EQ(&TesselPreference::getPreferenceObject(), &TesselPreference::getPreferenceObject());
}

}  // namespace
