#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "manager/parts/Part.h"
#include "manager/support/Result.h"

/// The parts that there are: those of the user's directories first, then the built-in ones. Files are read when
/// they are wanted first and kept.
class PartLibrary {
 public:
  /// Directories with BSDL files (.bsd, .bsdl, .bsm), in the order of the search. One that can't be read is the
  /// failure of a part that is not found elsewhere.
  explicit PartLibrary(std::vector<std::string> directories = {});

  /// By name, in any letter case; '-' and '_' are one. The failure lists what comes near.
  Result<PartPointer> find(std::string_view name);
  /// By a BSDL file's path.
  Result<PartPointer> read(const std::string& path);
  /// The part whose IDCODE pattern fits 32 bits; null when no part has it. The user's parts win. A user's file
  /// that can't be read is skipped and its failure, the first time, added to `problems`.
  PartPointer identify(const BitVector& idcode, std::vector<std::string>* problems = nullptr);
  /// The names of the built-in parts.
  static std::vector<std::string> builtInNames();

 private:
  /// A part that is there; read when it is wanted first.
  struct Entry {
    std::string name;  ///< normalised
    std::string path;  ///< of a user's file; empty for a built-in part
    std::size_t builtIn = 0;
    PartPointer part;  ///< null until it was read
    std::optional<Failure> failure;
    bool reported = false;  ///< the failure was given to somebody
  };
  Status scanDirectories();
  Status scanDirectory(const std::string& directory);
  Result<PartPointer> load(Entry& entry);
  Failure unknown(std::string_view name) const;

  std::vector<std::string> directories_;
  bool scanned_ = false;
  Status scanResult_;                    ///< the failure of the first directory that could not be read
  std::vector<std::string> unreadable_;  ///< directories, for `identify`
  std::vector<Entry> users_;
  std::vector<Entry> builtIn_;
};
