// tessel-board: serves a simulated board to remote-bitbang clients.

#include <CLI/CLI.hpp>
#include <csignal>
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "interfaces/portability/OwnedFile.h"
#include "manager/content/Bitstream.h"
#include "manager/content/DataFile.h"
#include "manager/content/FileAccess.h"
#include "manager/simulator/BoardLock.h"
#include "manager/simulator/BoardServer.h"

namespace {

enum ExitCode { succeeded = 0, failed = 1, wrongUsage = 2 };

struct Options {
  std::string board;
  std::string listen = "127.0.0.1:3335";
  bool once = false;
  std::vector<std::string> bitstream;  ///< part and file
  std::string content;
  std::string usercode = "FFFFFFFF";
  bool listParts = false;
  std::vector<std::string> partDirectories;
};

/// Whom a signal tells to stop.
BoardServer* server = nullptr;

extern "C" void stopServer(int /*signal*/) { server->stop(); }

int fail(const std::string& text) {
  std::fprintf(stderr, "tessel-board: %s\n", text.c_str());
  return failed;
}

int misuse(const std::string& text) {
  fail(text);
  return wrongUsage;
}

int makeBitstream(const Options& options, PartLibrary& parts) {
  const Result<PartPointer> part = parts.find(options.bitstream[0]);
  if (!part) return fail(part.failure().text);
  if ((*part)->kind != Part::Kind::fpga || (*part)->idcodes.empty() || (*part)->memoryBits == 0)
    return fail("the part \"" + (*part)->name + "\" takes no bitstream");
  const auto usercode = BitVector::fromHex(options.usercode, 32);
  if (!usercode || options.usercode.empty()) return misuse("--usercode: expected at most 8 hex digits");
  std::vector<std::uint8_t> content;
  if (!options.content.empty()) {
    const Result<std::string> text = FileAccess::read(options.content, (*part)->memoryBits / 8);
    if (!text) return fail(text.failure().text);
    content.assign(text->begin(), text->end());
  }
  const auto idcode = static_cast<std::uint32_t>((*part)->idcodes.front().value.number(0, 32));
  const auto bytes =
      Bitstream::make(idcode, (*part)->memoryBits / 8, static_cast<std::uint32_t>(usercode->number()), content);
  const Status written = FileAccess::replace(options.bitstream[1], std::string(bytes.begin(), bytes.end()));
  return written ? succeeded : fail(written.failure().text);
}

Result<std::unique_ptr<SimulatedBoard>> readBoard(const Options& options, PartLibrary& parts) {
  if (options.board.empty()) return SimulatedBoard::makeDefault();
  return SimulatedBoard::read(options.board, parts);
}

int serve(const Options& options, PartLibrary& parts) {
  const std::size_t colon = options.listen.rfind(':');
  if (colon == std::string::npos || colon + 1 == options.listen.size())
    return misuse("--listen: expected HOST:PORT, found \"" + options.listen + "\"");
  const std::string port = options.listen.substr(colon + 1);
  if (port.size() > 5 || port.find_first_not_of("0123456789") != std::string::npos || std::stoi(port) > 65535)
    return misuse("--listen: expected a port from 0 to 65535, found \"" + port + "\"");
  std::string host = options.listen.substr(0, colon);
  if (host.size() > 1 && host.front() == '[' && host.back() == ']') host = host.substr(1, host.size() - 2);

  BoardLock lock;
  Result<std::unique_ptr<SimulatedBoard>> board = readBoard(options, parts);
  if (!board) return fail(board.failure().text);
  const std::string lockName = (*board)->lockName();
  if (const Status locked = lock.take(lockName); !locked) return fail(locked.failure().text);
  // Whoever had the lock before may have changed the state meanwhile.
  if (!lockName.empty()) board = readBoard(options, parts);
  if (!board) return fail(board.failure().text);
  BoardServer boardServer(**board);
  if (const Status listening = boardServer.listen(host, port); !listening) return fail(listening.failure().text);
  server = &boardServer;
  std::signal(SIGINT, stopServer);
  std::signal(SIGTERM, stopServer);
  std::printf("Listening on %s\n", boardServer.address().c_str());
  std::fflush(stdout);
  Status served = boardServer.run(options.once);
  std::signal(SIGINT, SIG_DFL);
  std::signal(SIGTERM, SIG_DFL);
  if (served) served = (*board)->save();
  return served ? succeeded : fail(served.failure().text);
}

}  // namespace

int main(int argc, char** argv) {
  CLI::App app("Serves a simulated board to a remote-bitbang client.", "tessel-board");
  Options options;
  app.add_option("BOARD", options.board, "Board file (docs/boards.md); without it the default board");
  app.add_option("--listen", options.listen, "HOST:PORT; port 0 has one chosen")->capture_default_str();
  app.add_flag("--once", options.once, "End when the first client has gone");
  app.add_option("--parts", options.partDirectories, "Directory with BSDL files; may be repeated");
  app.add_option("--bitstream", options.bitstream, "PART FILE: write a valid bitstream for a part, and leave")
      ->expected(2);
  app.add_option("--content", options.content, "File whose bytes the bitstream has as configuration data");
  app.add_option("--usercode", options.usercode, "User code of the bitstream, hex")->capture_default_str();
  app.add_flag("--list-parts", options.listParts, "Print the names of the built-in parts, and leave");
  app.set_version_flag("--version", "tessel-board " TESSEL_VERSION);
  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    return app.exit(error) == 0 ? succeeded : wrongUsage;
  }
  if (options.listParts) {
    for (const std::string& name : PartLibrary::builtInNames()) std::printf("%s\n", name.c_str());
    return succeeded;
  }
  PartLibrary parts(options.partDirectories);
  return options.bitstream.empty() ? serve(options, parts) : makeBitstream(options, parts);
}
