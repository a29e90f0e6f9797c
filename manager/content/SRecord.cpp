#include <algorithm>
#include <array>
#include <cstdint>
#include <numeric>
#include <span>
#include <vector>

#include "manager/content/Formats.h"
#include "manager/content/RecordSet.h"

namespace {

constexpr std::size_t bytesPerRecord = 16;
constexpr std::string_view headerText = "tessel";

enum class Kind { header, data, count, end, unknown };
struct Type {
  Kind kind;
  std::size_t addressBytes;
};
/// By the digit behind the S.
constexpr std::array<Type, 10> types = {{{Kind::header, 2},
                                         {Kind::data, 2},
                                         {Kind::data, 3},
                                         {Kind::data, 4},
                                         {Kind::unknown, 0},
                                         {Kind::count, 2},
                                         {Kind::count, 3},
                                         {Kind::end, 4},
                                         {Kind::end, 3},
                                         {Kind::end, 2}}};

class Reader {
 public:
  Reader(std::string_view name, std::string_view text) : line_(name, text) {}

  Result<DataImage> read() {
    while (line_.next()) {
      if (ended_) return line_.failureAt(line_.place(), "expected nothing after the end record");
      TESSEL_TRY(readRecord());
    }
    // Some tools leave the end record out; a count of all records shows as well that none is missing.
    if (!ended_ && !counted_) return line_.failureAt(line_.place(), "expected an end record (S7, S8 or S9)");
    return records_.image(line_);
  }

 private:
  Status readRecord() {
    start_ = line_.place();
    record_.clear();
    TESSEL_TRY(line_.mark('S', "expected 'S' before a record"));
    const char digit = line_.take();
    if (digit < '0' || digit > '9' || types[static_cast<std::size_t>(digit - '0')].kind == Kind::unknown)
      return line_.failureAt(start_ + 1, "unknown record type, expected S0 to S3 or S5 to S9");
    const Type type = types[static_cast<std::size_t>(digit - '0')];
    TESSEL_TRY(line_.bytes(1, record_));
    const std::size_t length = record_[0];
    if (length < type.addressBytes + 1)
      return line_.failureAt(start_ + 2, "a record of type S" + std::string(1, digit) + " has a length of at least " +
                                             std::to_string(type.addressBytes + 1));
    TESSEL_TRY(line_.bytes(length, record_));
    TESSEL_TRY(line_.end());
    const auto wanted = static_cast<std::uint8_t>(~std::accumulate(record_.begin(), record_.end() - 1, 0));
    if (record_.back() != wanted)
      return line_.failureAt(line_.place() - 2, "wrong checksum, expected " + HexDigits::number(wanted, 2));
    return act(type, std::span(record_).subspan(1, length - 1));
  }

  Status act(const Type& type, std::span<const std::uint8_t> body) {
    std::uint64_t address = 0;
    for (const std::uint8_t byte : body.first(type.addressBytes)) address = address << 8 | byte;
    const std::span<const std::uint8_t> bytes = body.subspan(type.addressBytes);
    const std::size_t place = start_ + 4 + 2 * type.addressBytes;
    counted_ = type.kind == Kind::count;
    if (type.kind == Kind::data) {
      if (address + bytes.size() > std::uint64_t{1} << 32)
        return line_.failureAt(place, "the data go beyond address FFFFFFFF");
      records_.add(address, bytes, place);
      return {};
    }
    if (type.kind == Kind::header) return {};
    if (!bytes.empty())
      return line_.failureAt(start_ + 2, "a record of this type has a length of " +
                                             std::to_string(type.addressBytes + 1) + " and no data");
    if (type.kind == Kind::count && address != records_.count())
      return line_.failureAt(start_ + 4, "the file has " + std::to_string(records_.count()) +
                                             " data records before this one, not " + std::to_string(address));
    ended_ = type.kind == Kind::end;
    return {};
  }

  RecordLine line_;
  RecordSet records_;
  std::vector<std::uint8_t> record_;  ///< the bytes of the record's digits
  std::size_t start_ = 0;             ///< of the record in the text
  bool ended_ = false;
  bool counted_ = false;  ///< the last record was a count
};

void appendRecord(std::string& text, int type, std::uint64_t address, std::span<const std::uint8_t> bytes) {
  const std::size_t addressBytes = types[static_cast<std::size_t>(type)].addressBytes;
  int sum = 0;
  const auto put = [&](std::uint8_t byte) {
    HexDigits::append(text, byte);
    sum += byte;
  };
  text += 'S';
  text += static_cast<char>('0' + type);
  put(static_cast<std::uint8_t>(addressBytes + bytes.size() + 1));
  for (std::size_t i = addressBytes; i-- > 0;) put(static_cast<std::uint8_t>(address >> (8 * i)));
  for (const std::uint8_t byte : bytes) put(byte);
  HexDigits::append(text, static_cast<std::uint8_t>(~sum));
  text += '\n';
}

}  // namespace

Result<DataImage> SRecord::parse(std::string_view name, std::string_view text) { return Reader(name, text).read(); }

std::string SRecord::format(const DataImage& image) {
  // The shortest addresses that reach the end: S1 with S9, S2 with S8, S3 with S7.
  const int dataType = image.end() <= 0x10000 ? 1 : image.end() <= 0x1000000 ? 2 : 3;
  std::string text;
  const std::vector<std::uint8_t> header(headerText.begin(), headerText.end());
  appendRecord(text, 0, 0, header);
  std::uint64_t count = 0;
  for (const auto& [start, bytes] : image.runs())
    for (std::size_t done = 0; done < bytes.size(); done += bytesPerRecord, ++count)
      appendRecord(text, dataType, start + done,
                   std::span(bytes).subspan(done, std::min(bytesPerRecord, bytes.size() - done)));
  if (count <= 0xFFFFFF) appendRecord(text, count <= 0xFFFF ? 5 : 6, count, {});
  appendRecord(text, 10 - dataType, 0, {});
  return text;
}
