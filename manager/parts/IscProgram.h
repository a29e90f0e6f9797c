#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "manager/scan/BitVector.h"

/// What a part's ISC_FLOW, ISC_PROCEDURE and ISC_ACTION attributes say (IEEE 1532): how it is erased, programmed,
/// verified and read. Names are kept in lower case, without "flow_" and "proc_"; instructions in upper case.
/// An array name is empty where the text has none.
namespace Isc {

/// A value of an update or of a capture.
struct Value {
  enum class Kind {
    bits,        ///< `bits`
    input,       ///< "?": the next bits of the data file
    output,      ///< "!": kept, captures only
    variable,    ///< "$name"
    set,         ///< "$name=bits"
    add,         ///< "$name+bits": changes the variable and yields the new value
    subtract,    ///< "$name-bits"
    shiftLeft,   ///< "$name<<amount"
    shiftRight,  ///< "$name>>amount"
  };
  Kind kind = Kind::bits;
  bool complement = false;  ///< "~": all bits of the result inverted
  BitVector bits;           ///< as many as the field has
  std::string variable;
  std::size_t amount = 0;
};

/// A field of an update or a capture. Fields are shifted in the order written, each with its lowest bit first.
struct Field {
  std::size_t length = 0;  ///< in bits
  Value value;
  std::optional<BitVector> mask;  ///< of a capture: the bits that are compared; none means all
};

struct Wait {
  std::uint64_t cycles = 0;
  double seconds = 0;
};

/// Load the instruction; if there are updates, one DR scan with them; wait; if there are captures, one DR scan that
/// reads them.
struct Step {
  std::string instruction;
  std::vector<Field> updates;
  Wait least;
  std::optional<Wait> most;
  std::vector<Field> captures;
};

/// A step, or a loop of steps that ends when every capture in it matches.
struct Item {
  bool loop = false;
  std::uint64_t loopLeast = 0;
  std::uint64_t loopMost = 0;
  std::vector<Step> steps;  ///< one when it is no loop
};

struct Block {
  enum class Kind { initialize, repeat, terminate };
  Kind kind = Kind::initialize;
  std::uint64_t count = 1;  ///< of a repeat
  std::vector<Item> items;
};

struct Flow {
  std::string name;
  std::string array;
  bool unprocessed = false;
  bool exitOnError = false;
  std::vector<Block> blocks;
};

struct Use {
  enum class Choice { always, optional, recommended };
  std::string name;
  std::string array;
  Choice choice = Choice::always;  ///< of a procedure in an action
};

struct Procedure {
  std::string name;
  std::string array;
  std::vector<Use> flows;
};

struct Action {
  std::string name;
  std::string array;
  std::vector<Use> procedures;
};

/// Places in the data of the instruction that programs the security, both inclusive.
struct SecurityBits {
  std::size_t first = 0;
  std::size_t last = 0;
};

struct Program {
  std::vector<Flow> flows;
  std::vector<Procedure> procedures;
  std::vector<Action> actions;
  std::map<std::string, SecurityBits> security;  ///< by name in lower case: "isc_disable_read", ...

  bool empty() const { return actions.empty(); }
  const Flow* findFlow(const std::string& name, const std::string& array) const;
  const Procedure* findProcedure(const std::string& name, const std::string& array) const;
  /// The first action of that name, whatever its array.
  const Action* findAction(const std::string& name) const;
};

}  // namespace Isc
