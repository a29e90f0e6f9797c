#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "manager/parts/Part.h"
#include "manager/support/Result.h"

/// An instruction that does something only when the right code is shifted into its register.
struct KeyedInstruction {
  std::string name;
  std::size_t bits = 0;          ///< of the register that the flows write for it; 0 when the instruction alone does it
  std::optional<BitVector> key;  ///< what the register must hold; none for anything
};

/// How the ISC memory of a part is simulated: its size, the instruction behind each role, times in seconds.
struct IscModel {
  std::string enable = "ISC_ENABLE";
  std::string disable = "ISC_DISABLE";
  std::string erase = "ISC_ERASE";
  std::string address = "ISC_ADDRESS_SHIFT";
  std::string data = "ISC_DATA_SHIFT";
  std::string program = "ISC_PROGRAM";
  std::string read = "ISC_READ";
  std::string status = "ISC_STATUS";

  std::size_t pages = 0;  ///< 0 for a part without such a memory
  std::size_t bits = 0;   ///< a page
  std::size_t addressBits = 0;
  std::uint64_t addressStep = 1;  ///< from one page's address to the next one's
  bool programTakesData = false;  ///< the page is shifted in with the program instruction itself
  double eraseTime = 0;
  double programTime = 0;

  std::size_t statusBits = 0;
  std::optional<BitVector> statusMask;  ///< the bits that tell busy; none for the format of the built-in parts
  std::optional<BitVector> statusBusy;  ///< what they are while busy, inverted otherwise
};

/// What a board file says about the model; what is not given comes from the part's BSDL file.
struct IscModelChoice {
  IscModel names;  ///< only its roles count
  std::optional<std::size_t> pages;
  std::optional<std::size_t> bits;
  std::optional<std::uint64_t> addressStep;
  std::optional<double> eraseTime;
  std::optional<double> programTime;
  std::optional<BitVector> statusMask;
  std::optional<BitVector> statusBusy;
};

namespace IscModels {

/// The most bits of a memory that a board may have.
inline constexpr std::size_t mostBits = std::size_t{1} << 30;

/// The length of the register behind an instruction, in bits: from REGISTER_ACCESS, else from the registers of the
/// part's JSON file, else from the widths in its flows; 0 when nothing tells it.
std::size_t registerLength(const Part& part, const std::string& instruction);
KeyedInstruction keyed(const Part& part, const std::string& instruction);
/// The failure says what is missing for a memory that the board file asks for.
Result<IscModel> make(const Part& part, const IscModelChoice& choice);

}  // namespace IscModels
