#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "manager/parts/IscProgram.h"
#include "manager/scan/BitVector.h"

/// A pattern of bits, some of which may be anything.
struct BitPattern {
  BitVector value;
  BitVector care;  ///< set where `value` counts; of the same size

  bool matches(const BitVector& bits) const;
};

/// A cell of the boundary register, number 0 next to TDO.
struct BoundaryCell {
  std::string type;  ///< BC_1, ...
  std::string port;  ///< empty for "*"
  std::string
      function;      ///< lower case: input, output2, output3, bidir, control, controlr, internal, clock, observe_only
  char safe = 'X';   ///< 0, 1 or X
  int control = -1;  ///< the cell that disables this one; -1 for none
  char disableValue = 'X';
  std::string observedPort;   ///< of a cell that drives one port and observes another: the latter
  std::string disableResult;  ///< upper case: Z, WEAK0, WEAK1, PULL0, PULL1, KEEPER
};

/// A field of a named register: its bits from `first` on.
struct RegisterField {
  std::string name;
  std::size_t first = 0;
  std::size_t length = 1;
  std::string meaning;  ///< a short text
  double scale = 0;     ///< of a monitor: value = bits * scale + offset
  double offset = 0;
  std::string unit;  ///< of a monitor: "C", "V"
};

/// A register beyond the standard, read by an instruction.
struct NamedRegister {
  std::string name;              ///< "status", "dna", "efuse", "efuse_control", "monitor", ...
  std::string instruction;       ///< upper case
  std::string writeInstruction;  ///< empty when it can't be written
  std::size_t length = 0;
  std::vector<RegisterField> fields;
};

/// The register behind which a flash memory stands.
struct Bridge {
  std::string spiInstruction;  ///< empty when the part reaches no SPI flash
  std::string bpiInstruction;  ///< empty when the part reaches no BPI flash
};

/// What is known about a part: its BSDL file, and the JSON file beside it. Instruction names are in upper case.
struct Part {
  enum class Kind { plain, fpga, prom, cpld, mpm };

  struct Access {
    std::string reg;         ///< upper case: BOUNDARY, BYPASS, DEVICE_ID, or the part's own name
    std::size_t length = 0;  ///< in bits; 0 when the file does not tell
  };

  std::string name;    ///< the entity's, in lower case, with the real name of the JSON file when there is one
  std::string source;  ///< the file, or "built in"
  Kind kind = Kind::plain;
  std::size_t irLength = 0;
  BitPattern irCapture;
  std::map<std::string, std::vector<BitVector>> opcodes;
  std::map<std::string, Access> access;  ///< by instruction
  std::vector<BitPattern> idcodes;
  std::optional<BitPattern> usercode;
  std::optional<BitVector> blankUsercode;
  double maxTck = 0;  ///< Hz; 0 when not told
  std::vector<BoundaryCell> boundary;
  std::map<std::string, std::string> pins;  ///< package pin by port as in a cell, of the first pin map
  Isc::Program isc;
  bool hasIsc = false;
  std::vector<NamedRegister> registers;
  Bridge bridge;
  std::size_t memoryBits = 0;  ///< of the configuration or ISC memory; 0 when not known
  std::size_t revisions = 0;   ///< of a PROM that keeps several

  /// The first opcode of an instruction; null for one that the part lacks. BYPASS is all ones, always there.
  const BitVector* opcode(const std::string& instruction) const;
  const NamedRegister* findRegister(const std::string& registerName) const;
  bool matchesIdcode(const BitVector& idcode) const;
};

using PartPointer = std::shared_ptr<const Part>;
