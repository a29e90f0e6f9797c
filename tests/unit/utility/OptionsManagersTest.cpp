#include <gtest/gtest.h>

#include "interfaces/utility/Callback.h"
#include "interfaces/utility/DeviceOptionsMgr.h"

namespace {

using Words = std::vector<StringBase>;

TEST(OptionsManagers, OptionsAreSetAndCleared) {
  U_OptionsMgr options;
  EXPECT_EQ(U_OptionsMgr::onlyFpga, 17);
  EXPECT_FALSE(options.isOptionSet(17));
  options.setOption(17, true);
  options.setOption(17, true);
  options.setOption(-1, true);
  EXPECT_TRUE(options.isOptionSet(17));
  EXPECT_TRUE(options.isOptionSet(-1));
  EXPECT_FALSE(options.isOptionSet(18));
  options.setOption(17, false);
  options.setOption(18, false);
  EXPECT_FALSE(options.isOptionSet(17));
  EXPECT_TRUE(options.isOptionSet(-1));
}

TEST(OptionsManagers, ADeviceHasThreeListsOfWords) {
  DeviceOptionsMgr options;
  EXPECT_TRUE(options.getProgramOptions().empty());
  EXPECT_TRUE(options.getVerifyOptions().empty());
  EXPECT_TRUE(options.getEraseOptions().empty());
  options.setProgramOptions({"-key", "00 FF", ""});
  options.setVerifyOptions({"-v"});
  options.setEraseOptions({"", "-e"});
  EXPECT_EQ(options.getProgramOptions(), (Words{"-key", "00 FF", ""}));
  EXPECT_EQ(options.getVerifyOptions(), (Words{"-v"}));
  EXPECT_EQ(options.getEraseOptions(), (Words{"", "-e"}));
  options.setProgramOptions({});
  EXPECT_TRUE(options.getProgramOptions().empty());
  U_OptionsMgr& base = options;
  base.setOption(U_OptionsMgr::onlyFpga, true);
  EXPECT_TRUE(options.isOptionSet(17));
}

TEST(Callback, TellsStatusAndProgress) {
  EXPECT_EQ(int{Callback::start}, 0);
  EXPECT_EQ(int{Callback::end}, 1);
  EXPECT_EQ(int{Callback::update}, 2);
  const Callback progress(Callback::update, -5, 2147483647);
  EXPECT_EQ(progress.getProgressStatus(), 2);
  EXPECT_EQ(progress.getCurrentCount(), -5);
  EXPECT_EQ(progress.getTotalCount(), 2147483647);
}

}  // namespace
