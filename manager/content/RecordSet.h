#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

#include "manager/content/DataImage.h"
#include "manager/content/RecordLine.h"

/// The data records of a file, in any order, until all are there.
class RecordSet {
 public:
  /// Data at an address; the digits begin at `place` of the text.
  void add(std::uint64_t address, std::span<const std::uint8_t> bytes, std::size_t place);
  /// How many records were added.
  std::size_t count() const { return records_.size(); }
  /// The image of all records; `line` tells places. Fails when two records give an address different bytes.
  Result<DataImage> image(const RecordLine& line) const;

 private:
  struct Record {
    std::uint64_t address;
    std::size_t place;
    std::size_t first;  ///< of its bytes
    std::size_t size;
  };
  std::span<const std::uint8_t> bytesOf(const Record& record) const {
    return std::span(bytes_).subspan(record.first, record.size);
  }
  Failure contradiction(const RecordLine& line, const Record& later, const DataImage& image) const;

  std::vector<Record> records_;
  std::vector<std::uint8_t> bytes_;
};
