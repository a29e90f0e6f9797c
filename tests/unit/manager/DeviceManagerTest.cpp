#include <limits>

#include "interfaces/constraints/ModeKeywords.h"
#include "interfaces/utility/DeviceOptionsMgr.h"
#include "tests/unit/manager/ManagerTest.h"

namespace {

using tESSELNS::MODE_TYPE;
using tESSELNS::SUBMODE_TYPE;
using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::error;
using testsupport::exists;
using testsupport::status;

class DeviceManagerTest : public ManagerTest {};

TEST_F(DeviceManagerTest, ThereIsOneUntilItIsRemoved) {
  DeviceManagerInterface* first = DeviceManagerInterface::getDeviceManager();
  ASSERT_NE(first, nullptr);
  EXPECT_EQ(DeviceManagerInterface::getDeviceManager(), first);
  first->setMode(tESSELNS::SPI, true);
  DeviceManagerInterface::removeDeviceManager();
  EXPECT_EQ(manager().getMode(), tESSELNS::NO_MODE);
  DeviceManagerInterface::removeDeviceManager();
  DeviceManagerInterface::removeDeviceManager();
}

TEST_F(DeviceManagerTest, BeginsWithoutContent) {
  MODE_TYPE mode = tESSELNS::SPI;
  int position = 5;
  bool attached = true;
  manager().getTargetDevice(mode, position, attached);
  EXPECT_EQ(mode, tESSELNS::NO_MODE);
  EXPECT_EQ(position, -1);
  EXPECT_FALSE(attached);
  EXPECT_EQ(manager().getMode(), tESSELNS::NO_MODE);
  EXPECT_EQ(manager().getActiveMode(), tESSELNS::NO_MODE);
  EXPECT_EQ(int{manager().getSubmode()}, 0);
  EXPECT_EQ(manager().getDeviceChainCount(), 0);
  EXPECT_EQ(manager().getNumberCollections(), 0);
  EXPECT_EQ(manager().getNumberDesigns(), 0);
  EXPECT_EQ(manager().getNumberDeviceChains(), 0);
  EXPECT_STREQ(manager().getCurrentCollectionName(), "");
  EXPECT_EQ(manager().getDeviceAttribute(0, DeviceNS::NAME), nullptr);
  EXPECT_THAT(testsupport::listDirectory(directory_.path()), IsEmpty());
}

TEST_F(DeviceManagerTest, OptionsAreNeverNull) {
  const DeviceOptionsMgr* options = manager().getDeviceOptionsMgr(tESSELNS::SPI, 7, true);
  ASSERT_NE(options, nullptr);
  EXPECT_FALSE(options->isOptionSet(U_OptionsMgr::onlyFpga));
  EXPECT_TRUE(options->getProgramOptions().empty());
}

TEST_F(DeviceManagerTest, KeepsTheModeAndTheActiveMode) {
  for (int number = 0; number <= 8; ++number) {
    const auto mode = static_cast<MODE_TYPE>(number);
    EXPECT_TRUE(manager().setMode(mode, true));
    EXPECT_EQ(manager().getMode(), mode);
    EXPECT_EQ(manager().getActiveMode(), mode);
  }
  EXPECT_TRUE(manager().setMode(tESSELNS::SPI, false));
  EXPECT_EQ(manager().getMode(), tESSELNS::SPI);
  EXPECT_EQ(manager().getActiveMode(), tESSELNS::PROM_FILE_FORMATTER);
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(DeviceManagerTest, RefusesModesThatThereAreNot) {
  for (const int number : {9, 10, -1, std::numeric_limits<int>::max(), std::numeric_limits<int>::min()}) {
    EXPECT_FALSE(manager().setMode(static_cast<MODE_TYPE>(number), true));
    EXPECT_THAT(messages_.take(), ElementsAre(error("There is no mode " + std::to_string(number) + ".\n")));
  }
  EXPECT_EQ(manager().getMode(), tESSELNS::NO_MODE);
  EXPECT_EQ(recorded(), nothing);
}

TEST_F(DeviceManagerTest, TakesTheSubmodesOfTheActiveMode) {
  for (int mode = 0; mode <= 8; ++mode) {
    manager().setMode(static_cast<MODE_TYPE>(mode), true);
    const int count = mode == tESSELNS::SYSTEM_OBA_MPM ? 2 : mode == tESSELNS::PROM_FILE_FORMATTER ? 7 : 0;
    for (int submode = -1; submode <= 7; ++submode) {
      const bool belongs = submode >= 0 && submode < count;
      const SUBMODE_TYPE before = manager().getSubmode();
      EXPECT_EQ(manager().setSubmode(static_cast<SUBMODE_TYPE>(submode)), belongs) << mode << ' ' << submode;
      EXPECT_EQ(int{manager().getSubmode()}, belongs ? submode : int{before});
      const auto messages = messages_.take();
      if (belongs)
        EXPECT_THAT(messages, IsEmpty());
      else
        EXPECT_THAT(messages, ElementsAre(error("Mode " + std::to_string(mode) + " has no submode " +
                                                std::to_string(submode) + ".\n")));
    }
  }
}

TEST_F(DeviceManagerTest, KeepsTheTarget) {
  manager().setTargetDevice(tESSELNS::SPI, 3, true);
  MODE_TYPE mode = tESSELNS::NO_MODE;
  int position = -1;
  bool attached = false;
  manager().getTargetDevice(mode, position, attached);
  EXPECT_EQ(mode, tESSELNS::SPI);
  EXPECT_EQ(position, 3);
  EXPECT_TRUE(attached);
}

TEST_F(DeviceManagerTest, PreferencesAreValidated) {
  EXPECT_TRUE(manager().setPreference(TesselPreference::cableLockTries, "3"));
  EXPECT_TRUE(manager().setPreference(TesselPreference::recordSteps, "True"));
  EXPECT_THAT(messages_.take(), IsEmpty());
  EXPECT_EQ(TesselPreference::getPreferenceObject().getNumber(TesselPreference::cableLockTries), 3);

  EXPECT_FALSE(manager().setPreference(TesselPreference::lineWidth, "wide"));
  EXPECT_FALSE(manager().setPreference(TesselPreference::recordSteps, "maybe"));
  EXPECT_FALSE(manager().setPreference(TesselPreference::cableLockTries, ""));
  EXPECT_FALSE(manager().setPreference(TesselPreference::unknown, "1"));
  EXPECT_THAT(
      messages_.take(),
      ElementsAre(error("Preference lineWidth can't be \"wide\", expected a number of columns, 0 for no "
                        "wrapping.\n"),
                  error("Preference recordSteps can't be \"maybe\", expected true or false.\n"),
                  error("Preference cableLockTries can't be \"\", expected a number of tries, 1 or more.\n"),
                  error("Unknown preference. There are: lineWidth recordSteps cableLockTries parts_dir eraseFirst "
                        "verifyAfter.\n")));
  EXPECT_EQ(TesselPreference::getPreferenceObject().getNumber(TesselPreference::cableLockTries), 3);
}

TEST_F(DeviceManagerTest, TheLineWidthGoesToTheManagerInCharge) {
  EXPECT_TRUE(manager().setPreference(TesselPreference::lineWidth, "72"));
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan()->getMaxLineWidth(), 72);
  EXPECT_FALSE(manager().setPreference(TesselPreference::lineWidth, "-1"));
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan()->getMaxLineWidth(), 72);
}

TEST_F(DeviceManagerTest, WithoutAServerOnlyTheNullCableOpens) {
  const testsupport::ScopedVariable noServer("TESSEL_SERVER", "");
  const std::string choices =
      "There are: port null, the simulated board; any port with -server HOST[:PORT], a remote-bitbang server; port "
      "auto, the server that the environment variable TESSEL_SERVER names.\n";
  EXPECT_FALSE(manager().setCable(nullptr, -1, 9600, true, nullptr, false));
  EXPECT_FALSE(manager().setCable("usb", 0, -1, true, nullptr, false));
  EXPECT_FALSE(manager().setCable("auto", 0, -1, true, nullptr, false));
  EXPECT_FALSE(manager().setCable("out.svf", -1, 9600, true, "host", true));
  EXPECT_THAT(
      messages_.take(),
      ElementsAre(error("The port word names no cable. " + choices),
                  error("Cable usb can't be opened: no driver of such hardware is present. " + choices),
                  error("No cable was found: port auto looked for a server in the environment variable TESSEL_SERVER, "
                        "which is not set. " +
                        choices),
                  error("Cable out.svf can't be opened: cables that write files are not built yet.\n")));
  EXPECT_TRUE(manager().setCable("null", 0, 9600, true, nullptr, false));
  EXPECT_TRUE(manager().setCable("NULL", 0, 9600, true, nullptr, false));
  EXPECT_TRUE(manager().closeCable(false));
  EXPECT_TRUE(manager().closeCable(true));
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(DeviceManagerTest, InfoTellsTheCableAndTheChain) {
  EXPECT_TRUE(manager().info());
  manager().setCable("null", 0, 9600, true, nullptr, false);
  EXPECT_TRUE(manager().lockCable(5));
  EXPECT_TRUE(manager().info());
  EXPECT_TRUE(manager().unlockCable());
  EXPECT_TRUE(manager().info());
  EXPECT_TRUE(manager().closeCable(false));
  EXPECT_TRUE(manager().info());
  const auto chain = status("Devices on the chain: 0\n");
  EXPECT_THAT(messages_.all(), ElementsAre(status("Cable: none\n"), chain, status("Cable: null, locked\n"), chain,
                                           status("Cable: null\n"), chain, status("Cable: none\n"), chain));
}

TEST_F(DeviceManagerTest, KeepsTheCableSpeed) {
  EXPECT_EQ(manager().setCableSpeed(6000000), 6000000);
  EXPECT_EQ(manager().setCableSpeed(0), 0);
}

TEST_F(DeviceManagerTest, LocksTheCableForTheUser) {
  const std::string lock = runtime_.file("tessel/cable.lock");
  EXPECT_TRUE(manager().lockCable(5));
  EXPECT_TRUE(exists(lock));
  EXPECT_TRUE(manager().unlockCable());
  EXPECT_FALSE(exists(lock));
  EXPECT_TRUE(manager().unlockCable());
  EXPECT_TRUE(manager().lockCable(5));
  DeviceManagerInterface::removeDeviceManager();
  EXPECT_FALSE(exists(lock)) << "a removed device manager gives the lock back";
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(DeviceManagerTest, CleansAStaleLock) {
  EXPECT_TRUE(manager().lockCable(5));
  EXPECT_TRUE(manager().unlockCable());
  testsupport::writeFile(runtime_.file("tessel/cable.lock"), "busy\n");
  EXPECT_FALSE(manager().lockCable(5));
  EXPECT_EQ(messages_.take().size(), 1U);
  EXPECT_TRUE(manager().setCableOption("Clean_Cable_Lock", "TRUE"));
  EXPECT_TRUE(manager().lockCable(5));
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(DeviceManagerTest, RefusesCableOptionsThatThereAreNot) {
  EXPECT_FALSE(manager().setCableOption("colour", "true"));
  EXPECT_FALSE(manager().setCableOption("clean_cable_lock", "yes"));
  EXPECT_THAT(messages_.all(), ElementsAre(error("Unknown cable option colour, expected board or clean_cable_lock.\n"),
                                           error("Cable option clean_cable_lock can't be \"yes\", expected true.\n")));
}

TEST_F(DeviceManagerTest, DropsContentWithoutAWord) {
  EXPECT_TRUE(manager().clearMode(tESSELNS::SPI));
  EXPECT_TRUE(manager().clearAllModes());
  EXPECT_THAT(messages_.all(), IsEmpty());
}

}  // namespace
