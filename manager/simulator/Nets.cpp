#include "manager/simulator/Nets.h"

#include <algorithm>

std::size_t Nets::netOf(const Pin& pin) {
  const auto [place, isNew] = nets_.emplace(pin, levels_.size());
  if (isNew) levels_.emplace_back();
  return place->second;
}

void Nets::drive(std::size_t net, std::size_t device, std::optional<bool> level) {
  Level& here = levels_[net];
  here.drivers.erase(device);
  if (level) here.drivers.emplace(device, *level);
  if (here.drivers.empty()) return;
  here.level = std::all_of(here.drivers.begin(), here.drivers.end(), [](const auto& driver) { return driver.second; });
}
