#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "manager/parts/IscProgram.h"
#include "manager/support/Result.h"

/// How the arrays of a part's ISC actions lie in one data file: one behind the other, in the order in which the
/// actions use them first. Sizes and places are in bits of the file.
class IscLayout {
 public:
  static constexpr std::size_t mostBits = std::size_t{1} << 33;
  static constexpr std::size_t mostFieldBits = std::size_t{1} << 30;

  struct Array {
    std::string name;
    std::size_t first = 0;
    std::size_t size = 0;
  };
  /// How many bits of an array a procedure takes.
  struct Amount {
    std::string array;
    std::size_t written = 0;  ///< "?" of updates
    std::size_t read = 0;     ///< "?" and "!" of captures

    std::size_t total() const { return written + read; }
  };

  /// `actions` by name; one that the program lacks is passed over. An array is as long as the procedure that writes
  /// most of it needs; one that none writes, as the procedure that reads most. Fails when an action uses a procedure
  /// or flow that is not there, or when a size is out of all proportion.
  static Result<IscLayout> make(const Isc::Program& program, const std::vector<std::string>& actions);

  /// What a procedure takes, in the order of its flows.
  static Result<std::vector<Amount>> amounts(const Isc::Program& program, const Isc::Use& procedure);

  /// Null for an array that no action uses.
  const Array* find(const std::string& name) const;
  std::size_t bits() const { return bits_; }

 private:
  std::vector<Array> arrays_;
  std::size_t bits_ = 0;
};
