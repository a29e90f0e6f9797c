#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "manager/support/Result.h"

/// Goes over the lines of a hex file, and over the digits of the line it stands in. Line ends are CR, LF or both;
/// blanks at the end of a line do not count, and blank lines are passed over. What `name` and `text` show stays in
/// place.
class RecordLine {
 public:
  RecordLine(std::string_view name, std::string_view text) : name_(name), text_(text) {}

  /// Goes to the next line that is not blank; false when there is none.
  bool next();
  /// The place in the text of what is read next.
  std::size_t place() const { return place_; }
  bool atEnd() const { return place_ == end_; }

  /// Reads a character, in any letter case, that must come now; `what` names it in the failure.
  Status mark(char upper, std::string_view what);
  /// The character that comes now; zero at the end of the line.
  char take();
  /// Reads two digits a byte and appends the bytes.
  Status bytes(std::size_t count, std::vector<std::uint8_t>& to);
  Status end();

  Failure failureAt(std::size_t place, std::string_view message) const;

 private:
  std::string_view name_;
  std::string_view text_;
  std::size_t next_ = 0;  ///< where the lines begin that were not read
  std::size_t place_ = 0;
  std::size_t end_ = 0;
};

namespace HexDigits {

/// The value of a hex digit; -1 for any other character.
int value(char digit);
void append(std::string& text, std::uint8_t byte);
/// At least `digits` digits.
std::string number(std::uint64_t value, int digits);

}  // namespace HexDigits
