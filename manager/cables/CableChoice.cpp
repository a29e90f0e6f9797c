#include "manager/cables/CableChoice.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <string_view>

#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/UT_STR.h"
#include "manager/cables/RemoteCable.h"
#include "manager/cables/SimulatedCable.h"
#include "manager/cables/Socket.h"

namespace {

constexpr const char* choices =
    "There are: port null, the simulated board; any port with -server HOST[:PORT], a remote-bitbang server; port "
    "auto, the server that the environment variable TESSEL_SERVER names.";

/// The port words for drivers of hardware, which hosts bring along.
constexpr std::array hardware{"com", "lpt", "usb", "usb2"};

bool is(const char* type, const char* word) { return UT_STR::ICompare(type, word) == 0; }

}  // namespace

Result<CableChoice> CableChoice::find(const char* type, const char* server, const std::string& board) {
  CableChoice choice;
  choice.word = type == nullptr ? "" : type;
  const bool hardwareWord = type != nullptr && std::ranges::any_of(hardware, [&](auto each) { return is(type, each); });
  const bool known = type == nullptr || hardwareWord || is(type, "auto") || is(type, "null");
  if (!known)
    return Failure{Port::format("Cable %s can't be opened: cables that write files are not built yet.", type)};
  const char* named = server;
  if (named == nullptr && type != nullptr && is(type, "auto")) {
    named = std::getenv("TESSEL_SERVER");
    if (named == nullptr || *named == '\0')
      return Failure{
          Port::format("No cable was found: port auto looked for a server in the environment variable "
                       "TESSEL_SERVER, which is not set. %s",
                       choices)};
  }
  if (named != nullptr) {
    choice.kind = Kind::server;
    choice.server = named;
    const Result<ServerAddress> address = ServerAddress::parse(named, RemoteCable::defaultPort);
    if (!address) return address.failure();
    // One name for one server, however it is written.
    choice.sharedName = "server " + Socket::resolved(*address);
    return choice;
  }
  if (type == nullptr) return Failure{Port::format("The port word names no cable. %s", choices)};
  if (hardwareWord)
    return Failure{Port::format("Cable %s can't be opened: no driver of such hardware is present. %s", type, choices)};
  choice.kind = Kind::board;
  choice.board = board;
  return choice;
}

Result<std::shared_ptr<SimulatedBoard>> CableOpener::read(const std::string& file) {
  if (board_ != nullptr && boardFile_ == file) return board_;
  if (file.empty()) return std::shared_ptr<SimulatedBoard>(SimulatedBoard::makeDefault());
  Result<std::unique_ptr<SimulatedBoard>> board = SimulatedBoard::read(file, parts_);
  if (!board) return board.failure();
  return std::shared_ptr<SimulatedBoard>(std::move(*board));
}

Status CableOpener::prepare(CableChoice& choice) {
  if (choice.kind != CableChoice::Kind::board) return {};
  const Result<std::shared_ptr<SimulatedBoard>> board = read(choice.board);
  if (!board) return board.failure();
  const std::string state = (*board)->lockName();
  choice.sharedName = state.empty() ? "" : "board " + state;
  return {};
}

Result<std::unique_ptr<Cable>> CableOpener::open(const CableChoice& choice) {
  if (choice.kind == CableChoice::Kind::server) {
    Result<std::unique_ptr<RemoteCable>> cable = RemoteCable::connect(choice.server);
    if (!cable) return cable.failure();
    return std::unique_ptr<Cable>(std::move(*cable));
  }
  const Result<std::shared_ptr<SimulatedBoard>> board = read(choice.board);
  if (!board) return board.failure();
  board_ = *board;
  boardFile_ = choice.board;
  return std::unique_ptr<Cable>(std::make_unique<SimulatedCable>(board_));
}

Status CableOpener::close() {
  if (board_ == nullptr || board_->lockName().empty()) return {};
  const Status saved = board_->save();
  board_.reset();
  return saved;
}
