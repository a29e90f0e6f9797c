#include "manager/content/RecordSet.h"

#include <algorithm>
#include <functional>
#include <string>

void RecordSet::add(std::uint64_t address, std::span<const std::uint8_t> bytes, std::size_t place) {
  records_.push_back({.address = address, .place = place, .first = bytes_.size(), .size = bytes.size()});
  bytes_.insert(bytes_.end(), bytes.begin(), bytes.end());
}

Result<DataImage> RecordSet::image(const RecordLine& line) const {
  // An image grows in linear time only when its runs come in the order of their addresses.
  std::vector<Record> sorted = records_;
  std::stable_sort(sorted.begin(), sorted.end(),
                   [](const Record& left, const Record& right) { return left.address < right.address; });
  DataImage image;
  for (const Record& record : sorted)
    if (!image.add(record.address, bytesOf(record))) return contradiction(line, record, image);
  return image;
}

/// Tells of the first byte of `refused` that `image` has otherwise. The sorting may have put the earlier record last,
/// so the file is gone through once more for the place where the address gets its second value.
Failure RecordSet::contradiction(const RecordLine& line, const Record& refused, const DataImage& image) const {
  const std::vector<std::uint8_t> old = image.flatten(refused.address, refused.size, 0);
  const std::vector<std::uint8_t> fill = image.flatten(refused.address, refused.size, 1);
  const std::span<const std::uint8_t> bytes = bytesOf(refused);
  std::size_t offset = 0;
  while (old[offset] == bytes[offset] || old[offset] != fill[offset]) ++offset;
  const std::uint64_t address = refused.address + offset;

  const Record* earlier = nullptr;
  for (const Record& record : records_) {
    if (address < record.address || address - record.address >= record.size) continue;
    const std::size_t at = address - record.address;
    const std::uint8_t value = bytesOf(record)[at];
    if (earlier == nullptr) {
      earlier = &record;
      continue;
    }
    const std::uint8_t first = bytesOf(*earlier)[address - earlier->address];
    if (value != first)
      return line.failureAt(record.place + 2 * at, "address " + HexDigits::number(address, 4) + " gets " +
                                                       HexDigits::number(value, 2) + ", an earlier record gave it " +
                                                       HexDigits::number(first, 2));
  }
  return line.failureAt(refused.place, "address " + HexDigits::number(address, 4) + " gets two values");
}
