#pragma once

#include <memory>
#include <vector>

#include "interfaces/Export.h"
#include "interfaces/portability/ACDEntryNotFoundException.h"
#include "interfaces/portability/InvalidArgumentException.h"
#include "interfaces/portability/StringBase.h"
#include "interfaces/portability/UT_CMDARGS.h"

/// The command table: which words and switches there are, and their usage texts.
class TESSEL_EXPORT TesselCmdargs {
 public:
  /// Checks a command line of `count` words against the table (when `check` is true) and groups it into
  /// switches. Throws `ACDEntryNotFoundException` for a word that the table does not hold, without a
  /// message, and `InvalidArgumentException`, after one error, for a switch or argument that does not fit.
  static std::unique_ptr<UT_CMDARGS> getCmdargs(int count, const char* const* words, bool check);

  /// All command words in alphabetical order, ignoring letter case.
  static std::vector<StringBase> findAllCommands();
  /// The command words that hold the text anywhere, ignoring letter case, in the same order.
  static std::vector<StringBase> findMatchingCommands(const char* text);
  /// The usage text of a command: its form, its switches, an example. Empty for an unknown word.
  static StringBase findBatchFormatString(const char* word);

  /// Adds a word without switches to the table of this process (for tests and hosts with words of their
  /// own). Not for use while another thread parses.
  static void accept(const char* word);
};
