#include <functional>

#include "tests/unit/manager/ManagerTest.h"

namespace {

using Manager = DeviceManagerInterface;
using testing::ElementsAre;

struct Row {
  const char* operation;  ///< how the error names it
  std::function<bool(Manager&)> call;
};

/// A chain that is empty, in a mode that has one.
const Row deviceRows[] = {
    {"Adding core files",
     [](Manager& m) {
       return m.addCoreFiles(0, {{1, "a.bit"}});
     }},
    {"Clearing core files", [](Manager& m) { return m.clearCoreFiles(0, 1); }},
    {"Adding extra files", [](Manager& m) { return m.addExtraFiles(0, {"a.elf"}); }},
    {"clearAdditionalConfigFiles", [](Manager& m) { return m.clearAdditionalConfigFiles(0); }},
    {"assignFile", [](Manager& m) { return m.assignFile(0, "a.bit"); }},
    {"deleteDevice", [](Manager& m) { return m.removeDevice(0); }},
    {"attachFlash", [](Manager& m) { return m.attachDeviceByPart(0, tESSELNS::SPI_FLASH, "w25q128"); }},
    {"assignFileToAttachedFlash",
     [](Manager& m) { return m.assignFileToFlashDevice(0, tESSELNS::BPI_FLASH, "a.mcs"); }},
    {"deleteAttachedFlash", [](Manager& m) { return m.deleteAttachedDevice(0); }},
    {"setAttribute", [](Manager& m) { return m.setDeviceAttribute(0, DeviceNS::KEY, "00", true); }},
};

const Row contentRows[] = {
    {"Setting a configuration-device attribute",
     [](Manager& m) { return m.setAttribute(ConfigDeviceNS::FILE_NAME, "x"); }},
    {"Setting a collection attribute", [](Manager& m) { return m.setAttribute(CollectionNS::NAME, "x"); }},
    {"Setting a design attribute", [](Manager& m) { return m.setAttribute(DesignNS::NAME, "x"); }},
    {"addCollection", [](Manager& m) { return m.addCollection("c"); }},
    {"deleteCollection", [](Manager& m) { return m.removeCollection("c"); }},
    {"renameCollection", [](Manager& m) { return m.renameCollection("c", "d"); }},
    {"setCurrentCollection", [](Manager& m) { return m.setCurrentCollection("c"); }},
    {"addDesign", [](Manager& m) { return m.addDesign(0, "d", false, nullptr, 27); }},
    {"addDesign", [](Manager& m) { return m.addDesign(0, "0", nullptr, 27); }},
    {"deleteDesign", [](Manager& m) { return m.removeDesign(0); }},
    {"setCurrentDesign", [](Manager& m) { return m.setCurrentDesign(0); }},
    {"addDeviceChain", [](Manager& m) { return m.addDeviceChain(0); }},
    {"deleteDeviceChain", [](Manager& m) { return m.removeDeviceChain(0); }},
    {"setCurrentDeviceChain", [](Manager& m) { return m.setCurrentDeviceChain(0); }},
    {"addConfigDevice",
     [](Manager& m) { return m.createModeInterface(tESSELNS::PROM_FILE_FORMATTER, ".", "x", 1) != nullptr; }},
    {"addPromDevice", [](Manager& m) { return m.addPromDevice2PromChain(0, 0, "zp18v01"); }},
    {"deletePromDevice", [](Manager& m) { return m.removePromDevice(0); }},
    {"generate", [](Manager& m) { return m.generate(nullptr); }},
    {"saveProjectFile", [](Manager& m) { return m.writeProjectRepository("board.prj"); }},
    {"loadProjectFile", [](Manager& m) { return m.readProjectRepository("board.prj"); }},
    {"saveCdf", [](Manager& m) { return m.saveCdf("board.cdf", "x", true); }},
    {"saveArchive", [](Manager& m) { return m.createArchive("board.tar", "."); }},
    {"loadArchive", [](Manager& m) { return m.loadArchive("board.tar", "."); }},
};

class RefusalsTest : public ManagerTest {
 protected:
  void expectRefusal(const Row& row, const std::string& reason) {
    EXPECT_FALSE(row.call(manager())) << row.operation;
    EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error(row.operation + reason)));
  }
};

TEST_F(RefusalsTest, AnOperationOnDevicesGivesOneErrorThatNamesIt) {
  manager().setMode(tESSELNS::BOUNDARY_SCAN, true);
  for (const Row& row : deviceRows) expectRefusal(row, ": There is no device 1: the chain is empty.\n");
}

TEST_F(RefusalsTest, WithoutAModeThereIsNoChain) {
  for (const Row& row : deviceRows) expectRefusal(row, " needs a mode. Use setMode.\n");
  manager().setMode(tESSELNS::PROM_FILE_FORMATTER, true);
  for (const Row& row : deviceRows) expectRefusal(row, " in this mode is not built yet.\n");
}

TEST_F(RefusalsTest, AWordWithoutAHandlerIsNotBuilt) {
  const char* words[] = {"expresssvf", "-file", "a.svf"};
  EXPECT_FALSE(manager().performOperation(3, words));
  EXPECT_FALSE(manager().performOperation(0, nullptr));
  EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error("expresssvf is not built yet.\n"),
                                            testsupport::error("There is no operation without a word.\n")));
}

TEST_F(RefusalsTest, AnOperationOnContentGivesOneErrorThatNamesIt) {
  for (const Row& row : contentRows) expectRefusal(row, " is not built yet.\n");
}

TEST_F(RefusalsTest, ARefusedOperationLeavesNothingBehind) {
  for (const Row& row : deviceRows) row.call(manager());
  for (const Row& row : contentRows) row.call(manager());
  EXPECT_TRUE(testsupport::listDirectory(directory_.path()).empty());
  EXPECT_EQ(manager().getDeviceChainCount(), 0);
  EXPECT_EQ(manager().getNumberCollections(), 0);
}

}  // namespace
