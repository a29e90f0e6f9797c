#pragma once

#include <span>
#include <string_view>
#include <vector>

/// The command table as data: one row a command, one row a switch. The rows drive parsing, help and
/// completion; a family of commands stands in a file of its own in commands/.
namespace CommandTable {

/// What the arguments of a switch are.
enum class Kind {
  flag,           ///< no argument
  text,           ///< texts
  number,         ///< whole decimal numbers
  numberThenText  ///< a number, then texts
};

inline constexpr int anyNumber = 1 << 30;

struct Switch {
  const char* name;  ///< with its `-`
  Kind kind;
  int least;             ///< how many arguments it needs
  int most;              ///< how many it takes
  const char* argument;  ///< what to call the argument in help; empty for a flag
  const char* meaning;
};

/// Which switches a command takes.
enum class Switches {
  listed,
  anyName,          ///< the name itself is the argument
  anyNameWithWord,  ///< so, and one word may follow it
  anything          ///< all words are the command's own affair
};

struct Command {
  const char* word;
  int shortest;  ///< the length of its shortest abbreviation; 0 when the whole word is needed
  const char* meaning;
  std::span<const Switch> common;  ///< the switches it shares with its family
  std::span<const Switch> own;
  const char* example;  ///< one line that parses
  Switches switches = Switches::listed;
  const char* note = "";  ///< what else help tells
  bool secret = false;    ///< a word out of place may be a key: messages do not show it
};

// A switch of each shape. `argument` and `meaning` are for help.
constexpr Switch flag(const char* name, const char* meaning) { return {name, Kind::flag, 0, 0, "", meaning}; }
constexpr Switch text(const char* name, const char* argument, const char* meaning) {
  return {name, Kind::text, 1, 1, argument, meaning};
}
/// A text that the command's handler can do without.
constexpr Switch optionalText(const char* name, const char* argument, const char* meaning) {
  return {name, Kind::text, 0, 1, argument, meaning};
}
constexpr Switch texts(const char* name, int least, const char* argument, const char* meaning) {
  return {name, Kind::text, least, anyNumber, argument, meaning};
}
constexpr Switch number(const char* name, const char* argument, const char* meaning) {
  return {name, Kind::number, 1, 1, argument, meaning};
}
/// A position; the handler says what is wrong when its number is missing.
constexpr Switch position(const char* name, const char* meaning) {
  return {name, Kind::number, 0, 1, "position", meaning};
}
constexpr Switch positions(const char* name, const char* meaning) {
  return {name, Kind::number, 0, anyNumber, "position", meaning};
}

// The families.
extern const std::span<const Command> sessionCommands;
extern const std::span<const Command> settingsCommands;
extern const std::span<const Command> cableCommands;
extern const std::span<const Command> chainCommands;
extern const std::span<const Command> operationCommands;
extern const std::span<const Command> formatterCommands;
extern const std::span<const Command> projectCommands;
extern const std::span<const Command> converterCommands;

/// All commands of the table in alphabetical order, ignoring letter case.
const std::vector<const Command*>& all();

/// The command of that word or abbreviation, in any letter case; null for none.
const Command* find(const char* word);

/// Adds a command without switches.
void accept(const char* word);

}  // namespace CommandTable
