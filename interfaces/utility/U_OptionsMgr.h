#pragma once

#include <set>

#include "interfaces/Export.h"

/// A set of numbered options.
class TESSEL_EXPORT U_OptionsMgr {
 public:
  /// Program only the FPGA, not the flash behind it.
  static constexpr int onlyFpga = 17;

  virtual ~U_OptionsMgr();
  bool isOptionSet(int option) const;
  void setOption(int option, bool on);

 private:
  std::set<int> options_;
};
