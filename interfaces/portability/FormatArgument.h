#pragma once

#include <concepts>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>
#include <variant>

#include "interfaces/Export.h"
#include "interfaces/portability/StringBase.h"

namespace Port {

/// One argument of a message, with its type. A text is borrowed and must outlive the call.
class FormatArgument {
 public:
  struct NullText {};
  using Value = std::variant<std::int64_t, std::uint64_t, double, char, std::string_view, NullText>;

  FormatArgument(char value) : value_(value) {}    // NOLINT(google-explicit-constructor)
  FormatArgument(double value) : value_(value) {}  // NOLINT(google-explicit-constructor)
  FormatArgument(std::signed_integral auto value)  // NOLINT(google-explicit-constructor)
      : value_(static_cast<std::int64_t>(value)) {}
  FormatArgument(std::unsigned_integral auto value)  // NOLINT(google-explicit-constructor)
      : value_(static_cast<std::uint64_t>(value)) {}
  template <class Enumeration>
  requires std::is_enum_v<Enumeration> FormatArgument(Enumeration value)  // NOLINT(google-explicit-constructor)
      : value_(static_cast<std::int64_t>(value)) {}
  FormatArgument(const char* text) {  // NOLINT(google-explicit-constructor)
    if (text == nullptr)
      value_ = NullText{};
    else
      value_ = std::string_view(text);
  }
  FormatArgument(const ::StringBase& text) : value_(text.view()) {}  // NOLINT(google-explicit-constructor)
  FormatArgument(const std::string& text)                            // NOLINT(google-explicit-constructor)
      : value_(std::string_view(text)) {}

  const Value& value() const { return value_; }

 private:
  Value value_;
};

/// Fills a printf format. The arguments' own types decide how they print, so that none can be misread:
/// a text given to `%d` prints as the text, a number given to `%s` as its digits, a null text as `(null)`.
/// Flags, width and precision count; length letters are ignored; `%n` writes nothing anywhere. A
/// conversion that has no argument left stays in the text as it stands.
TESSEL_EXPORT std::string format(const char* format, std::span<const FormatArgument> arguments);

template <class... Arguments>
std::string format(const char* text, const Arguments&... arguments) {
  if constexpr (sizeof...(arguments) == 0) {
    return format(text, std::span<const FormatArgument>());
  } else {
    const FormatArgument list[] = {FormatArgument(arguments)...};
    return format(text, std::span<const FormatArgument>(list));
  }
}

}  // namespace Port
