#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <vector>

#include "interfaces/Export.h"
#include "interfaces/portability/Secret.h"

/// A command line split into words, the command word first. Positions are counted from 1 as typed and
/// from 0 after `decrementPositions`. The memory of a set that holds a key (behind a `-key` switch) is wiped
/// when the set is done with it, and from the first such word on the process writes no core dumps.
class TESSEL_EXPORT CommandSet {
 public:
  /// An empty set with room for `capacity` words.
  explicit CommandSet(int capacity);
  CommandSet(const CommandSet& other);
  CommandSet& operator=(const CommandSet& other);
  /// A set that was moved from may be filled again.
  CommandSet(CommandSet&& other) noexcept { swap(other); }
  CommandSet& operator=(CommandSet&& other) noexcept {
    swap(other);
    return *this;
  }
  ~CommandSet() { wipe(); }

  /// Splits a line at blanks and tabs. Double quotes group and are removed; a backslash is an ordinary
  /// character; a line end is stripped; a quote that is not closed ends with the line, after a warning.
  /// A line of blanks only is one empty word. A comment (its first word begins with `#` or `//`) gives null.
  static std::unique_ptr<CommandSet> string2CommandSet(const char* line);
  /// The same into a set that is there, so that a reader of many lines need not make many; false for null.
  static bool string2CommandSet(const char* line, CommandSet& set);

  int getNumberCommands() const { return static_cast<int>(words_.size()); }
  /// Word `index`, from 0; the empty text past the last one. Valid until a word is added.
  const char* getCommand(int index) const {
    const auto place = static_cast<std::size_t>(index);
    return index >= 0 && place < words_.size() ? words_[place] : "";
  }
  /// All words, `getNumberCommands()` of them. Valid until a word is added.
  const char* const* getCommands() const { return words_.data(); }

  /// Whether a word is the `-key` switch.
  bool holdsKey() const { return holdsKey_; }

  void addCommand(const char* word);
  void addCommand(int number);

  /// Makes positions 0-based: lowers by one every whole decimal number (a sign is allowed) that follows a
  /// `-p` or `-position` switch, in any letter case, up to the next switch. Only the first call changes
  /// the set. False, after an error, when a number does not fit 32 bits; the set is then unusable.
  bool decrementPositions();

  /// Prints the words, one blank between two, as a line on the console when `echo` is true. False is
  /// silent: a command may hold a key.
  void printCommands(bool echo) const;

 private:
  /// Takes note of a word that announces a key; no core dump is to hold it.
  void noteKey(const char* word);
  void swap(CommandSet& other) noexcept;
  void clear();
  void wipe() {
    if (holdsKey_ && text_ != nullptr) Port::Secret::wipe(text_.get(), capacity_);
  }
  /// Makes room for `size` more bytes of text.
  void reserveText(std::size_t size);
  bool splitWords(const char* place, const char* end);
  void replaceWord(std::size_t index, std::int32_t number);

  std::unique_ptr<char[]> text_;  ///< all words, each with a terminating zero
  std::size_t size_ = 0;
  std::size_t capacity_ = 0;
  std::vector<const char*> words_;  ///< into `text_`, but for empty ones
  bool converted_ = false;
  bool holdsKey_ = false;
};
