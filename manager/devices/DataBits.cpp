#include "manager/devices/DataBits.h"

#include <algorithm>

DataBits DataBits::of(const DataImage& image, std::size_t bits) {
  const std::size_t bytes = (bits + 7) / 8;
  DataBits result{.data = BitVector::fromBytes(image.flatten(0, bytes)), .covered = BitVector(bytes * 8)};
  for (const auto& [address, run] : image.runs()) {
    if (address >= bytes) break;
    const std::size_t count = std::min<std::size_t>(run.size(), bytes - address) * 8;
    result.covered.copy(address * 8, BitVector(count, true), 0, count);
  }
  result.data.resize(bits);
  result.covered.resize(bits);
  return result;
}

DataBits DataBits::blank(std::size_t bits) { return {.data = BitVector(bits, true), .covered = BitVector(bits, true)}; }

BitVector DataBits::difference(const BitVector& found, const BitVector& mask) const {
  BitVector result = found;
  const auto words = result.words();
  for (std::size_t i = 0; i < words.size(); ++i)
    words[i] = (words[i] ^ data.words()[i]) & covered.words()[i] & mask.words()[i];
  return result;
}

bool ImageWindows::next() {
  const std::uint64_t reached = first_ + count_;
  while (run_ != end_ && run_->first + run_->second.size() <= reached) ++run_;
  if (run_ == end_) return false;
  first_ = std::max(run_->first, reached);
  const std::uint64_t blockEnd = (first_ / blockSize_ + 1) * blockSize_;
  std::uint64_t last = first_;
  for (; run_ != end_ && run_->first < blockEnd; ++run_) {
    last = std::min<std::uint64_t>(run_->first + run_->second.size(), blockEnd);
    if (last == blockEnd) break;
  }
  count_ = last - first_;
  return true;
}

namespace {

void addRun(Comparison& comparison, std::uint64_t address, std::span<const std::uint8_t> expected,
            std::span<const std::uint8_t> found) {
  comparison.compared += found.size();
  if (std::equal(found.begin(), found.end(), expected.begin())) return;
  for (std::size_t i = 0; i < found.size(); ++i) {
    if (found[i] == expected[i]) continue;
    if (comparison.differences++ != 0) continue;
    comparison.firstAddress = address + i;
    comparison.expected = expected[i];
    comparison.found = found[i];
  }
}

}  // namespace

void DataCompare::add(Comparison& comparison, const DataImage* image, std::uint64_t first,
                      std::span<const std::uint8_t> found, std::uint8_t blank) {
  if (image == nullptr) return addRun(comparison, first, std::vector<std::uint8_t>(found.size(), blank), found);
  const std::uint64_t last = first + found.size();
  auto run = image->runs().upper_bound(first);
  if (run != image->runs().begin()) --run;
  for (; run != image->runs().end() && run->first < last; ++run) {
    const std::uint64_t from = std::max(run->first, first);
    const std::uint64_t to = std::min<std::uint64_t>(run->first + run->second.size(), last);
    if (from >= to) continue;
    addRun(comparison, from, std::span(run->second).subspan(from - run->first, to - from),
           found.subspan(from - first, to - from));
  }
}

Failure DataCompare::failure(const Comparison& comparison) {
  return {.text = "the verification failed: " + std::to_string(comparison.differences) + " of " +
                  std::to_string(comparison.compared) + " bytes differ, the first at address " +
                  hex(comparison.firstAddress) + ": expected " + hex(comparison.expected, 2) + ", found " +
                  hex(comparison.found, 2),
          .kind = Failure::Kind::mismatch};
}

std::uint64_t DataCompare::count(const DataImage& image) {
  std::uint64_t bytes = 0;
  for (const auto& [address, run] : image.runs()) bytes += run.size();
  return bytes;
}

Status DataCompare::fits(const DataImage& image, std::uint64_t size) {
  if (image.empty()) return Failure{.text = "there are no data"};
  if (image.end() <= size) return {};
  return Failure{.text = "the data go up to address " + hex(image.end() - 1) + ", the memory ends at " +
                         hex(size == 0 ? 0 : size - 1)};
}

Status DataCompare::inside(std::uint64_t first, std::uint64_t bytes, std::uint64_t size) {
  if (first <= size && bytes <= size - first) return {};
  return Failure{.text = std::to_string(bytes) + " bytes from address " + hex(first) +
                         " on are not inside the memory of " + std::to_string(size) + " bytes"};
}

std::string DataCompare::hex(std::uint64_t number, int digits) {
  std::string text;
  for (int shift = 60; shift >= 0; shift -= 4)
    if (!text.empty() || number >> shift != 0 || shift < 4 * digits) text += "0123456789ABCDEF"[number >> shift & 15U];
  return "0x" + text;
}
