#include "interfaces/utility/TesselPreference.h"

#include "interfaces/portability/Console.h"
#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/UT_STR.h"

namespace {

enum class Kind { number, truth, path };

struct Row {
  const char* name;
  const char* initial;
  const char* expected;
  Kind kind;
  int least = 0;  ///< of a number
};
/// In the order of the enumeration.
constexpr Row rows[TesselPreference::count] = {
    {"lineWidth", "0", "a number of columns, 0 for no wrapping", Kind::number},
    {"recordSteps", "true", "true or false", Kind::truth},
    {"cableLockTries", "1", "a number of tries, 1 or more", Kind::number, 1},
    {"parts_dir", "", "the path of a directory with BSDL files", Kind::path},
    {"eraseFirst", "false", "true or false", Kind::truth},
    {"verifyAfter", "false", "true or false", Kind::truth},
};

const Row* rowOf(TesselPreference::PREFERENCE preference) {
  return preference >= 0 && preference < TesselPreference::count ? &rows[preference] : nullptr;
}

bool accepts(const Row& row, const char* value) {
  if (row.kind == Kind::path) return true;
  if (row.kind == Kind::truth) return UT_STR::ICompare(value, "true") == 0 || UT_STR::ICompare(value, "false") == 0;
  if (*value == '\0') return false;
  for (const char* digit = value; *digit != '\0'; ++digit)
    if (*digit < '0' || *digit > '9') return false;
  return UT_STR::AToI(value) >= row.least;
}

}  // namespace

TesselPreference& TesselPreference::getPreferenceObject() {
  static TesselPreference object;
  return object;
}

TesselPreference::PREFERENCE TesselPreference::string2Pref(const char* name) {
  for (int i = 0; i < count; ++i)
    if (UT_STR::ICompare(rows[i].name, name) == 0) return static_cast<PREFERENCE>(i);
  return unknown;
}

const char* TesselPreference::pref2String(PREFERENCE preference) {
  const Row* row = rowOf(preference);
  return row == nullptr ? "" : row->name;
}

const char* TesselPreference::expectedValue(PREFERENCE preference) {
  const Row* row = rowOf(preference);
  return row == nullptr ? "" : row->expected;
}

bool TesselPreference::set(PREFERENCE preference, const char* value) {
  const Row* row = rowOf(preference);
  if (row == nullptr || value == nullptr || !accepts(*row, value)) return false;
  values_[static_cast<std::size_t>(preference)] = StringBase(value);
  return true;
}

const char* TesselPreference::get(PREFERENCE preference) const {
  const Row* row = rowOf(preference);
  if (row == nullptr) return "";
  const StringBase& value = values_[static_cast<std::size_t>(preference)];
  return value.empty() ? row->initial : value.c_str();
}

int TesselPreference::getNumber(PREFERENCE preference) const { return UT_STR::AToI(get(preference)); }

void TesselPreference::dump() const {
  for (int i = 0; i < count; ++i) {
    const StringBase& value = values_[static_cast<std::size_t>(i)];
    if (!value.empty()) Port::Console::print(Port::format("Preference %s is %s\n", rows[i].name, value).c_str());
  }
}
