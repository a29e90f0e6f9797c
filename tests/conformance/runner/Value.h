#pragma once

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace conformance {

/// An argument or an answer of a call, or what a case expects in its place.
/// Texts hold `${CWD}` where the working directory of the case stands, in cases and in traces alike.
struct Value {
  enum class Kind {
    none,           ///< a call without a result
    any,            ///< `*`, in expectations and call patterns only
    null,           ///< an absent text or object
    boolean,        ///< `number` is 0 or 1
    number,         ///< `number`
    text,           ///< `text`
    attribute,      ///< `text` is the family, `number` the attribute
    list,           ///< `items`
    map,            ///< `items` of kind entry, in the order of their keys
    entry,          ///< `number` is the key, `items[0]` the value
    tuple,          ///< `items`
    modeInterface,  ///< `interface`: an object, whichever
    exception,      ///< `throw NAME`; `text` is the name
  };

  Value() = default;
  explicit Value(Kind kindOf) : kind(kindOf) {}
  Value(Kind kindOf, std::int64_t numberOf) : kind(kindOf), number(numberOf) {}
  Value(Kind kindOf, std::string textOf, std::int64_t numberOf = 0)
      : kind(kindOf), number(numberOf), text(std::move(textOf)) {}
  Value(Kind kindOf, std::vector<Value> itemsOf, std::int64_t numberOf = 0)
      : kind(kindOf), number(numberOf), items(std::move(itemsOf)) {}

  bool operator==(const Value&) const = default;

  Kind kind = Kind::none;
  std::int64_t number = 0;
  std::string text;
  std::vector<Value> items;
};

/// True when the value fits the pattern: equal, but for each `*` of the pattern.
bool matches(const Value& pattern, const Value& value);
bool matches(const std::vector<Value>& patterns, const std::vector<Value>& values);

/// The value as it stands in a case file.
std::string render(const Value& value);
/// The values one after the other, with `, ` between two.
std::string renderList(const std::vector<Value>& values);

/// The text in double quotes, with escapes for what cannot stand as it is.
std::string quote(const std::string& text);

/// `${CWD}` replaced by the directory, and the directory by `${CWD}`.
std::string expandDirectory(std::string text, const std::string& directory);
std::string foldDirectory(std::string text, const std::string& directory);
Value foldDirectory(Value value, const std::string& directory);

}  // namespace conformance
