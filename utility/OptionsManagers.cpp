#include "interfaces/utility/DeviceOptionsMgr.h"
#include "interfaces/utility/U_OptionsMgr.h"

U_OptionsMgr::~U_OptionsMgr() = default;

bool U_OptionsMgr::isOptionSet(int option) const { return options_.contains(option); }

void U_OptionsMgr::setOption(int option, bool on) {
  if (on)
    options_.insert(option);
  else
    options_.erase(option);
}

DeviceOptionsMgr::~DeviceOptionsMgr() = default;
