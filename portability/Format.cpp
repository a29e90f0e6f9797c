#include <array>
#include <cstdio>
#include <cstring>

#include "interfaces/portability/FormatArgument.h"

namespace Port {
namespace {

/// One conversion of a printf format: `%[flags][width][.precision][length]letter`.
struct Conversion {
  std::string flags;
  int width = -1;
  int precision = -1;
  char letter = '\0';
};

/// A width or precision above this is a mistake of the format, not a wish.
constexpr int largestWidth = 1000;

int readNumber(const char*& place) {
  int number = 0;
  for (; *place >= '0' && *place <= '9'; ++place)
    if (number < largestWidth) number = number * 10 + (*place - '0');
  return number < largestWidth ? number : largestWidth;
}

/// Reads the conversion after a `%` and moves past it. False when the format ends inside it.
bool readConversion(const char*& place, Conversion& conversion) {
  while (*place != '\0' && std::strchr("-+ #0", *place) != nullptr) conversion.flags += *place++;
  if (*place >= '0' && *place <= '9') conversion.width = readNumber(place);
  if (*place == '.') conversion.precision = readNumber(++place);
  while (*place != '\0' && std::strchr("hlLqjzt", *place) != nullptr) ++place;
  if (*place == '\0') return false;
  conversion.letter = *place++;
  return true;
}

/// The printf format of one conversion, with the letters that fit the argument's true type.
std::string rebuild(const Conversion& conversion, const char* letters, bool withPrecision = true) {
  std::string text = "%" + conversion.flags;
  if (conversion.width >= 0) text += std::to_string(conversion.width);
  if (withPrecision && conversion.precision >= 0) text += "." + std::to_string(conversion.precision);
  return text + letters;
}

template <class Value>
std::string print(const std::string& conversion, Value value) {
  // Room for a double of 309 digits before its point and the largest precision after it.
  std::array<char, 2 * largestWidth> buffer{};
  // The format is built by `rebuild` for exactly this type.
  const int length = std::snprintf(buffer.data(), buffer.size(), conversion.c_str(), value);
  return std::string(buffer.data(), length < 0 ? 0 : static_cast<std::size_t>(length));
}

bool isOneOf(char letter, const char* letters) { return std::strchr(letters, letter) != nullptr; }

/// Pads by hand, for a text may hold more than a printf buffer.
std::string pad(const Conversion& conversion, std::string_view text) {
  if (conversion.letter == 's' && conversion.precision >= 0)
    text = text.substr(0, static_cast<std::size_t>(conversion.precision));
  const std::size_t width = conversion.width < 0 ? 0 : static_cast<std::size_t>(conversion.width);
  const std::string blanks(width > text.size() ? width - text.size() : 0, ' ');
  const bool left = conversion.flags.find('-') != std::string::npos;
  return left ? std::string(text) + blanks : blanks + std::string(text);
}

struct Printer {
  const Conversion& conversion;

  std::string operator()(std::int64_t value) const { return integer(value, static_cast<std::uint64_t>(value)); }
  std::string operator()(std::uint64_t value) const {
    if (isOneOf(conversion.letter, "di")) return print(rebuild(conversion, "llu"), value);
    return integer(static_cast<std::int64_t>(value), value);
  }
  std::string operator()(double value) const {
    if (!isOneOf(conversion.letter, "feEgGaAF")) return print(rebuild(conversion, "g"), value);
    const char letters[] = {conversion.letter, '\0'};
    return print(rebuild(conversion, letters), value);
  }
  std::string operator()(char value) const {
    if (isOneOf(conversion.letter, "diuxXo")) return (*this)(static_cast<std::int64_t>(value));
    return pad(conversion, std::string_view(&value, 1));
  }
  std::string operator()(std::string_view value) const { return pad(conversion, value); }
  std::string operator()(FormatArgument::NullText) const { return pad(conversion, "(null)"); }

 private:
  std::string integer(std::int64_t value, std::uint64_t bits) const {
    switch (conversion.letter) {
      case 'c':
        return pad(conversion, std::string(1, static_cast<char>(value)));
      case 'u':
        return print(rebuild(conversion, "llu"), bits);
      case 'x':
        return print(rebuild(conversion, "llx"), bits);
      case 'X':
        return print(rebuild(conversion, "llX"), bits);
      case 'o':
        return print(rebuild(conversion, "llo"), bits);
      default:
        if (isOneOf(conversion.letter, "feEgGaAF")) return (*this)(static_cast<double>(value));
        return print(rebuild(conversion, "lld", isOneOf(conversion.letter, "di")), value);
    }
  }
};

}  // namespace

std::string format(const char* format, std::span<const FormatArgument> arguments) {
  std::string text;
  std::size_t next = 0;
  while (*format != '\0') {
    const char* percent = std::strchr(format, '%');
    if (percent == nullptr) return text + format;
    text.append(format, percent);
    format = percent + 1;
    Conversion conversion;
    if (!readConversion(format, conversion)) return text + percent;
    if (conversion.letter == '%')
      text += '%';
    else if (next == arguments.size())
      text.append(percent, format);
    else if (conversion.letter == 'n')
      ++next;
    else
      text += std::visit(Printer{conversion}, arguments[next++].value());
  }
  return text;
}

}  // namespace Port
