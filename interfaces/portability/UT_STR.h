#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "interfaces/Export.h"
#include "interfaces/portability/StringBase.h"

/// Functions on zero-terminated texts. Letter case means that of ASCII letters, whatever the locale.
/// A null text counts as empty unless said otherwise.
class TESSEL_EXPORT UT_STR {
 public:
  static int Len(const char* text);

  /// The code of a character, that of the small letter for a capital one.
  static constexpr int Lower(char character) {
    const auto code = static_cast<unsigned char>(character);
    return code >= 'A' && code <= 'Z' ? code + ('a' - 'A') : code;
  }

  /// Below, above or equal to 0 as `a` sorts before, after or the same as `b`.
  static int Compare(const char* a, const char* b);
  /// `Compare` without regard to letter case.
  static int ICompare(const char* a, const char* b) {
    if (a == nullptr) a = "";
    if (b == nullptr) b = "";
    for (;; ++a, ++b) {
      const int difference = Lower(*a) - Lower(*b);
      if (difference != 0 || *a == '\0') return difference;
    }
  }
  /// `ICompare` of the first `count` characters.
  static int INCompare(const char* a, const char* b, int count);

  /// True when the whole text fits the pattern, without regard to letter case. A `*` in the pattern
  /// stands for any run of characters, an empty one included. A null text or pattern fits nothing.
  static bool IMatch(const char* text, const char* pattern);

  /// Where `part` begins in `text`, telling letter case apart; null when it is not there.
  static const char* FindString(const char* text, const char* part);

  /// A copy of the text that belongs to the caller.
  static StringBase Dup(const char* text);
  /// Copies the text into a buffer of `size` characters, the terminating zero included.
  /// False when it does not fit; the buffer then holds an empty text.
  static bool Copy(char* buffer, int size, const char* text);

  /// The leading decimal number of the text (blanks before it and a sign are allowed): 0 when there is
  /// none, the nearest 32-bit number when it does not fit.
  static std::int32_t AToL(const char* text);
  static int AToI(const char* text) { return AToL(text); }

  /// Wide text from UTF-8 and back. A byte that is no UTF-8 survives the way there and back.
  static std::wstring MbstrToWstr(const char* text);
  static std::string WstrToMbstr(const wchar_t* text);

  /// Gives back the lines that `Port_MsgManDefault::msgFormat` made.
  static void WDelStrings(std::vector<std::wstring>& lines, int count);
};
