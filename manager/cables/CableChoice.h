#pragma once

#include <memory>
#include <string>

#include "manager/parts/PartLibrary.h"
#include "manager/scan/Cable.h"
#include "manager/simulator/SimulatedBoard.h"

/// Which cable a user asked for, and opening it.
struct CableChoice {
  enum class Kind { none, board, server };

  Kind kind = Kind::none;
  std::string word;    ///< the port word's type, for messages: "null", "usb", "auto"
  std::string server;  ///< of Kind::server
  std::string board;   ///< of Kind::board: the board file, empty for the default board

  /// What two sessions must not use at once, as a text; empty when no one else can reach it.
  std::string sharedName;

  /// Finds the cable that a port word and a server mean. `type` is as DeviceManagerInterface::setCable has it.
  /// The failure says what was looked for and which choices there are.
  static Result<CableChoice> find(const char* type, const char* server, const std::string& board);
};

/// Opens cables. A simulated board without a state file is kept from one opening to the next, so that its memories
/// stay; one with a state file is read when its cable is opened and written when it is closed.
class CableOpener {
 public:
  explicit CableOpener(PartLibrary& parts) : parts_(parts) {}

  /// Finds out the `sharedName` of a choice: the cable is opened only when nobody else has that.
  Status prepare(CableChoice& choice);
  Result<std::unique_ptr<Cable>> open(const CableChoice& choice);
  /// The cable is gone: writes the board's state.
  Status close();

 private:
  Result<std::shared_ptr<SimulatedBoard>> read(const std::string& file);

  PartLibrary& parts_;
  std::shared_ptr<SimulatedBoard> board_;
  std::string boardFile_;
};
