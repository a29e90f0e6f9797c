#include "interfaces/constraints/ConstraintsManager.h"

#include "interfaces/constraints/ModeKeywords.h"
#include "interfaces/portability/UT_STR.h"

tESSELNS::MODE_TYPE ConstraintsManager::modeString2Type(const char* keyword) {
  for (const ModeKeywords::Mode& row : ModeKeywords::modes)
    if (UT_STR::ICompare(keyword, row.keyword) == 0) return row.mode;
  return tESSELNS::NO_MODE;
}
