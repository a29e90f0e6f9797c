#pragma once

#include <cstdint>
#include <map>
#include <span>
#include <vector>

/// Bytes by address, with holes. Runs never touch or overlap.
class DataImage {
 public:
  using Runs = std::map<std::uint64_t, std::vector<std::uint8_t>>;

  /// False, and nothing changes, when a byte that is there already would get another value.
  bool add(std::uint64_t address, std::span<const std::uint8_t> bytes);
  const Runs& runs() const { return runs_; }
  bool empty() const { return runs_.empty(); }
  /// One past the last byte; 0 when there is none.
  std::uint64_t end() const;
  /// `size` bytes from `first` on, holes filled.
  std::vector<std::uint8_t> flatten(std::uint64_t first, std::uint64_t size, std::uint8_t fill = 0xFF) const;

  bool operator==(const DataImage&) const = default;

 private:
  Runs runs_;
};
