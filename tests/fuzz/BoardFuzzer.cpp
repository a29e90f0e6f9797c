// Board files. Input: the file. A board that it describes is clocked a little: its memories must be those described.

#include <cstdint>
#include <string>
#include <string_view>

#include "manager/simulator/Board.h"
#include "manager/simulator/BoardFile.h"
#include "tests/fuzz/Require.h"

namespace {

using fuzz::require;

/// Larger boards take too long to make again and again.
constexpr std::uint64_t mostMemory = 8 << 20;

void clock(SimulatedBoard& board) {
  board.clockLevels(0b0010'11111, 0, 9);
  require(board.state() == TapState::drShift, "five clocks of high TMS reset every board");
  BitVector tdo;
  board.clock(false, BitVector(1000, true), &tdo);
  require(tdo.size() == 1000, "each clock gives a level");
  board.idleClocks(true, 5);
  require(board.state() == TapState::reset, "and so again");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static PartLibrary parts;
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  // No file is there: what the input names can't be read.
  Result<BoardDescription> description = BoardFile::parse("board.json", text, "/nowhere", parts);
  if (!description) {
    require(description.failure().text.starts_with("board.json"), "a failure names the file");
    return 0;
  }
  require(description->devices.size() <= BoardFile::mostDevices, "chains are bounded");
  require(BoardFile::memoryBytes(*description) <= BoardFile::mostMemory, "memories are bounded");
  if (BoardFile::memoryBytes(*description) > mostMemory) return 0;
  description->statePath.clear();
  Board board(*description);
  clock(board);
  for (std::size_t i = 0; i < board.devices(); ++i) {
    const bool flash = description->devices[i].spi.has_value();
    require(board.spiMemory(i).empty() != flash, "flash is where the file has it");
  }
  return 0;
}
