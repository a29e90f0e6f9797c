#include <algorithm>
#include <array>
#include <string_view>

#include "batch/CmdParser.h"
#include "batch/Interrupts.h"
#include "batch/Messages.h"
#include "batch/Record.h"
#include "batch/operations/Progress.h"
#include "interfaces/converters/Converters.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "interfaces/portability/UT_STR.h"

namespace {

using Action = bool (*)(CmdParser& session, UT_CMDARGS& args, CommandSet& line);

enum class Match { wholeWord, twoLetters };

struct Row {
  std::string_view word;
  Match match;
  Action action;
};

/// A handler that needs the switches only.
template <bool (CmdParser::*handler)(UT_CMDARGS&)>
bool call(CmdParser& session, UT_CMDARGS& args, CommandSet& /*line*/) {
  return (session.*handler)(args);
}

bool notBuilt(CmdParser& /*session*/, UT_CMDARGS& /*args*/, CommandSet& line) {
  return Messages::failure("%s is not built yet\n", line.getCommand(0));
}

bool clearCmd(CmdParser& session, UT_CMDARGS& /*args*/, CommandSet& /*line*/) {
  session.commandText.clear();
  return true;
}

bool closeCable(CmdParser& session, UT_CMDARGS& /*args*/, CommandSet& /*line*/) {
  session.deviceManager->unlockCable();
  return session.deviceManager->closeCable(false);
}

bool cleanCableLock(CmdParser& session, UT_CMDARGS& /*args*/, CommandSet& /*line*/) {
  session.deviceManager->setMode(tESSELNS::BOUNDARY_SCAN, true);
  return session.deviceManager->setCableOption("clean_cable_lock", "true");
}

bool lockCable(CmdParser& session, UT_CMDARGS& /*args*/, CommandSet& /*line*/) {
  return session.deviceManager->lockCable(CmdParser::cableLock);
}

bool unlockCable(CmdParser& session, UT_CMDARGS& /*args*/, CommandSet& /*line*/) {
  return session.deviceManager->unlockCable();
}

/// Words other than the whole "quit" and "exit", which the line processor takes. The record gets
/// "repeatEnd" here on purpose: readers of old batch-command files count on it.
bool quit(CmdParser& session, UT_CMDARGS& /*args*/, CommandSet& /*line*/) {
  session.quitRequested = true;
  record(session, "repeatEnd");
  return true;
}

bool info(CmdParser& session, UT_CMDARGS& /*args*/, CommandSet& /*line*/) {
  session.infoRunning = session.checkRunning = true;
  const bool result = session.deviceManager->info();
  session.infoRunning = session.checkRunning = false;
  return result;
}

constexpr Row whole(const char* word, Action action) { return {word, Match::wholeWord, action}; }
constexpr Row twoLetters(const char* word, Action action) { return {word, Match::twoLetters, action}; }

/// All command words, grouped by their first letter; in a group the first row that matches wins.
constexpr Row rows[] = {
    whole("addAdditionalConfigFile", notBuilt),
    whole("addDevice", notBuilt),
    whole("attachFlash", notBuilt),
    whole("assignFile", notBuilt),
    whole("assignFileToAttachedFlash", notBuilt),
    whole("addCollection", notBuilt),
    whole("addConfigDevice", notBuilt),
    whole("addDesign", notBuilt),
    whole("addDeviceChain", notBuilt),
    whole("addPromDevice", notBuilt),

    whole("blankCheck", notBuilt),
    whole("bypass", notBuilt),
    whole("bsdebug", notBuilt),

    whole("checksum", notBuilt),
    whole("clamp", notBuilt),
    whole("checkidcode", notBuilt),
    whole("checkIntegrity", notBuilt),
    whole("closeCable", closeCable),
    whole("clearCmd", clearCmd),
    whole("clearAdditionalConfigFiles", notBuilt),
    whole("cleanCableLock", cleanCableLock),

    whole("deleteDevice", notBuilt),
    whole("deleteAttachedFlash", notBuilt),
    whole("doPreload", notBuilt),
    whole("defineDevice", notBuilt),
    whole("deleteCollection", notBuilt),
    whole("deleteDesign", notBuilt),
    whole("deleteDeviceChain", notBuilt),
    whole("deletePromDevice", notBuilt),
    whole("deleteConfigDevice", notBuilt),

    whole("erase", notBuilt),
    whole("expresssvf", notBuilt),
    whole("expresscsvf", notBuilt),
    whole("expressstapl", notBuilt),
    twoLetters("exit", quit),

    whole("functionTest", notBuilt),

    whole("generate", notBuilt),

    whole("highz", notBuilt),
    whole("help", call<&CmdParser::help>),

    twoLetters("info", info),
    twoLetters("identify", notBuilt),

    whole("loadProjectFile", notBuilt),
    whole("loadCdf", notBuilt),
    whole("loadPdr", notBuilt),
    whole("loadArchive", notBuilt),
    whole("lockcable", lockCable),
    whole("loadConfigurationRevision", notBuilt),

    whole("programues", notBuilt),
    whole("programSecurityRegister", notBuilt),
    whole("program", notBuilt),
    whole("programUsercode", notBuilt),
    whole("programCustomercode", notBuilt),
    whole("play", notBuilt),
    whole("programEFuse", notBuilt),

    whole("quit", quit),

    whole("readidcode", notBuilt),
    whole("readusercode", notBuilt),
    whole("readdna", notBuilt),
    whole("readStatusRegister", notBuilt),
    whole("readmfgcode", notBuilt),
    whole("readues", notBuilt),
    whole("readbacktofile", notBuilt),
    whole("reconfigureOTF", notBuilt),
    whole("readEFuse", notBuilt),
    whole("readEFuseControlReg", notBuilt),
    whole("readPromOptions", notBuilt),
    whole("readTemperatureAndVoltage", notBuilt),
    whole("readCustomerCode", notBuilt),
    whole("runCableDiagnostics", call<&CmdParser::runCableDiagnostics>),
    whole("renameCollection", notBuilt),
    whole("renameBatchCmdFile", notBuilt),
    whole("readSecurityRegister", notBuilt),

    whole("setCable", call<&CmdParser::setCable>),
    whole("setMode", call<&CmdParser::setMode>),
    whole("setsubMode", call<&CmdParser::setsubMode>),
    whole("setPreference", call<&CmdParser::setPreference>),
    whole("setTargetDevice", call<&CmdParser::setTargetDevice>),
    whole("setAttribute", notBuilt),
    whole("saveCmd", notBuilt),
    whole("setLog", notBuilt),
    whole("saveProjectFile", notBuilt),
    whole("saveCdf", notBuilt),
    whole("saveArchive", notBuilt),
    whole("setCurrentDeviceChain", notBuilt),
    whole("setCurrentDesign", notBuilt),
    whole("setCurrentCollection", notBuilt),
    whole("setCableSpeed", call<&CmdParser::setCableSpeed>),
    whole("setCableOption", call<&CmdParser::setCableOption>),
    whole("setEnv", call<&CmdParser::setEnv>),
    whole("setActiveRevision", notBuilt),
    whole("setMbBpiDevice", call<&CmdParser::setMbBpiDevice>),
    whole("setMbBpiType", call<&CmdParser::setMbBpiType>),
    whole("SetMbBpiChain", call<&CmdParser::setMbBpiChain>),
    whole("SetBpiWidth", call<&CmdParser::setBpiWidth>),
    whole("setEFuseControlReg", notBuilt),

    whole("unlockcable", unlockCable),
    whole("unsetEnv", call<&CmdParser::unsetEnv>),

    whole("verify", notBuilt),
};

constexpr char firstLetter(std::string_view word) {
  if (word.empty()) return '\0';
  return word[0] >= 'A' && word[0] <= 'Z' ? static_cast<char>(word[0] + ('a' - 'A')) : word[0];
}

constexpr bool isGrouped() {
  return std::is_sorted(std::begin(rows), std::end(rows),
                        [](const Row& a, const Row& b) { return firstLetter(a.word) < firstLetter(b.word); });
}
static_assert(isGrouped());

struct Group {
  const Row* begin;
  const Row* end;
};

constexpr auto groups = [] {
  std::array<Group, 'z' - 'a' + 1> made{};
  for (std::size_t i = 0; i < made.size(); ++i) {
    const auto inGroup = [i](const Row& row) { return firstLetter(row.word) == static_cast<char>('a' + i); };
    const Row* begin = std::find_if(std::begin(rows), std::end(rows), inGroup);
    made[i] = {begin, std::find_if_not(begin, std::end(rows), inGroup)};
  }
  return made;
}();

bool isWord(std::string_view word, std::string_view name) {
  // Lengths first, for most words of a group begin alike; then the words as the table has them.
  return word.size() == name.size() && (word == name || UT_STR::ICompare(word.data(), name.data()) == 0);
}

bool matches(const Row& row, std::string_view word) {
  if (row.match == Match::wholeWord) return isWord(word, row.word);
  return UT_STR::INCompare(word.data(), row.word.data(), 2) == 0;
}

const Row* findRow(std::string_view word) {
  const char letter = firstLetter(word);
  if (letter < 'a' || letter > 'v') return nullptr;
  const Group& group = groups[static_cast<std::size_t>(letter - 'a')];
  const Row* row = std::find_if(group.begin, group.end, [word](const Row& each) { return matches(each, word); });
  return row == group.end ? nullptr : row;
}

/// Offers the words of the line to the external conversion utilities. True when one took it.
bool convert(std::string_view word, const CommandSet& line, bool& result) {
  static constexpr std::string_view obaWords[] = {"svf2Oba",  "qinterlv", "qmpm2svf",
                                                  "qmselmap", "qmcslink", "q_compex"};
  const auto is = [word](std::string_view name) { return isWord(word, name); };
  const int count = line.getNumberCommands();
  if (std::any_of(std::begin(obaWords), std::end(obaWords), is))
    result = ObaInterface(count, line.getCommands());
  else if (is("playCsvf"))
    result = playCsvfInterface(count, line.getCommands()) != 0;
  else if (is("svf2csvf"))
    result = svf2CsvfInterface(count, line.getCommands()) != 0;
  else
    return false;
  return true;
}

void registerProgress(CmdParser& session, const UT_CMDARGS& args) {
  if (!session.modeSet) return;
  if (args.findsw("-showprogress")) session.deviceManager->setCallbackFunction(progressCallback);
  if (allowBatchCallback != 0) session.deviceManager->setCallbackFunction(progressCallback);
}

}  // namespace

bool CmdParser::dispatch(CommandSet& line) {
  // The numbers of setCable are ports.
  if (UT_STR::ICompare(line.getCommand(0), "setcable") != 0 && !line.decrementPositions()) return false;
  const std::string_view word = line.getCommand(0);
  bool converted = false;
  if (convert(word, line, converted)) return converted;
  std::unique_ptr<UT_CMDARGS> args;
  if (!parseCommand(args, line)) return false;
  if (deviceManager == nullptr) return Messages::failure("There is no device manager.\n");
  registerProgress(*this, *args);
  if (const Row* row = findRow(word)) return row->action(*this, *args, line);
  // Words that begin with F fail without a message; scripts rely on it.
  if (firstLetter(word) == 'f') return false;
  return Messages::failure("Unknown operation %s\n", word.data());
}
