#pragma once

#include <array>

#include "interfaces/Export.h"
#include "interfaces/portability/StringBase.h"

/// The preferences of the process: texts by name. One object, made at the first use; one thread.
class TESSEL_EXPORT TesselPreference {
 public:
  enum PREFERENCE : int {
    unknown = -1,
    lineWidth = 0,
    recordSteps = 1,
    cableLockTries = 2,
    partsDirectory = 3,
    eraseFirst = 4,
    verifyAfter = 5
  };
  static constexpr int count = 6;

  static TesselPreference& getPreferenceObject();

  /// The preference of that name in any letter case; -1 for an unknown name, without a message.
  static PREFERENCE string2Pref(const char* name);
  static const char* pref2String(PREFERENCE preference);
  /// What values the preference takes, for error messages.
  static const char* expectedValue(PREFERENCE preference);

  /// Sets a preference. False when it is unknown or does not take the value.
  bool set(PREFERENCE preference, const char* value);
  /// The value that was set, or the default.
  const char* get(PREFERENCE preference) const;
  int getNumber(PREFERENCE preference) const;

  /// Prints the preferences that were set, a line each, on standard output.
  void dump() const;

 private:
  std::array<StringBase, count> values_;
};
