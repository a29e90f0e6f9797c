#include "manager/parts/Nearness.h"

#include <algorithm>
#include <utility>

namespace {

constexpr std::size_t mostNames = 3;
constexpr std::size_t longestName = 64;

/// How many characters have to be put in, left out or changed.
std::size_t distance(std::string_view left, std::string_view right) {
  std::vector<std::size_t> row(right.size() + 1);
  for (std::size_t j = 0; j < row.size(); ++j) row[j] = j;
  for (std::size_t i = 0; i < left.size(); ++i) {
    std::size_t diagonal = std::exchange(row[0], i + 1);
    for (std::size_t j = 0; j < right.size(); ++j) {
      const std::size_t changed = diagonal + (left[i] == right[j] ? 0 : 1);
      diagonal = row[j + 1];
      row[j + 1] = std::min({changed, row[j] + 1, diagonal + 1});
    }
  }
  return row.back();
}

}  // namespace

std::vector<std::string> nearNames(std::string_view wanted, const std::vector<std::string>& names) {
  if (wanted.empty() || wanted.size() > longestName) return {};
  const std::size_t most = std::max<std::size_t>(1, wanted.size() / 3);
  std::vector<std::pair<std::size_t, std::string>> near;
  for (const std::string& name : names) {
    if (name.size() > longestName) continue;
    const bool begins = wanted.size() >= 3 && name.starts_with(wanted);
    const std::size_t difference = begins ? 1 : distance(wanted, name);
    if (difference <= most) near.emplace_back(difference, name);
  }
  std::sort(near.begin(), near.end());
  near.erase(std::unique(near.begin(), near.end()), near.end());
  if (near.size() > mostNames) near.resize(mostNames);
  std::vector<std::string> result;
  for (auto& [difference, name] : near) result.push_back(std::move(name));
  return result;
}
