#pragma once

#include <memory>
#include <string>
#include <vector>

#include "interfaces/Export.h"

/// A command line split into words, the command word first. Positions are counted from 1 as typed and
/// from 0 after `decrementPositions`.
class TESSEL_EXPORT CommandSet {
 public:
  /// An empty set with room for `capacity` words.
  explicit CommandSet(int capacity);
  CommandSet(const CommandSet& other);
  CommandSet& operator=(const CommandSet& other);
  CommandSet(CommandSet&& other) noexcept = default;
  CommandSet& operator=(CommandSet&& other) noexcept = default;
  ~CommandSet() = default;

  /// Splits a line at blanks and tabs. Double quotes group and are removed; a backslash is an ordinary
  /// character; a line end is stripped; a quote that is not closed ends with the line, after a warning.
  /// A line of blanks only is one empty word. A comment (its first word begins with `#` or `//`) gives null.
  static std::unique_ptr<CommandSet> string2CommandSet(const char* line);

  int getNumberCommands() const { return static_cast<int>(starts_.size()); }
  /// Word `index`, from 0; the empty text past the last one. Valid until a word is added.
  const char* getCommand(int index) const;
  /// All words, `getNumberCommands()` of them. Valid until a word is added.
  const char* const* getCommands() const;

  void addCommand(const char* word);
  void addCommand(int number);

  /// Makes positions 0-based: lowers by one every whole decimal number (a sign is allowed) that follows a
  /// `-p` or `-position` switch, in any letter case, up to the next switch. Only the first call changes
  /// the set. False, after an error, when a number does not fit 32 bits; the set is then as before.
  bool decrementPositions();

  /// Prints the words, one blank between two, as a line on the console when `echo` is true. False is
  /// silent: a command may hold a key.
  void printCommands(bool echo) const;

 private:
  std::string text_;  ///< all words, each with a terminating zero
  std::vector<std::size_t> starts_;
  mutable std::vector<const char*> pointers_;  ///< made on demand; empty when out of date
  bool converted_ = false;
};
