#pragma once

#include <memory>
#include <string>
#include <vector>

#include "manager/simulator/BoardDescription.h"
#include "manager/simulator/Device.h"
#include "manager/simulator/Noise.h"
#include "manager/simulator/SimulatedBoard.h"
#include "manager/simulator/TapChain.h"

/// The board that a description describes.
class Board : public SimulatedBoard {
 public:
  /// Its state file is not read yet.
  explicit Board(const BoardDescription& description);
  ~Board() override;
  Board(const Board&) = delete;
  Board& operator=(const Board&) = delete;

  /// Reads the state file when there is one.
  Status loadState();

  void clock(bool tms, const BitVector& tdi, BitVector* tdo) override;
  std::uint64_t clockLevels(std::uint64_t tms, std::uint64_t tdi, int count) override;
  void idleClocks(bool tms, std::uint64_t count) override;
  void elapse(double seconds) override;
  void driveResets(bool trst, bool srst) override;
  bool tdo() const override;
  TapState state() const override { return chain_.state(); }
  bool linkUp() const override { return linkBytesLeft() > 0; }
  void countLinkBytes(std::uint64_t bytes) override { linkBytes_ += bytes; }
  std::uint64_t linkBytesLeft() const override;
  void reconnect() override { linkBytes_ = 0; }
  Status save() override;
  std::string name() const override { return name_; }
  std::string lockName() const override;
  std::vector<std::uint8_t> memory(std::size_t device) const override { return devices_[device]->memory(); }
  std::vector<std::uint8_t> spiMemory(std::size_t device) const override;
  std::vector<std::uint8_t> bpiMemory(std::size_t device) const override;
  std::size_t devices() const override { return devices_.size(); }

  /// The file that the description was read from.
  void setPath(std::string path) { path_ = std::move(path); }

 private:
  bool clockOnce(bool tms, bool tdi);
  /// What the faults make of levels of TDO.
  void disturb(BitVector& levels, std::size_t first);
  std::string stateText();

  std::string name_;
  std::string path_;
  std::string statePath_;
  std::optional<bool> stuckTdo_;
  Noise tdoNoise_;
  Noise tdiNoise_;
  std::optional<std::uint64_t> dropAfter_;
  std::uint64_t linkBytes_ = 0;
  bool noisy_;
  bool used_ = false;  ///< something may have changed since the last save

  BoardClock clock_;
  Nets nets_;
  std::vector<std::unique_ptr<Device>> devices_;
  TapChain chain_;
  std::string savedState_;  ///< what the state file holds
};
