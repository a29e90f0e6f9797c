#include "manager/content/DataImage.h"

#include <algorithm>

namespace {

/// Whether the bytes that a run and new ones have in common are the same.
bool agree(const DataImage::Runs::value_type& run, std::uint64_t address, std::span<const std::uint8_t> bytes) {
  const std::uint64_t first = std::max(run.first, address);
  const std::uint64_t last = std::min(run.first + run.second.size(), address + bytes.size());
  if (first >= last) return true;
  const auto count = static_cast<std::ptrdiff_t>(last - first);
  const auto old = run.second.begin() + static_cast<std::ptrdiff_t>(first - run.first);
  return std::equal(old, old + count, bytes.begin() + static_cast<std::ptrdiff_t>(first - address));
}

}  // namespace

bool DataImage::add(std::uint64_t address, std::span<const std::uint8_t> bytes) {
  if (bytes.empty()) return true;
  const std::uint64_t last = address + bytes.size();
  auto place = runs_.upper_bound(address);
  if (place != runs_.begin()) {
    const auto before = std::prev(place);
    if (before->first + before->second.size() >= address) place = before;
  }
  for (auto run = place; run != runs_.end() && run->first < last; ++run)
    if (!agree(*run, address, bytes)) return false;

  if (place == runs_.end() || place->first > address) place = runs_.emplace_hint(place, address, Runs::mapped_type());
  auto& joined = place->second;
  const auto known = static_cast<std::ptrdiff_t>(place->first + joined.size() - address);
  if (known < std::ssize(bytes)) joined.insert(joined.end(), bytes.begin() + known, bytes.end());
  for (auto next = std::next(place); next != runs_.end(); next = runs_.erase(next)) {
    const std::uint64_t reached = place->first + joined.size();
    if (next->first > reached) break;
    const std::uint64_t overlap = reached - next->first;
    if (overlap < next->second.size())
      joined.insert(joined.end(), next->second.begin() + static_cast<std::ptrdiff_t>(overlap), next->second.end());
  }
  return true;
}

std::uint64_t DataImage::end() const {
  return runs_.empty() ? 0 : runs_.rbegin()->first + runs_.rbegin()->second.size();
}

std::vector<std::uint8_t> DataImage::flatten(std::uint64_t first, std::uint64_t size, std::uint8_t fill) const {
  std::vector<std::uint8_t> bytes(size, fill);
  auto run = runs_.upper_bound(first);
  if (run != runs_.begin()) --run;
  for (; run != runs_.end() && run->first < first + size; ++run) {
    const std::uint64_t from = std::max(run->first, first);
    const std::uint64_t to = std::min(run->first + run->second.size(), first + size);
    if (from >= to) continue;
    std::copy_n(run->second.begin() + static_cast<std::ptrdiff_t>(from - run->first), to - from,
                bytes.begin() + static_cast<std::ptrdiff_t>(from - first));
  }
  return bytes;
}
