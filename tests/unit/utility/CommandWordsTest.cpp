// What help shows of the command table: the words and their usage texts.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

#include "interfaces/portability/UT_STR.h"
#include "interfaces/utility/TesselCmdargs.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// clang-format off
// Every word that a line may begin with. A new command belongs here, too.
constexpr const char* allWords[] = {
    "addAdditionalConfigFile", "addCollection", "addConfigDevice", "addDesign", "addDevice", "addDeviceChain",
    "addPromDevice", "assignFile", "assignFileToAttachedFlash", "attachFlash", "blankCheck", "bsdebug", "bypass",
    "checkidcode", "checkIntegrity", "checksum", "clamp", "cleanCableLock", "clearAdditionalConfigFiles", "clearCmd",
    "closeCable", "defineDevice", "deleteAttachedFlash", "deleteCollection", "deleteConfigDevice", "deleteDesign",
    "deleteDevice", "deleteDeviceChain", "deletePromDevice", "doPreload", "erase", "exit", "expresscsvf",
    "expressstapl", "expresssvf", "functionTest", "generate", "help", "highz", "identify", "identifyMPM", "info",
    "loadArchive", "loadCdf", "loadConfigurationRevision", "loadPdr", "loadProjectFile", "lockcable", "play",
    "playCsvf", "program", "programCustomercode", "programEFuse", "programSecurityRegister", "programues",
    "programUsercode", "q_compex", "qinterlv", "qmcslink", "qmpm2svf", "qmselmap", "quit", "readbacktofile",
    "readCustomerCode", "readdna", "readEFuse", "readEFuseControlReg", "readidcode", "readmfgcode", "readPromOptions",
    "readSecurityRegister", "readStatusRegister", "readTemperatureAndVoltage", "readues", "readusercode",
    "reconfigureOTF", "renameBatchCmdFile", "renameCollection", "repeatEnd", "repeatStart", "runCableDiagnostics",
    "saveArchive", "saveCdf", "saveCmd", "saveProjectFile", "setActiveRevision", "setAttribute", "SetBpiWidth",
    "setCable", "setCableOption", "setCableSpeed", "setCurrentCollection", "setCurrentDesign",
    "setCurrentDeviceChain", "setEFuseControlReg", "setEnv", "setLog", "SetMbBpiChain", "setMbBpiDevice",
    "setMbBpiType", "setMode", "setPreference", "setsubMode", "setTargetDevice", "svf2csvf", "svf2Oba", "unlockcable",
    "unsetEnv", "verify",
};
// clang-format on

std::vector<std::string> textsOf(const std::vector<StringBase>& words) {
  std::vector<std::string> texts;
  for (const StringBase& word : words) texts.emplace_back(word.c_str());
  return texts;
}

TEST(CommandWords, ListsEveryWordInAlphabeticalOrder) {
  std::vector<std::string> expected(std::begin(allWords), std::end(allWords));
  std::sort(expected.begin(), expected.end(),
            [](const std::string& a, const std::string& b) { return UT_STR::ICompare(a.c_str(), b.c_str()) < 0; });
  EXPECT_EQ(textsOf(TesselCmdargs::findAllCommands()), expected);
}

TEST(CommandWords, FindsWordsThatHoldAText) {
  const auto find = [](const char* text) { return textsOf(TesselCmdargs::findMatchingCommands(text)); };
  EXPECT_THAT(find("cable"), ElementsAre("cleanCableLock", "closeCable", "lockcable", "runCableDiagnostics", "setCable",
                                         "setCableOption", "setCableSpeed", "unlockcable"));
  EXPECT_THAT(find("CABLES"), ElementsAre("setCableSpeed"));
  EXPECT_THAT(find("mbbpi"), ElementsAre("SetMbBpiChain", "setMbBpiDevice", "setMbBpiType"));
  EXPECT_THAT(find("exit"), ElementsAre("exit"));
  EXPECT_THAT(find("frobnicate"), IsEmpty());
  EXPECT_EQ(find("").size(), std::size(allWords));
}

TEST(CommandWords, UsageTextsAreWhole) {
  const auto usage = [](const char* word) { return std::string(TesselCmdargs::findBatchFormatString(word).c_str()); };
  EXPECT_EQ(usage("QUIT"), "quit: Ends the session.\nExample: quit");
  EXPECT_EQ(usage("ex"), "exit: Ends the session.\nShort forms of 2 letters and more do.\nExample: exit");
  EXPECT_EQ(usage("deletepromdevice"),
            "deletePromDevice: Removes a PROM from the PROM chain.\n"
            "  -p <position>           the PROM's place, from 1\n"
            "  -position <position>    the same\n"
            "Example: deletePromDevice -p 1");
  EXPECT_EQ(usage("clearAdditionalConfigFiles"),
            "clearAdditionalConfigFiles: Takes a device's software and processor-core files away.\n"
            "  -p <position>           the device's place on the chain, from 1\n"
            "  -position <position>    the same\n"
            "  -core <number...>       only the files of these processor cores\n"
            "Example: clearAdditionalConfigFiles -p 1");
  EXPECT_EQ(usage("setPreference"),
            "setPreference: Sets a preference.\n"
            "  -pref <name:value>      the preference and its new value\n"
            "Preferences: lineWidth (columns at which messages wrap, 0 for never), recordSteps (true or false: steps "
            "go\ninto the batch-command file), cableLockTries (how often a busy cable is tried).\n"
            "Example: setPreference -pref lineWidth:100");
  EXPECT_EQ(usage("frobnicate"), "");
  EXPECT_EQ(usage(""), "");
}

}  // namespace
