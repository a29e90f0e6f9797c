#include "manager/chain/ChainDevice.h"

#include "interfaces/portability/Secret.h"
#include "interfaces/portability/UT_STR.h"

namespace {

/// A stored option as words of a command.
struct OptionRow {
  DeviceNS::ATTRIBUTE attribute;
  const char* word;
  bool flag;  ///< the word alone, when the attribute is "true"
  bool program;
  bool check;  ///< verify and erase take it, too
};
constexpr OptionRow optionRows[] = {
    {DeviceNS::ERASE_FIRST, "-e", true, true, false},      {DeviceNS::VERIFY_AFTER, "-v", true, true, false},
    {DeviceNS::USERCODE, "-usercode", false, true, false}, {DeviceNS::UES, "-ues", false, true, false},
    {DeviceNS::REVISION, "-revision", false, true, true},
};

}  // namespace

void SecretText::set(const char* text) {
  if (!text_.empty()) Port::Secret::wipe(text_.data(), text_.size());
  // A new string: an old buffer that grows would leave a copy behind.
  text_ = std::string(text);
}

void StoredOptions::give(DeviceOptionsMgr& options, const Values& defaults) const {
  Values all = values;
  all.insert(defaults.begin(), defaults.end());
  std::vector<StringBase> program;
  std::vector<StringBase> check;
  for (const OptionRow& row : optionRows) {
    const auto found = all.find(row.attribute);
    if (found == all.end() || found->second.empty()) continue;
    if (row.flag && UT_STR::ICompare(found->second.c_str(), "true") != 0) continue;
    for (std::vector<StringBase>* words : {&program, &check}) {
      if (words == &program ? !row.program : !row.check) continue;
      words->emplace_back(row.word);
      if (!row.flag) words->emplace_back(found->second.c_str());
    }
  }
  if (!key.get().empty()) {
    program.emplace_back("-key");
    program.emplace_back(key.get().c_str());
  }
  options.setProgramOptions(std::move(program));
  options.setVerifyOptions(check);
  options.setEraseOptions(std::move(check));
  const auto only = all.find(DeviceNS::ONLY_FPGA);
  options.setOption(U_OptionsMgr::onlyFpga, only != all.end() && UT_STR::ICompare(only->second.c_str(), "true") == 0);
}

AttachedFlash* ChainDevice::attached() {
  if (spiFlash) return &*spiFlash;
  return bpiFlash ? &*bpiFlash : nullptr;
}
