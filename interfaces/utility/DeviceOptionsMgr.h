#pragma once

#include <vector>

#include "interfaces/Export.h"
#include "interfaces/portability/StringBase.h"
#include "interfaces/utility/U_OptionsMgr.h"

/// The stored options of one device, as command words in order: switches and their values, ready to be
/// appended to a command. Empty words may occur.
class TESSEL_EXPORT DeviceOptionsMgr : public U_OptionsMgr {
 public:
  ~DeviceOptionsMgr() override;

  const std::vector<StringBase>& getProgramOptions() const { return programOptions_; }
  const std::vector<StringBase>& getVerifyOptions() const { return verifyOptions_; }
  const std::vector<StringBase>& getEraseOptions() const { return eraseOptions_; }
  void setProgramOptions(std::vector<StringBase> words) { programOptions_ = std::move(words); }
  void setVerifyOptions(std::vector<StringBase> words) { verifyOptions_ = std::move(words); }
  void setEraseOptions(std::vector<StringBase> words) { eraseOptions_ = std::move(words); }

 private:
  std::vector<StringBase> programOptions_;
  std::vector<StringBase> verifyOptions_;
  std::vector<StringBase> eraseOptions_;
};
