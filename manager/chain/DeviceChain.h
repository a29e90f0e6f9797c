#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "manager/chain/ChainDevice.h"
#include "manager/support/Result.h"

/// The devices of a chain in their order, device 0 the first behind TDI. Positions count from 0 here and from 1 in
/// the texts of failures.
class DeviceChain {
 public:
  static constexpr int most = 256;

  int size() const { return static_cast<int>(devices_.size()); }
  bool has(int position) const { return position >= 0 && position < size(); }
  ChainDevice& at(int position) { return devices_[static_cast<std::size_t>(position)]; }
  const ChainDevice& at(int position) const { return devices_[static_cast<std::size_t>(position)]; }

  /// The device, or a failure that names the position and the chain's length.
  Result<ChainDevice*> find(int position);
  /// Puts a device in front of the one at `position`, or behind the last one.
  Status insert(int position, ChainDevice device);
  Status remove(int position);
  void clear() { devices_.clear(); }

  /// The lengths of the instruction registers; the failure names the first device whose length is not known.
  Result<std::vector<std::size_t>> irLengths() const;

 private:
  std::vector<ChainDevice> devices_;
};
