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
#include "interfaces/utility/TesselCmdargs.h"

namespace {

using Action = bool (*)(CmdParser& session, UT_CMDARGS& args, CommandSet& line);

enum class Match { wholeWord, twoLetters };

/// Whether a command can do without a device manager.
enum class Needs { manager, nothing };

struct Row {
  std::string_view word;
  Match match;
  Action action;
  Needs needs = Needs::manager;
};

/// The device manager's text about the last boundary-scan operation.
constexpr int stateAttribute = 2;

/// A handler that needs the switches only.
template <bool (CmdParser::*handler)(UT_CMDARGS&)>
bool call(CmdParser& session, UT_CMDARGS& args, CommandSet& /*line*/) {
  return (session.*handler)(args);
}

/// A handler that needs the words as well.
template <bool (CmdParser::*handler)(UT_CMDARGS&, CommandSet&)>
bool call(CmdParser& session, UT_CMDARGS& args, CommandSet& line) {
  return (session.*handler)(args, line);
}

constexpr Action operation = call<&CmdParser::runOperation>;

bool operationWithState(CmdParser& session, UT_CMDARGS& args, CommandSet& line) {
  const bool result = session.runOperation(args, line);
  Messages::debug("State is %s\n", session.deviceManager->getAttribute(stateAttribute));
  return result;
}

bool checkIntegrity(CmdParser& session, UT_CMDARGS& args, CommandSet& line) {
  session.checkRunning = true;
  const bool result = session.runOperation(args, line);
  session.checkRunning = false;
  return result;
}

/// On a boundary-scan chain MPM devices are looked for as well, behind what was found; that result counts.
bool identify(CmdParser& session, UT_CMDARGS& args, CommandSet& line) {
  session.checkRunning = true;
  bool result = session.runOperation(args, line);
  if (session.isActiveMode(tESSELNS::BOUNDARY_SCAN)) {
    CommandSet mpmLine(8);
    mpmLine.addCommand("identifyMPM");
    const auto mpmArgs = TesselCmdargs::getCmdargs(mpmLine.getNumberCommands(), mpmLine.getCommands(), true);
    result = session.runOperation(*mpmArgs, mpmLine);
  }
  session.lastIdentifyOk = result;
  session.checkRunning = false;
  return result;
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

/// Words other than the whole "quit" and "exit", which the line processor takes. Deliberate: the record gets
/// "repeatEnd" here, not "quit".
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

constexpr Row whole(const char* word, Action action, Needs needs = Needs::manager) {
  return {word, Match::wholeWord, action, needs};
}
constexpr Row twoLetters(const char* word, Action action, Needs needs = Needs::manager) {
  return {word, Match::twoLetters, action, needs};
}

/// All command words, grouped by their first letter; in a group the first row that matches wins.
constexpr Row rows[] = {
    whole("addAdditionalConfigFile", call<&CmdParser::addAdditionalConfigFile>),
    whole("addDevice", call<&CmdParser::addDevice>),
    whole("attachFlash", call<&CmdParser::attachFlash>),
    whole("assignFile", call<&CmdParser::assignFile>),
    whole("assignFileToAttachedFlash", call<&CmdParser::assignFileToAttachedFlash>),
    whole("addCollection", call<&CmdParser::addCollection>),
    whole("addConfigDevice", call<&CmdParser::addConfigDevice>),
    whole("addDesign", call<&CmdParser::addDesign>),
    whole("addDeviceChain", call<&CmdParser::addDeviceChain>),
    whole("addPromDevice", call<&CmdParser::addPromDevice>),

    whole("blankCheck", operationWithState),
    whole("bypass", operationWithState),
    whole("bsdebug", operationWithState),

    whole("checksum", operation),
    whole("clamp", operation),
    whole("checkidcode", operation),
    whole("checkIntegrity", checkIntegrity),
    whole("closeCable", closeCable),
    whole("clearCmd", clearCmd, Needs::nothing),
    whole("clearAdditionalConfigFiles", call<&CmdParser::clearAdditionalConfigFiles>),
    whole("cleanCableLock", cleanCableLock),

    whole("deleteDevice", call<&CmdParser::deleteDevice>),
    whole("deleteAttachedFlash", call<&CmdParser::deleteAttachedFlash>),
    whole("doPreload", operation),
    whole("defineDevice", call<&CmdParser::defineDevice>),
    whole("deleteCollection", call<&CmdParser::deleteCollection>),
    whole("deleteDesign", call<&CmdParser::deleteDesign>),
    whole("deleteDeviceChain", call<&CmdParser::deleteDeviceChain>),
    whole("deletePromDevice", call<&CmdParser::deletePromDevice>),
    whole("deleteConfigDevice", call<&CmdParser::deleteConfigDevice>),

    whole("erase", operation),
    whole("expresssvf", operation),
    whole("expresscsvf", operation),
    whole("expressstapl", operation),
    twoLetters("exit", quit, Needs::nothing),

    whole("functionTest", operation),

    whole("generate", call<&CmdParser::generate>),

    whole("highz", operation),
    whole("help", call<&CmdParser::help>, Needs::nothing),

    twoLetters("info", info),
    twoLetters("identify", identify),

    whole("loadProjectFile", call<&CmdParser::loadProjectFile>),
    whole("loadCdf", call<&CmdParser::loadProjectFile>),
    whole("loadPdr", call<&CmdParser::loadPdr>),
    whole("loadArchive", call<&CmdParser::loadArchive>),
    whole("lockcable", lockCable),
    whole("loadConfigurationRevision", operation),

    whole("programues", operation),
    whole("programSecurityRegister", operation),
    whole("program", operation),
    whole("programUsercode", operation),
    whole("programCustomercode", operation),
    whole("play", operation),
    whole("programEFuse", call<&CmdParser::programEFuse>),

    whole("quit", quit, Needs::nothing),

    whole("readidcode", operation),
    whole("readusercode", operation),
    whole("readdna", operation),
    whole("readStatusRegister", operation),
    whole("readmfgcode", operation),
    whole("readues", operation),
    whole("readbacktofile", operation),
    whole("reconfigureOTF", operation),
    whole("readEFuse", operation),
    whole("readEFuseControlReg", operation),
    whole("readPromOptions", operation),
    whole("readTemperatureAndVoltage", operation),
    whole("readCustomerCode", operation),
    whole("runCableDiagnostics", call<&CmdParser::runCableDiagnostics>),
    whole("renameCollection", call<&CmdParser::renameCollection>),
    whole("renameBatchCmdFile", call<&CmdParser::renameBatchCmdFile>),
    whole("readSecurityRegister", operation),

    whole("setCable", call<&CmdParser::setCable>),
    whole("setMode", call<&CmdParser::setMode>),
    whole("setsubMode", call<&CmdParser::setsubMode>),
    whole("setPreference", call<&CmdParser::setPreference>),
    whole("setTargetDevice", call<&CmdParser::setTargetDevice>),
    whole("setAttribute", call<&CmdParser::setAttribute>),
    whole("saveCmd", call<&CmdParser::saveCmd>, Needs::nothing),
    whole("setLog", call<&CmdParser::setLog>, Needs::nothing),
    whole("saveProjectFile", call<&CmdParser::saveProjectFile>),
    whole("saveCdf", call<&CmdParser::saveCdf>),
    whole("saveArchive", call<&CmdParser::saveArchive>),
    whole("setCurrentDeviceChain", call<&CmdParser::setCurrentDeviceChain>),
    whole("setCurrentDesign", call<&CmdParser::setCurrentDesign>),
    whole("setCurrentCollection", call<&CmdParser::setCurrentCollection>),
    whole("setCableSpeed", call<&CmdParser::setCableSpeed>),
    whole("setCableOption", call<&CmdParser::setCableOption>),
    whole("setEnv", call<&CmdParser::setEnv>, Needs::nothing),
    whole("setActiveRevision", operation),
    whole("setMbBpiDevice", call<&CmdParser::setMbBpiDevice>),
    whole("setMbBpiType", call<&CmdParser::setMbBpiType>),
    whole("SetMbBpiChain", call<&CmdParser::setMbBpiChain>),
    whole("SetBpiWidth", call<&CmdParser::setBpiWidth>),
    whole("setEFuseControlReg", operation),

    whole("unlockcable", unlockCable),
    whole("unsetEnv", call<&CmdParser::unsetEnv>, Needs::nothing),

    whole("verify", operation),
};

constexpr int firstLetter(std::string_view word) { return word.empty() ? 0 : UT_STR::Lower(word[0]); }

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
    const auto inGroup = [i](const Row& row) { return firstLetter(row.word) == static_cast<int>('a' + i); };
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
  const int letter = firstLetter(word);
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
  if (!session.modeSet || session.deviceManager == nullptr) return;
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
  registerProgress(*this, *args);
  if (const Row* row = findRow(word)) {
    if (deviceManager == nullptr && row->needs == Needs::manager)
      return Messages::failure("There is no device manager for %s.\n", word.data());
    return row->action(*this, *args, line);
  }
  // Deliberate: words that begin with F fail without a message.
  if (firstLetter(word) == 'f') return false;
  return Messages::failure("Unknown operation %s\n", word.data());
}
