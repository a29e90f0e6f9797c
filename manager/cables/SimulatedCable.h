#pragma once

#include <memory>

#include "manager/scan/BitCable.h"
#include "manager/simulator/SimulatedBoard.h"

/// The cable to a simulated board in this process. Waiting takes no time here: the board's own time goes on.
class SimulatedCable : public BitCable {
 public:
  explicit SimulatedCable(std::shared_ptr<SimulatedBoard> board);

  Status flush() override { return {}; }
  /// The board's TCK is what its file says; a limit changes nothing.
  Status limitTck(std::uint32_t /*hertz*/) override { return {}; }
  Status driveResets(bool trst, bool srst) override;
  std::string description() const override;
  SimulatedBoard& board() { return *board_; }

 protected:
  Status link() const override;
  Status shift(const BitVector& tdi, bool lastTms, BitVector* tdo) override;
  Status clockTms(std::uint32_t tms, int count) override;
  Status idleClocks(bool tms, std::uint64_t count) override;
  Status clockLevels(const BitVector& tms, const BitVector& tdi, BitVector* tdo) override;
  Status wait(double seconds) override;

 private:
  /// Counts clocks as the bytes of a link and fails when the link is gone.
  Status pass(std::uint64_t clocks);

  std::shared_ptr<SimulatedBoard> board_;
  bool dropped_ = false;
};
