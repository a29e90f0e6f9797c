#include <algorithm>
#include <cstdint>
#include <vector>

#include "manager/content/Formats.h"
#include "manager/content/RecordLine.h"
#include "manager/support/TextPlace.h"

namespace {

constexpr std::size_t bytesPerLine = 16;

bool isSpace(char character) {
  return character == ' ' || character == '\t' || character == '\r' || character == '\n' || character == '\f';
}

DataImage imageOf(const std::vector<std::uint8_t>& bytes) {
  DataImage image;
  image.add(0, bytes);
  return image;
}

}  // namespace

Result<DataImage> PlainDigits::parseHex(std::string_view name, std::string_view text) {
  std::vector<std::uint8_t> bytes;
  bytes.reserve(text.size() / 2);
  for (std::size_t place = 0; place < text.size();) {
    if (isSpace(text[place])) {
      ++place;
      continue;
    }
    const int high = HexDigits::value(text[place]);
    if (high < 0) return failureAt(name, text, place, "expected a hex digit");
    const int low = place + 1 < text.size() ? HexDigits::value(text[place + 1]) : -1;
    if (low < 0) return failureAt(name, text, place + 1, "expected the second hex digit of a byte");
    bytes.push_back(static_cast<std::uint8_t>(high * 16 + low));
    place += 2;
  }
  return imageOf(bytes);
}

std::string PlainDigits::formatHex(const DataImage& image) {
  std::string text;
  const std::vector<std::uint8_t> bytes = image.flatten(0, image.end());
  text.reserve(bytes.size() * 2 + bytes.size() / bytesPerLine + 1);
  for (std::size_t i = 0; i < bytes.size(); ++i) {
    HexDigits::append(text, bytes[i]);
    if (i % bytesPerLine == bytesPerLine - 1 || i + 1 == bytes.size()) text += '\n';
  }
  return text;
}

Result<DataImage> PlainDigits::parseBits(std::string_view name, std::string_view text) {
  std::vector<std::uint8_t> bytes;
  std::size_t count = 0;
  for (std::size_t place = 0; place < text.size(); ++place) {
    const char digit = text[place];
    if (isSpace(digit)) continue;
    if (digit != '0' && digit != '1') return failureAt(name, text, place, "expected a digit 0 or 1");
    if (count % 8 == 0) bytes.push_back(0);
    if (digit == '1') bytes.back() = static_cast<std::uint8_t>(bytes.back() | 1U << count % 8);
    ++count;
  }
  if (count % 8 != 0)
    return failureAt(name, text, text.size(),
                     "the file ends inside a byte: it has " + std::to_string(count) + " bits, no multiple of 8");
  return imageOf(bytes);
}
