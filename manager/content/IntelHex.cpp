#include <algorithm>
#include <array>
#include <cstdint>
#include <numeric>
#include <optional>
#include <span>
#include <vector>

#include "manager/content/Formats.h"
#include "manager/content/RecordSet.h"

namespace {

constexpr std::uint64_t addressSpace = std::uint64_t{1} << 32;
constexpr std::uint32_t bankSize = 0x10000;
constexpr std::size_t bytesPerRecord = 16;

enum Type : std::uint8_t { data, endOfFile, segment, segmentStart, linear, linearStart };
/// How many bytes of data a record of a type has; any number for data.
constexpr std::array<std::optional<std::uint8_t>, 6> lengths = {std::nullopt, 0, 2, 4, 2, 4};

class Reader {
 public:
  Reader(std::string_view name, std::string_view text) : line_(name, text) {}

  Result<DataImage> read() {
    while (line_.next()) {
      if (ended_) return line_.failureAt(line_.place(), "expected nothing after the end record");
      TESSEL_TRY(readRecord());
    }
    if (!ended_) return line_.failureAt(line_.place(), "expected an end record (:00000001FF)");
    return records_.image(line_);
  }

 private:
  Status readRecord() {
    start_ = line_.place();
    record_.clear();
    TESSEL_TRY(line_.mark(':', "expected ':' before a record"));
    TESSEL_TRY(line_.bytes(4, record_));
    const std::uint8_t length = record_[0];
    const std::uint8_t type = record_[3];
    if (type >= lengths.size())
      return line_.failureAt(start_ + 7, "unknown record type " + HexDigits::number(type, 2) + ", expected 00 to 05");
    if (const auto wanted = lengths[type]; wanted && *wanted != length)
      return line_.failureAt(start_ + 1, "a record of type " + HexDigits::number(type, 2) + " has " +
                                             std::to_string(*wanted) + " bytes of data, not " + std::to_string(length));
    TESSEL_TRY(line_.bytes(length + std::size_t{1}, record_));
    TESSEL_TRY(line_.end());
    const int sum = std::accumulate(record_.begin(), record_.end() - 1, 0);
    const auto wanted = static_cast<std::uint8_t>(-sum);
    if (record_.back() != wanted)
      return line_.failureAt(line_.place() - 2, "wrong checksum, expected " + HexDigits::number(wanted, 2));
    return act(type, std::span(record_).subspan(4, length));
  }

  Status act(std::uint8_t type, std::span<const std::uint8_t> bytes) {
    if (type == data) return addData(bytes);
    if (type == endOfFile) ended_ = true;
    if (type == segment || type == linear) {
      const std::uint64_t upper = static_cast<std::uint64_t>(bytes[0]) << 8 | bytes[1];
      base_ = upper << (type == linear ? 16 : 4);
      wraps_ = type == segment;
    }
    return {};
  }

  Status addData(std::span<const std::uint8_t> bytes) {
    const std::uint32_t offset = static_cast<std::uint32_t>(record_[1]) << 8 | record_[2];
    const std::size_t place = start_ + 9;
    // Inside a segment the offset counts modulo 2^16.
    const std::size_t first = wraps_ ? std::min<std::size_t>(bytes.size(), bankSize - offset) : bytes.size();
    if (base_ + offset + first > addressSpace) return line_.failureAt(place, "the data go beyond address FFFFFFFF");
    records_.add(base_ + offset, bytes.first(first), place);
    if (first < bytes.size()) records_.add(base_, bytes.subspan(first), place + 2 * first);
    return {};
  }

  RecordLine line_;
  RecordSet records_;
  std::vector<std::uint8_t> record_;  ///< the bytes of the record's digits
  std::size_t start_ = 0;             ///< of the record in the text
  std::uint64_t base_ = 0;
  bool wraps_ = false;
  bool ended_ = false;
};

void appendRecord(std::string& text, Type type, std::uint32_t offset, std::span<const std::uint8_t> bytes) {
  const std::array<std::uint8_t, 4> head = {static_cast<std::uint8_t>(bytes.size()),
                                            static_cast<std::uint8_t>(offset >> 8), static_cast<std::uint8_t>(offset),
                                            type};
  int sum = 0;
  text += ':';
  for (const std::span<const std::uint8_t> part : {std::span<const std::uint8_t>(head), bytes})
    for (const std::uint8_t byte : part) {
      HexDigits::append(text, byte);
      sum += byte;
    }
  HexDigits::append(text, static_cast<std::uint8_t>(-sum));
  text += '\n';
}

}  // namespace

Result<DataImage> IntelHex::parse(std::string_view name, std::string_view text) { return Reader(name, text).read(); }

std::string IntelHex::format(const DataImage& image) {
  std::string text;
  std::uint64_t bank = 0;
  for (const auto& [start, bytes] : image.runs())
    for (std::size_t done = 0; done < bytes.size();) {
      const std::uint64_t address = start + done;
      const auto offset = static_cast<std::uint32_t>(address % bankSize);
      if (address / bankSize != bank) {
        bank = address / bankSize;
        const std::array<std::uint8_t, 2> upper = {static_cast<std::uint8_t>(bank >> 8),
                                                   static_cast<std::uint8_t>(bank)};
        appendRecord(text, linear, 0, upper);
      }
      const std::size_t count = std::min({bytesPerRecord, bytes.size() - done, std::size_t{bankSize} - offset});
      appendRecord(text, data, offset, std::span(bytes).subspan(done, count));
      done += count;
    }
  appendRecord(text, endOfFile, 0, {});
  return text;
}
