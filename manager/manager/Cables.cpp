// The cable: choosing and opening it, its lock, its speed and options.

#include <filesystem>

#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/UT_STR.h"
#include "manager/cables/CableDiagnostics.h"
#include "manager/manager/DeviceManager.h"
#include "manager/support/Report.h"

namespace {

/// What the interpreter passes on when the user named no baud rate.
constexpr int defaultBaud = 9600;

int lockTries() { return TesselPreference::getPreferenceObject().getNumber(TesselPreference::cableLockTries); }

/// The cable as a command line would open it.
std::string stepOf(const CableChoice& choice) {
  std::string step = "setCable -port " + (choice.word.empty() ? std::string("auto") : choice.word);
  if (choice.word == "com" || choice.word == "lpt" || choice.word == "usb") step += "1";
  if (choice.word == "usb2") step = "setCable -port usb21";
  return choice.kind == CableChoice::Kind::server ? step + " -server " + choice.server : step;
}

std::string shown(const CableChoice& choice) {
  if (choice.kind == CableChoice::Kind::none) return "none";
  if (choice.kind == CableChoice::Kind::server) return "server " + choice.server;
  return choice.board.empty() ? "null" : "null, board " + choice.board;
}

}  // namespace

bool DeviceManager::setCable(const char* type, int /*port*/, int baud, bool /*open*/, const char* server,
                             bool /*quiet*/) {
  Result<CableChoice> choice = CableChoice::find(type, server, boardFile_);
  if (!choice) return reportError("%s\n", choice.failure().text);
  disconnect();
  if (const Status prepared = opener_.prepare(*choice); !prepared) return reportError("%s\n", prepared.failure().text);
  const bool changed = choice_.kind != choice->kind || choice_.server != choice->server || choice_.word != choice->word;
  choice_ = std::move(*choice);
  if (baud > 0 && baud != defaultBaud) tckLimit_ = static_cast<std::uint32_t>(baud);
  cableLock_.use(choice_.sharedName);
  // Somebody else's cable is left alone; who asks for the lock is told.
  if (cableLock_.tryLock() && !connect()) {
    cableLock_.unlock();
    choice_ = {};
    return false;
  }
  if (changed) recordStep(stepOf(choice_));
  return true;
}

bool DeviceManager::connect() {
  Result<std::unique_ptr<Cable>> cable = opener_.open(choice_);
  if (!cable) return reportError("%s\n", cable.failure().text);
  cable_ = std::move(*cable);
  const Status limited = cable_->limitTck(tckLimit_);
  return limited.ok() || reportError("%s\n", limited.failure().text);
}

void DeviceManager::disconnect() {
  cable_.reset();
  if (const Status closed = opener_.close(); !closed) reportError("%s\n", closed.failure().text);
}

Cable* DeviceManager::openCable() {
  if (cable_ != nullptr) return cable_.get();
  if (choice_.kind == CableChoice::Kind::none) {
    reportError("No cable is open. Use setCable.\n");
    return nullptr;
  }
  if (!cableLock_.tryLock() && !cableLock_.lock(1)) return nullptr;
  return connect() ? cable_.get() : nullptr;
}

bool DeviceManager::lockCable(int /*kind*/) {
  if (!cableLock_.lock(lockTries())) return false;
  if (choice_.kind == CableChoice::Kind::none || cable_ != nullptr || connect()) return true;
  cableLock_.unlock();
  return false;
}

bool DeviceManager::unlockCable() { return cableLock_.unlock(); }

bool DeviceManager::closeCable(bool /*final*/) {
  disconnect();
  choice_ = {};
  return true;
}

int DeviceManager::setCableSpeed(int speed) {
  if (speed != cableSpeed_) recordStep(Port::format("setCableSpeed -speed %d", speed));
  cableSpeed_ = speed;
  tckLimit_ = speed > 0 ? static_cast<std::uint32_t>(speed) : 0;
  if (cable_ != nullptr)
    if (const Status limited = cable_->limitTck(tckLimit_); !limited) reportError("%s\n", limited.failure().text);
  return cableSpeed_;
}

bool DeviceManager::setCableOption(const char* name, const char* value) {
  if (UT_STR::ICompare(name, "board") == 0) {
    std::error_code problem;
    if (*value != '\0' && !std::filesystem::is_regular_file(value, problem))
      return reportError("Cable option board can't be \"%s\", expected the path of a board file.\n", value);
    boardFile_ = value;
    if (choice_.kind != CableChoice::Kind::board) return true;
    disconnect();
    choice_.board = boardFile_;
    if (const Status prepared = opener_.prepare(choice_); !prepared)
      return reportError("%s\n", prepared.failure().text);
    cableLock_.use(choice_.sharedName);
    return cableLock_.lock(lockTries()) && connect();
  }
  if (UT_STR::ICompare(name, "clean_cable_lock") != 0)
    return reportError("Unknown cable option %s, expected board or clean_cable_lock.\n", name);
  if (UT_STR::ICompare(value, "true") != 0)
    return reportError("Cable option clean_cable_lock can't be \"%s\", expected true.\n", value);
  return cableLock_.clean();
}

bool DeviceManager::runDiagnostics() {
  Cable* cable = openCable();
  if (cable == nullptr) return false;
  const auto tell = [](const std::string& line) { reportStatus("%s\n", line); };
  const Result<CableDiagnostics::Report> report = CableDiagnostics::run(*cable, tell);
  return report.ok() || reportError("%s\n", report.failure().text);
}

bool DeviceManager::info() {
  reportStatus("Cable: %s%s\n", shown(choice_), cableLock_.held() ? ", locked" : "");
  reportStatus("Devices on the chain: %d\n", getDeviceChainCount());
  if (!hasChain(activeMode_)) return true;
  const DeviceChain& devices = chains_[activeMode_];
  for (int i = 0; i < devices.size(); ++i) {
    const ChainDevice& each = devices.at(i);
    const std::string length = each.irLength == 0 ? "unknown" : std::to_string(each.irLength);
    std::string line = each.spi != nullptr ? each.name + ", SPI flash" : each.name + ", IR length " + length;
    if (!each.file.empty()) line += ", file " + each.file;
    for (const auto* flash : {&each.spiFlash, &each.bpiFlash})
      if (*flash) line += ", flash " + (*flash)->partName + ((*flash)->file.empty() ? "" : " file " + (*flash)->file);
    reportStatus("'%d': %s\n", i + 1, line);
  }
  return true;
}
