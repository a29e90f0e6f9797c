#pragma once

#include <memory>
#include <string>
#include <vector>

#include "manager/parts/PartLibrary.h"
#include "manager/simulator/SimulatedBoard.h"

/// Drives a board's chain by plain scans that end in Run-Test/Idle, one device at a time, the others in BYPASS.
class Jtag {
 public:
  /// Begins with a reset. `parts` are those of the board, device 0 first.
  Jtag(SimulatedBoard& board, std::vector<PartPointer> parts);

  /// Loads an instruction into one device; gives what its register captured.
  BitVector load(std::size_t device, const std::string& instruction);
  /// Loads an opcode of one's own choice into one device, or BYPASS when it is empty.
  BitVector loadOpcode(std::size_t device, const BitVector& opcode);
  /// Loads an instruction into all devices.
  void loadAll(const std::string& instruction);
  /// Scans the data registers of all devices, the one next to TDO first.
  BitVector scanData(const BitVector& out);
  /// Scans that device's data register; all others are in BYPASS.
  BitVector data(std::size_t device, const BitVector& out);
  std::uint64_t data(std::size_t device, std::uint64_t out, std::size_t bits);
  /// Loads an instruction and scans.
  std::uint64_t access(std::size_t device, const std::string& instruction, std::uint64_t out, std::size_t bits);
  void wait(double seconds) { board_.elapse(seconds); }
  void idle(std::uint64_t clocks) { board_.idleClocks(false, clocks); }
  void reset();

  SimulatedBoard& board() { return board_; }
  std::size_t size() const { return parts_.size(); }

 private:
  /// Shifts from Shift-DR or Shift-IR and returns to Run-Test/Idle.
  BitVector shift(const BitVector& out);

  SimulatedBoard& board_;
  std::vector<PartPointer> parts_;
};

/// A board of a text, with the parts that its chain has and a way to drive it.
struct TestBoard {
  explicit TestBoard(const std::string& json, const std::string& directory = "");

  PartLibrary parts;
  std::unique_ptr<SimulatedBoard> board;  ///< null when the text was refused
  std::string failure;
};

/// The chain of a board whose parts are `names`.
std::vector<PartPointer> findParts(PartLibrary& parts, const std::vector<std::string>& names);
/// Pseudo-random bits, the same for the same seed.
BitVector randomBits(std::size_t size, std::uint64_t seed);
