#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <utility>

namespace Port {

/// The character string of all libraries. It owns its text, which ends in a terminating zero.
/// Indexes count characters from 0; a search that finds nothing gives -1.
template <class Char>
class StringBase {
 public:
  using View = std::basic_string_view<Char>;

  /// Where `Trim` looks for the characters to strip.
  enum TrimType { trimStart = 1, trimEnd = 2, trimBoth = 3 };

  StringBase() = default;
  /// A copy of `text`; null counts as the empty text. Room for `sizeHint` characters is set aside.
  StringBase(const Char* text, std::size_t sizeHint = 0) {  // NOLINT(google-explicit-constructor)
    text_.reserve(sizeHint);
    if (text != nullptr) text_ = text;
  }
  explicit StringBase(View text) : text_(text) {}
  explicit StringBase(std::basic_string<Char> text) : text_(std::move(text)) {}

  const Char* c_str() const { return text_.c_str(); }
  View view() const { return text_; }
  std::size_t size() const { return text_.size(); }
  bool empty() const { return text_.empty(); }
  void clear() { text_.clear(); }

  StringBase& operator+=(View text) {
    text_ += text;
    return *this;
  }
  StringBase& operator+=(Char character) {
    text_ += character;
    return *this;
  }

  /// The index of the first occurrence of `text` at or after `start`, telling letter case apart; -1 for none.
  int GetIndexOfString(View text, std::size_t start) const {
    const std::size_t index = text_.find(text, start);
    return index == View::npos ? -1 : static_cast<int>(index);
  }

  /// Strips all of the given characters from the start (1), the end (2) or both ends (3).
  void Trim(View characters, int type) {
    if ((type & trimEnd) != 0) text_.erase(text_.find_last_not_of(characters) + 1);
    if ((type & trimStart) != 0) text_.erase(0, text_.find_first_not_of(characters));
  }

  friend bool operator==(const StringBase& a, const StringBase& b) = default;

 private:
  std::basic_string<Char> text_;
};

}  // namespace Port

using StringBase = Port::StringBase<char>;
