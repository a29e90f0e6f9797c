#include "manager/scan/ScanData.h"

#include <algorithm>

namespace {

constexpr std::size_t shownBits = 64;

/// The digits of some bits of a vector, with dots where there are more.
std::string digits(const BitVector& bits, std::size_t first, std::size_t count) {
  std::string result = first + count < bits.size() ? "..." : "";
  result += bits.slice(first, count).hex();
  if (first > 0) result += "...";
  return result;
}

std::string describe(const BitVector& found, const BitVector& expected, const BitVector* mask, std::size_t place) {
  const std::size_t count = std::min(shownBits, found.size());
  const std::size_t first = std::min(place - place % shownBits, found.size() - count);
  std::string result = "expected " + digits(expected, first, count) + ", found " + digits(found, first, count);
  if (mask != nullptr) result += " (mask " + digits(*mask, first, count) + ')';
  result += " at bit " + std::to_string(place) + " of " + std::to_string(found.size());
  if (count < found.size())
    result += " (bits " + std::to_string(first) + " to " + std::to_string(first + count - 1) + " are shown)";
  return result;
}

}  // namespace

namespace ScanData {

Status compare(const BitVector& found, const BitVector& expected, const BitVector* mask) {
  if (expected.size() != found.size() || (mask != nullptr && mask->size() != found.size()))
    return Failure{.text = "a scan of " + std::to_string(found.size()) + " bits cannot be compared with " +
                           std::to_string(expected.size()) + " bits" +
                           (mask == nullptr ? "" : " under a mask of " + std::to_string(mask->size()))};
  const std::size_t place = firstDifference(found, expected, mask);
  if (place == BitVector::npos) return {};
  return Failure{.text = describe(found, expected, mask, place), .kind = Failure::Kind::mismatch};
}

}  // namespace ScanData
