#pragma once

#include <string>

#include "manager/operations/Operation.h"

/// What the words that write registers share.
namespace RegisterWork {

/// A word that writes a register, and where its bits come from.
struct Row {
  const char* word;
  const char* reg;
  const char* title;
  const char* switchName;
  bool text;       ///< characters, not hex digits
  bool onlyBlows;  ///< bits can be set and never cleared
};

inline constexpr Row controlRow{"programEFuse", "efuse_control", "eFuse control register", "-control", false, true};
inline constexpr Row revisionRow{"setActiveRevision", "revision", "active revision", "-revision", false, false};

/// The row of one of the words that write a register from a switch.
const Row& rowOf(const char* word);

/// A register of a part. The failure names the word, the part and what it lacks.
Result<const NamedRegister*> find(DeviceWork& work, const Part& part, const char* reg, const char* title);
/// Hex digits, with or without 0x. `what` begins the failure.
Result<BitVector> bitsOfHex(std::string digits, std::size_t length, const std::string& what);

/// A write that is known to be possible.
struct Write {
  const Row* row = nullptr;
  const NamedRegister* reg = nullptr;
  BitVector bits;
};
Result<Write> prepare(DeviceWork& work, const Row& row, const char* value);
/// The one that a switch of `program` asks for.
Result<Write> prepare(DeviceWork& work, const char* switchName, const char* value);
/// Writes, reads back and compares.
Status write(DeviceWork& work, const Write& write);

}  // namespace RegisterWork
