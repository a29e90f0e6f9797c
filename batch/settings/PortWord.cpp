#include "batch/settings/PortWord.h"

#include "interfaces/portability/UT_STR.h"

namespace {

constexpr int automatic = -1;

/// How the port's index comes out of the word.
enum class Index {
  fixed,     ///< a constant
  digit,     ///< the character at `place`, counted from `zero`
  letter,    ///< 0 when the character at `place` is 'a', else 1
  usbDigit,  ///< as `digit`, one place earlier in a word of four characters, whose type is "usb"
};

struct Row {
  const char* begins;
  int compared;  ///< how many characters count, whatever the case of letters
  const char* type;
  Index kind;
  int place;
  char zero;
  int fixed;
  int baud;
  bool fileCable;
};

constexpr Row fixedPort(const char* word, int compared, const char* type, int index, int baud) {
  return {word, compared, type, Index::fixed, 0, 0, index, baud, false};
}
constexpr Row digitPort(const char* word, int compared, const char* type, int place, char zero, int baud) {
  return {word, compared, type, Index::digit, place, zero, 0, baud, false};
}
constexpr Row filePort(const char* word, int compared) {
  return {word, compared, word, Index::fixed, 0, 0, -1, 9600, true};
}

/// In order: the first row that fits wins. The numbering of tty00 and tty01, the mix of digits counted from
/// 0 and from 1 and the three letters of csvf are deliberate: scripts are written to them.
constexpr Row rows[] = {
    fixedPort("tty00", 5, "com", 2, 9600),
    fixedPort("tty01", 5, "com", 3, 9600),
    digitPort("ttyS", 4, "com", 4, '0', 9600),
    {"tty", 3, "com", Index::letter, 3, 0, 0, 9600, false},
    digitPort("lpt", 3, "lpt", 3, '1', automatic),
    digitPort("parport", 7, "lpt", 7, '0', automatic),
    digitPort("com", 3, "com", 3, '1', 9600),
    {"usb", 3, "usb2", Index::usbDigit, 4, '1', 0, automatic, false},
    fixedPort("auto", 4, "auto", 0, 9600),
    filePort("svf", 3),
    filePort("csvf", 3),
    filePort("stapl", 5),
    fixedPort("null", 5, "null", 0, 9600),  // the terminating zero counts: the whole word
};

/// The character at a place; past the end it is the terminating zero.
char at(const std::string& word, int place) {
  const auto index = static_cast<std::size_t>(place);
  return index < word.size() ? word[index] : '\0';
}

}  // namespace

PortWord classifyPort(const std::string& word) {
  for (const Row& row : rows) {
    if (UT_STR::INCompare(word.c_str(), row.begins, row.compared) != 0) continue;
    PortWord port{row.type, row.fileCable, row.fixed, row.baud};
    switch (row.kind) {
      case Index::fixed:
        break;
      case Index::digit:
        port.index = at(word, row.place) - row.zero;
        break;
      case Index::letter:
        port.index = at(word, row.place) == 'a' ? 0 : 1;
        break;
      case Index::usbDigit: {
        const bool fourCharacters = word.size() == 4;
        if (fourCharacters) port.type = "usb";
        port.index = at(word, fourCharacters ? row.place - 1 : row.place) - row.zero;
        break;
      }
    }
    return port;
  }
  return {};
}
