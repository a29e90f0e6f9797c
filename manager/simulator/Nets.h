#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

/// The levels of a board's pins. Pins that no net joins with others are nets of their own. A net that nobody drives
/// keeps its last level, at first low; drivers that disagree give low.
class Nets {
 public:
  using Pin = std::pair<std::size_t, std::string>;  ///< device and port, in lower case

  /// The net of a pin, which is made when there is none.
  std::size_t netOf(const Pin& pin);
  /// Joins a pin to the net of another one. Before anyone drives them.
  void join(const Pin& pin, const Pin& other) { nets_[pin] = netOf(other); }
  void drive(std::size_t net, std::size_t device, std::optional<bool> level);
  bool level(std::size_t net) const { return levels_[net].level; }

 private:
  struct Level {
    std::map<std::size_t, bool> drivers;  ///< by device
    bool level = false;
  };

  std::map<Pin, std::size_t> nets_;
  std::vector<Level> levels_;
};
