// The board's side of the remote-bitbang protocol. Input: the client's bytes, with 'P' where a piece ends. The answers
// and the board must be those of a decoder that takes one byte at a time, as the protocol is described.

#include <algorithm>
#include <cstdint>
#include <memory>
#include <span>
#include <vector>

#include "manager/simulator/BitbangDecoder.h"
#include "tests/fuzz/Require.h"

namespace {

using fuzz::require;
using Bytes = std::vector<std::uint8_t>;

class PlainDecoder {
 public:
  explicit PlainDecoder(SimulatedBoard& board) : board_(board), tdo_(board.tdo()) {}

  void take(std::uint8_t byte, Bytes& answers) {
    if (ended_) return;
    if (byte >= '0' && byte <= '7') drive(byte - '0');
    if (byte >= 'r' && byte <= 'u') board_.driveResets(byte >= 't', (byte - 'r') % 2 == 1);
    if (byte == 'R') answers.push_back(tdo_ ? '1' : '0');
    ended_ = byte == 'Q';
  }
  bool ended() const { return ended_; }

 private:
  void drive(int pins) {
    const bool tck = (pins & 4) != 0;
    if (tck && !tck_) board_.clockLevels((pins & 2) != 0 ? 1 : 0, (pins & 1) != 0 ? 1 : 0, 1);
    if (!tck && tck_) tdo_ = board_.tdo();
    tck_ = tck;
  }

  SimulatedBoard& board_;
  bool tck_ = false;
  bool tdo_;
  bool ended_ = false;
};

std::unique_ptr<SimulatedBoard> makeBoard() {
  static PartLibrary parts;
  auto board = SimulatedBoard::parse(
      "board",
      R"({"chain": [{"part": "zp18v01"}, {"part": "marlin3-1", "spi": {"part": "m25p05"}}, {"part": "mullet-32"}],
                  "faults": {"flipTdo": {"rate": 0.001, "seed": 1}}})",
      "", parts);
  require(board.ok(), "the board is right");
  return std::move(*board);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const auto board = makeBoard();
  const auto plainBoard = makeBoard();
  BitbangDecoder decoder(*board);
  PlainDecoder plain(*plainBoard);
  Bytes answers;
  Bytes expected;
  std::span<const std::uint8_t> rest(data, size);
  while (!rest.empty()) {
    const auto end = static_cast<std::size_t>(std::find(rest.begin(), rest.end(), 'P') - rest.begin());
    const auto piece = rest.first(end);
    decoder.feed(piece, answers);
    for (const std::uint8_t byte : piece) plain.take(byte, expected);
    rest = rest.subspan(std::min(end + 1, rest.size()));
  }
  require(answers == expected, "the answers are those of single steps");
  require(decoder.ended() == plain.ended(), "both end at Q");
  require(board->state() == plainBoard->state() && board->tdo() == plainBoard->tdo(), "so is the board");
  require(board->memory(0) == plainBoard->memory(0) && board->spiMemory(1) == plainBoard->spiMemory(1),
          "and its memories");
  return 0;
}
