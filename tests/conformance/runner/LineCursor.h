#pragma once

#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>

#include "tests/conformance/runner/Value.h"

namespace conformance {

/// A case file that cannot be read or parsed: `FILE:LINE: what is wrong`.
class CaseError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// A line of a case file; the file name is borrowed.
struct Place {
  std::string_view file;
  int line = 0;
};

/// Reads one line of a case file from left to right. Every function but `rest` skips blanks first; every
/// function throws `CaseError` when the line does not hold what is asked for.
class LineCursor {
 public:
  /// The line is borrowed.
  LineCursor(std::string_view line, Place place) : line_(line), place_(place) {}

  bool atEnd();
  /// The next character, a zero at the end.
  char peek();
  /// Goes past the token if it is there.
  bool take(std::string_view token);
  void require(std::string_view token);
  void requireEnd();

  /// Letters, digits and underscores.
  std::string name(const char* what);
  /// A quoted text, or anything up to the next blank.
  std::string wordOrText(const char* what);
  /// A text in double quotes, without them.
  std::string text();
  bool boolean();
  std::int64_t number();
  /// Any value, `*` included.
  Value value();
  /// Values with commas between them, up to the closing bracket, which is read too.
  std::vector<Value> valuesUpTo(std::string_view closing);

  /// Everything that is left, as it stands.
  std::string rest();

  [[noreturn]] void fail(const std::string& what) const;
  const Place& place() const { return place_; }

 private:
  void skipBlanks();
  char escape();
  Value map();
  Value word();

  std::string_view line_;
  Place place_;
  std::size_t at_ = 0;
};

}  // namespace conformance
