#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "interfaces/utility/CommandSet.h"
#include "interfaces/utility/TesselCmdargs.h"
#include "tests/unit/support/ChildProcess.h"
#include "tests/unit/support/RecordedMessages.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::RecordedMessages;

/// What the table makes of a line: "ok", "unknown: WORD", or the text of its one error, without the advice that
/// every error ends with.
std::string judged(const std::string& line) {
  RecordedMessages messages;
  const auto words = CommandSet::string2CommandSet(line.c_str());
  try {
    TesselCmdargs::getCmdargs(words->getNumberCommands(), words->getCommands(), true);
    return messages.all().empty() ? "ok" : "ok with a message";
  } catch (const ACDEntryNotFoundException& error) {
    return messages.all().empty() ? std::string("unknown: ") + error.what() : "unknown with a message";
  } catch (const InvalidArgumentException& error) {
    const std::string text = error.what();
    if (messages.all() != std::vector{testsupport::error(text + "\n")}) return "not one error";
    const std::size_t advice = text.rfind(" Try help -m ");
    return advice == std::string::npos ? "no advice" : text.substr(0, advice);
  }
}

TEST(TesselCmdargs, GroupsTheWordsOfALine) {
  const char* words[] = {"Program", "-P", "0", "1", "-showprogress"};
  const auto args = TesselCmdargs::getCmdargs(5, words, true);
  EXPECT_STREQ(args->getcmd(), "Program");
  ASSERT_EQ(args->getnumsw(), 2);
  EXPECT_STREQ(args->getsw("-p", 0)->getswname(), "-P");
  EXPECT_EQ(args->getsw("-p", 0)->getargnum(1), 1);
  EXPECT_TRUE(args->findsw("-showProgress"));
}

TEST(TesselCmdargs, UncheckedWordsMayBeAnything) {
  const RecordedMessages messages;
  const char* words[] = {"frobnicate", "stray", "-fast", "1"};
  const auto args = TesselCmdargs::getCmdargs(4, words, false);
  EXPECT_STREQ(args->getcmd(), "frobnicate");
  EXPECT_EQ(args->getnumargs(), 1);
  EXPECT_TRUE(args->findsw("-fast"));
  EXPECT_THAT(messages.all(), IsEmpty());
}

TEST(TesselCmdargs, AnUnknownWordIsToldWithoutAMessage) {
  EXPECT_EQ(judged("frobnicate -p 1"), "unknown: frobnicate");
  EXPECT_EQ(judged(""), "unknown: ");
  EXPECT_EQ(judged("programm"), "unknown: programm");
  EXPECT_EQ(judged("prog"), "unknown: prog");
  EXPECT_EQ(judged("i"), "unknown: i");
  const RecordedMessages messages;
  EXPECT_THROW(TesselCmdargs::getCmdargs(0, nullptr, true), ACDEntryNotFoundException);
}

struct Row {
  const char* line;
  const char* judgement;
};

constexpr Row rejectRows[] = {
    // unknown switches
    {"erase -p 1 -fast",
     "Unknown switch -fast of erase, which takes -p -position -target -showprogress "
     "-spionly -bpionly -file -revision."},
    {"quit -now", "Unknown switch -now of quit, which takes no switches."},
    {"QUIT -Now", "Unknown switch -Now of quit, which takes no switches."},
    {"repeatStart -p 1", "Unknown switch -p of repeatStart, which takes -loop."},
    {"quit --", "Unknown switch -- of quit, which takes no switches."},
    {"setcablespeed -spee 1", "Unknown switch -spee of setCableSpeed, which takes -speed."},
    // words where none is expected
    {"quit now", "Unexpected word now after quit: a switch begins with -."},
    {"erase 1 -p 2", "Unexpected word 1 after erase: a switch begins with -."},
    {"help setCable", "Unexpected word setCable after help: a switch begins with -."},
    {"setMode bscan", "Unexpected word bscan after setMode: a switch begins with -."},
    {"verify -spionly 1", "Unexpected word 1 after switch -spionly of verify."},
    {"setEnv -env A B -value C", "Unexpected word B after switch -env of setEnv."},
    {"setMode -bscan now then", "Unexpected word now after switch -bscan of setMode."},
    {"addDevice -p 1 2", "Switch -p of addDevice takes one number."},
    {"addDevice -p 1 -core 0 a.elf b.elf", "Unexpected word b.elf after switch -core of addDevice."},
    {"renameCollection -name a b c", "Unexpected word c after switch -name of renameCollection."},
    {"help -all x", "Unexpected word x after switch -all of help."},
    // no number where one is expected
    {"erase -p one", "Switch -p of erase takes a number, not one."},
    {"erase -p 1 2x", "Switch -p of erase takes a number, not 2x."},
    {"erase -p 1.5", "Switch -p of erase takes a number, not 1.5."},
    {"erase -position \"\"", "Switch -position of erase takes a number, not ."},
    {"erase -p +", "Switch -p of erase takes a number, not +."},
    {"erase -p -", "Switch -p of erase takes a number, not -."},
    {"help -Head x", "Switch -Head of help takes a number, not x."},
    {"addDevice -p 1 -core x a.elf", "Switch -core of addDevice takes a number, not x."},
    {"setCableSpeed -speed fast", "Switch -speed of setCableSpeed takes a number, not fast."},
    // missing arguments
    {"repeatStart -loop", "Switch -loop of repeatStart needs its argument: count."},
    {"setEnv -env -value 1", "Switch -env of setEnv needs its argument: name."},
    {"help -m", "Switch -m of help needs its argument: command."},
    {"help -tail", "Switch -tail of help needs its argument: n."},
    {"renameCollection -name old", "Switch -name of renameCollection needs its argument: old new."},
    {"setCable -p", "Switch -p of setCable needs its argument: port."},
    {"setCable -PORT", "Switch -PORT of setCable needs its argument: port."},
    {"saveCmd -file", "Switch -file of saveCmd needs its argument: path."},
    // the first mistake is told
    {"erase -fast -p one",
     "Unknown switch -fast of erase, which takes -p -position -target -showprogress "
     "-spionly -bpionly -file -revision."},
};

TEST(TesselCmdargs, RejectsWhatDoesNotFitTheCommand) {
  for (const Row& row : rejectRows) EXPECT_EQ(judged(row.line), row.judgement) << row.line;
}

TEST(TesselCmdargs, ErrorsOfACommandThatTakesAKeyShowNoWordOfTheUsers) {
  constexpr Row rows[] = {
      {"programEFuse -key", "Switch -key of programEFuse needs its argument: key."},
      {"programEFuse -key 00 C0FFEE", "Unexpected word (not shown) after switch -key of programEFuse."},
      {"programEFuse C0FFEE -p 1", "Unexpected word (not shown) after programEFuse: a switch begins with -."},
      {"programEFuse -p C0FFEE", "Switch -p of programEFuse takes a number, not (not shown)."},
      {"programEFuse -p 1 -key=C0FFEE",
       "Unknown switch (not shown) of programEFuse, which takes -p -position -target -showprogress -key -control."},
  };
  for (const Row& row : rows) EXPECT_EQ(judged(row.line), row.judgement) << row.line;
}

TEST(TesselCmdargs, AnErrorEndsWithAdvice) {
  const RecordedMessages messages;
  const char* words[] = {"REPEATSTART", "-loop"};
  EXPECT_THROW(TesselCmdargs::getCmdargs(2, words, true), InvalidArgumentException);
  EXPECT_THAT(messages.all(), ElementsAre(testsupport::error("Switch -loop of repeatStart needs its argument: count. "
                                                             "Try help -m repeatStart.\n")));
}

TEST(TesselCmdargs, AcceptsWhatFits) {
  for (const char* line : {"quit",
                           "EX",
                           "exi",
                           "eXit",
                           "in",
                           "inf",
                           "INFO",
                           "id",
                           "identif",
                           "identify -p 1",
                           "identifyMPM",
                           "repeatStart -loop 3",
                           "repeatStart -loop soon",
                           "repeatStart -loop -1",
                           "repeatStart",
                           "program -p 1 2 3",
                           "program -p +1 -1 99999999999999999999",
                           "PROGRAM -POSITION 1 -ShowProgress",
                           "program -p 1 -p 2",
                           "setMode -bscan",
                           "setMode -frobnicate",
                           "setMbBpiType -type x",
                           "setMode -a -b",
                           "setsubMode -x",
                           "setMbBpiDevice -anything 28F256",
                           "setMbBpiType -t x",
                           "SetMbBpiChain -serial",
                           "SetBpiWidth -w 8",
                           "help -m frobnicate",
                           "help -head -3",
                           "addDevice -p 1 -elf a.elf b.elf c.elf -elf d.elf",
                           "svf2Oba anything -goes 1 2 -p -p",
                           "playCsvf",
                           "setCable -p usb1 -b auto",
                           "setEnv -env \"\" -value \"\"",
                           "deleteDevice -p 1 2 3 -version 0 -index 1",
                           "addDesign -v 0 -d -data",
                           "addDesign -v 0 -data x"})
    EXPECT_EQ(judged(line), "ok") << line;
}

TEST(TesselCmdargs, SomeArgumentsMayBeMissingForTheHandlerToTell) {
  for (const char* line : {"addDevice -p",
                           "addDevice -position",
                           "assignFile -p",
                           "attachFlash -position",
                           "deleteDevice -p",
                           "deleteAttachedFlash -p",
                           "setAttribute -p",
                           "defineDevice -p",
                           "addPromDevice -p",
                           "deletePromDevice -position",
                           "setTargetDevice -position",
                           "setTargetDevice -p",
                           "program -p",
                           "programEFuse -key x -p",
                           "verify -position",
                           "addDevice -sprom",
                           "addDevice -spi",
                           "addDevice -fpga",
                           "addDevice -mpm",
                           "addDevice -elf",
                           "addDevice -core",
                           "addDevice -core 0",
                           "addAdditionalConfigFile -elf",
                           "addAdditionalConfigFile -core",
                           "clearAdditionalConfigFiles -core",
                           "deleteDevice -collection",
                           "setCurrentCollection -collection",
                           "addDesign -c",
                           "addDesign -collection",
                           "deleteDesign -c",
                           "deleteDesign -collection",
                           "addDeviceChain -c",
                           "addDeviceChain -collection",
                           "deleteDeviceChain -collection",
                           "setMbBpiDevice -device",
                           "setMbBpiType -type",
                           "SetMbBpiChain -chain",
                           "SetBpiWidth -width"})
    EXPECT_EQ(judged(line), "ok") << line;
}

TEST(TesselCmdargs, EveryOperationTakesPositionsTargetAndProgress) {
  for (const char* word : {"blankCheck",
                           "bypass",
                           "bsdebug",
                           "checksum",
                           "clamp",
                           "checkidcode",
                           "checkIntegrity",
                           "doPreload",
                           "erase",
                           "expresssvf",
                           "expresscsvf",
                           "expressstapl",
                           "functionTest",
                           "highz",
                           "identify",
                           "loadConfigurationRevision",
                           "programues",
                           "programSecurityRegister",
                           "program",
                           "programUsercode",
                           "programCustomercode",
                           "play",
                           "readidcode",
                           "readusercode",
                           "readdna",
                           "readStatusRegister",
                           "readmfgcode",
                           "readues",
                           "readbacktofile",
                           "reconfigureOTF",
                           "readEFuse",
                           "readEFuseControlReg",
                           "readPromOptions",
                           "readTemperatureAndVoltage",
                           "readCustomerCode",
                           "readSecurityRegister",
                           "setActiveRevision",
                           "setEFuseControlReg",
                           "verify"}) {
    EXPECT_EQ(judged(std::string(word) + " -showprogress"), "ok");
    EXPECT_EQ(judged(std::string(word) + " -p 1 2 -target"), "ok");
    EXPECT_EQ(judged(std::string(word) + " -position 1 -showProgress"), "ok");
  }
}

void acceptAWord() {
  EXPECT_EQ(judged("myTestWord"), "unknown: myTestWord");
  TesselCmdargs::accept("myTestWord");
  TesselCmdargs::accept("MYTESTWORD");
  EXPECT_EQ(judged("MyTestWord"), "ok");
  EXPECT_EQ(judged("myTestWord -p 1"), "Unknown switch -p of myTestWord, which takes no switches.");
  EXPECT_THAT(TesselCmdargs::findMatchingCommands("testword"), ElementsAre(StringBase("myTestWord")));
  EXPECT_EQ(TesselCmdargs::findBatchFormatString("mytestword"), StringBase("myTestWord: A word of the host.\n"));
}

TEST(TesselCmdargs, AcceptAddsAWordWithoutSwitches) {
  EXPECT_EQ(testsupport::runInChild(acceptAWord), "exit 0");  // the word stays with the process
}

TEST(TesselCmdargs, AcceptOfAKnownWordChangesNothing) {
  const std::size_t count = TesselCmdargs::findAllCommands().size();
  TesselCmdargs::accept("PROGRAM");
  TesselCmdargs::accept("ex");
  EXPECT_EQ(TesselCmdargs::findAllCommands().size(), count);
  EXPECT_EQ(judged("program -p 1"), "ok");
}

}  // namespace
