#include "manager/chain/DeviceChain.h"

#include "interfaces/portability/FormatArgument.h"

Result<ChainDevice*> DeviceChain::find(int position) {
  if (has(position)) return &at(position);
  if (devices_.empty()) return Failure{Port::format("There is no device %d: the chain is empty.", position + 1)};
  return Failure{Port::format("There is no device %d on the chain, which has %d.", position + 1, size())};
}

Status DeviceChain::insert(int position, ChainDevice device) {
  if (position < 0 || position > size())
    return Failure{Port::format("A device can't be added at position %d: the chain has %d.", position + 1, size())};
  if (size() >= most) return Failure{Port::format("A chain has at most %d devices.", most)};
  devices_.insert(devices_.begin() + position, std::move(device));
  return {};
}

Status DeviceChain::remove(int position) {
  if (const Result<ChainDevice*> device = find(position); !device) return device.failure();
  devices_.erase(devices_.begin() + position);
  return {};
}

Result<std::vector<std::size_t>> DeviceChain::irLengths() const {
  std::vector<std::size_t> lengths;
  for (const ChainDevice& device : devices_) {
    if (device.irLength == 0)
      return Failure{
          Port::format("'%d': The length of the instruction register of %s is not known. "
                       "Use defineDevice to tell it.",
                       lengths.size() + 1, device.name)};
    lengths.push_back(device.irLength);
  }
  return lengths;
}
