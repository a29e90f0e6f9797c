#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <new>
#include <string>
#include <string_view>
#include <type_traits>
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
    reserve(sizeHint);
    if (text != nullptr) *this += text;
  }
  explicit StringBase(View text) { *this += text; }
  explicit StringBase(const std::basic_string<Char>& text) : StringBase(View(text)) {}
  StringBase(const StringBase& other) : StringBase(other.view()) {}
  StringBase(StringBase&& other) noexcept { swap(other); }
  StringBase& operator=(StringBase other) noexcept {
    swap(other);
    return *this;
  }
  ~StringBase() { std::free(text_); }

  const Char* c_str() const { return text_ == nullptr ? &nothing : text_; }
  View view() const { return View(c_str(), size_); }
  std::size_t size() const { return size_; }
  bool empty() const { return size_ == 0; }
  void clear() { cut(0); }

  StringBase& operator+=(View text) {
    if (text.empty()) return *this;
    const std::less<const Char*> before;
    if (!before(text.data(), text_) && before(text.data(), text_ + size_))
      return *this += View(std::basic_string<Char>(text));
    reserve(size_ + text.size());
    std::memcpy(text_ + size_, text.data(), text.size() * sizeof(Char));
    cut(size_ + text.size());
    return *this;
  }
  StringBase& operator+=(const Char* text) { return *this += View(text); }
  StringBase& operator+=(Char character) { return *this += View(&character, 1); }

  /// The index of the first occurrence of `text` at or after `start`, telling letter case apart; -1 for none.
  int GetIndexOfString(View text, std::size_t start) const {
    const std::size_t index = view().find(text, start);
    return index == View::npos ? -1 : static_cast<int>(index);
  }

  /// Strips all of the given characters from the start (1), the end (2) or both ends (3).
  void Trim(View characters, int type) {
    if ((type & trimEnd) != 0) cut(view().find_last_not_of(characters) + 1);
    if ((type & trimStart) == 0 || empty()) return;
    const std::size_t start = std::min(view().find_first_not_of(characters), size_);
    std::memmove(text_, text_ + start, (size_ - start) * sizeof(Char));
    cut(size_ - start);
  }

  friend bool operator==(const StringBase& a, const StringBase& b) { return a.view() == b.view(); }

 private:
  static_assert(std::is_trivially_copyable_v<Char>);

  void swap(StringBase& other) noexcept {
    std::swap(text_, other.text_);
    std::swap(size_, other.size_);
    std::swap(capacity_, other.capacity_);
  }

  /// Makes room for `size` characters and the terminating zero. A long text, such as a transcript of millions
  /// of lines, grows in place where the system can remap memory, which `std::string` never asks for.
  void reserve(std::size_t size) {
    if (size < capacity_ || size == 0) return;
    const std::size_t capacity = std::max(size + 1, 2 * capacity_);
    void* grown = std::realloc(text_, capacity * sizeof(Char));
    if (grown == nullptr) throw std::bad_alloc();
    text_ = static_cast<Char*>(grown);
    capacity_ = capacity;
    cut(size_);
  }

  void cut(std::size_t size) {
    size_ = size;
    if (text_ != nullptr) text_[size] = Char();
  }

  static constexpr Char nothing = Char();

  Char* text_ = nullptr;  ///< owned; null as long as there is no text
  std::size_t size_ = 0;
  std::size_t capacity_ = 0;  ///< the terminating zero included
};

}  // namespace Port

using StringBase = Port::StringBase<char>;
