#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "manager/parts/PartLibrary.h"
#include "manager/scan/BitVector.h"
#include "manager/scan/TapState.h"
#include "manager/support/Result.h"

/// A board that is simulated bit by bit: a chain of TAPs with memories behind them. Its time goes on with its
/// clocks (one period of the board file's "tck" each) and by `elapse`. One thread.
class SimulatedBoard {
 public:
  /// Reads a board file (docs/boards.md), and the state file that it names when that is there.
  static Result<std::unique_ptr<SimulatedBoard>> read(const std::string& path, PartLibrary& parts);
  /// `directory` is what the board's relative paths start from.
  static Result<std::unique_ptr<SimulatedBoard>> parse(std::string_view name, std::string_view text,
                                                       const std::string& directory, PartLibrary& parts);
  /// The board that port null has until another one is chosen.
  static std::unique_ptr<SimulatedBoard> makeDefault();

  virtual ~SimulatedBoard() = default;

  /// Clocks as many times as `tdi` has bits, with one TMS level. `tdo`, when not null, is appended the levels at the
  /// rises of TCK.
  virtual void clock(bool tms, const BitVector& tdi, BitVector* tdo) = 0;
  /// Clocks up to 64 times with levels of their own, bit 0 first; gives the TDO levels.
  virtual std::uint64_t clockLevels(std::uint64_t tms, std::uint64_t tdi, int count) = 0;
  /// Clocks many times with one TMS level, TDI low.
  virtual void idleClocks(bool tms, std::uint64_t count) = 0;
  /// Lets time pass.
  virtual void elapse(double seconds) = 0;
  virtual void driveResets(bool trst, bool srst) = 0;
  /// TDO now, before the next rise of TCK.
  virtual bool tdo() const = 0;
  virtual TapState state() const = 0;
  /// False once the fault "link drops" struck: the server or cable must end the connection.
  virtual bool linkUp() const = 0;
  /// Counts bytes of the link for that fault; in process, one byte stands for eight clocks.
  virtual void countLinkBytes(std::uint64_t bytes) = 0;
  /// How many more bytes the link carries before that fault strikes; the highest number when it never does.
  virtual std::uint64_t linkBytesLeft() const = 0;
  /// The link was made again.
  virtual void reconnect() = 0;

  /// Writes the state file, when the board has one. Done at the end, too.
  virtual Status save() = 0;
  /// The name of the file, or "default".
  virtual std::string name() const = 0;
  /// The state file's path, else the board file's: what two sessions must not use at once. Empty for a board
  /// without either.
  virtual std::string lockName() const = 0;

  // For tests: what is in the devices, device 0 first.
  virtual std::vector<std::uint8_t> memory(std::size_t device) const = 0;
  virtual std::vector<std::uint8_t> spiMemory(std::size_t device) const = 0;
  virtual std::vector<std::uint8_t> bpiMemory(std::size_t device) const = 0;
  virtual std::size_t devices() const = 0;
};
