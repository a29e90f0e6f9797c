#pragma once

#include <cstddef>
#include <memory>
#include <span>

#include "interfaces/Export.h"
#include "interfaces/portability/UT_CMDSWINFO.h"

/// A command line grouped into switches and their arguments. It holds copies of all words. A word is a
/// switch when it begins with `-` and its next character is there and is no digit; the words up to the
/// next switch are its arguments. Words before the first switch, other than the command word, are the
/// command's own arguments.
class TESSEL_EXPORT UT_CMDARGS {
 public:
  /// `words` holds `count` words, the command word first.
  UT_CMDARGS(int count, const char* const* words);
  UT_CMDARGS(const UT_CMDARGS&) = delete;
  UT_CMDARGS& operator=(const UT_CMDARGS&) = delete;
  /// Wipes the memory when there is a key in it.
  ~UT_CMDARGS();

  static bool isSwitch(const char* word) {
    return word[0] == '-' && word[1] != '\0' && (word[1] < '0' || word[1] > '9');
  }

  const char* getcmd() const { return command_; }
  /// The command's own arguments.
  int getnumargs() const { return static_cast<int>(ownArguments_); }

  int getnumsw() const { return static_cast<int>(switches_.size()); }
  /// Switch `index` in the order typed, from 0; null past the last one.
  const UT_CMDSWINFO* getsw(int index) const;
  /// The occurrence (from 0) of the switch of that name (with its `-`), without regard to letter case;
  /// null when there is none.
  const UT_CMDSWINFO* getsw(const char* name, int occurrence) const;
  bool findsw(const char* name) const { return getsw(name, 0) != nullptr; }

 private:
  /// The switches, the arguments and the texts, one behind the other.
  std::unique_ptr<std::byte[]> memory_;
  std::size_t memorySize_ = 0;
  const char* command_ = "";
  std::span<const UT_CMDSWINFO> switches_;
  std::size_t ownArguments_ = 0;
};
