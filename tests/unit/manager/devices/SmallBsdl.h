#pragma once

#include <cstddef>
#include <string>
#include <string_view>

/// BSDL texts of small parts with an instruction register of 8 bits.
namespace parttext {

inline const std::string_view procedures =
    "proc_enable = (flow_enable), proc_disable = (flow_disable), proc_erase = (flow_erase), "
    "proc_program(array) = (flow_program(array)), proc_verify(array) = (flow_verify(array)), "
    "proc_read(array) = (flow_read(array))";

inline const std::string_view actions =
    "erase = (proc_enable, proc_erase, proc_disable), "
    "program = (proc_enable, proc_erase recommended, proc_program(array), proc_verify(array) optional, proc_disable), "
    "verify = (proc_enable, proc_verify(array), proc_disable), read = (proc_enable, proc_read(array), proc_disable)";

/// A part of that many pages.
inline std::string flows(std::size_t pages = 8, std::size_t pageBits = 64) {
  const std::string more = std::to_string(pages - 1);
  const std::string page = " " + std::to_string(pageBits);
  return "flow_enable initialize (ISC_ENABLE 8:D0 wait TCK 16), "
         "flow_disable initialize (ISC_DISABLE wait 1.0e-3), "
         "flow_erase initialize (ISC_ERASE 8:A5 wait 50.0e-3) loop max 20 (ISC_STATUS wait TCK 8, 1.0e-3 8:00*01), "
         "flow_program(array) "
         "  initialize (ISC_ADDRESS_SHIFT 8:$adr=00 wait TCK 1) (ISC_DATA_SHIFT" +
         page +
         ":? wait TCK 1) "
         "    (ISC_PROGRAM wait 2.0e-3) "
         "  repeat " +
         more + " (ISC_ADDRESS_SHIFT 8:$adr+01 wait TCK 1) (ISC_DATA_SHIFT" + page +
         ":? wait TCK 1) "
         "    (ISC_PROGRAM wait 2.0e-3), "
         "flow_verify(array) "
         "  initialize (ISC_ADDRESS_SHIFT 8:$adr=00 wait TCK 1) (ISC_READ wait 1.0e-4" +
         page +
         ":?) "
         "  repeat " +
         more + " (ISC_ADDRESS_SHIFT 8:$adr+01 wait TCK 1) (ISC_READ wait 1.0e-4" + page +
         ":?), "
         "flow_read(array) "
         "  initialize (ISC_ADDRESS_SHIFT 8:$adr=00 wait TCK 1) (ISC_READ wait 1.0e-4" +
         page +
         ":!) "
         "  repeat " +
         more + " (ISC_ADDRESS_SHIFT 8:$adr+01 wait TCK 1) (ISC_READ wait 1.0e-4" + page + ":!)";
}

inline std::string bsdl(std::string_view name, std::string_view idcode, std::string_view flowText,
                        std::string_view procedureText = procedures, std::string_view actionText = actions) {
  const std::string of = " of " + std::string(name) + " : entity is ";
  std::string text = "entity " + std::string(name) + " is\n";
  text += "generic (PHYSICAL_PIN_MAP : string := \"P5\");\n";
  text += "port (TCK, TDI, TMS : in bit; TDO : out bit; IO : inout bit);\n";
  text += "use STD_1149_1_2001.all;\n";
  text += "attribute COMPONENT_CONFORMANCE" + of + "\"STD_1149_1_2001\";\n";
  text += "attribute PIN_MAP" + of + "PHYSICAL_PIN_MAP;\n";
  text += "constant P5 : PIN_MAP_STRING := \"TCK: 1, TDI: 2, TMS: 3, TDO: 4, IO: 5\";\n";
  text += "attribute TAP_SCAN_IN of TDI : signal is true;\n";
  text += "attribute TAP_SCAN_MODE of TMS : signal is true;\n";
  text += "attribute TAP_SCAN_OUT of TDO : signal is true;\n";
  text += "attribute TAP_SCAN_CLOCK of TCK : signal is (10.0e6, BOTH);\n";
  text += "attribute INSTRUCTION_LENGTH" + of + "8;\n";
  text += "attribute INSTRUCTION_OPCODE" + of +
          "\"EXTEST (00000000), SAMPLE (00100000), PRELOAD (00100000), \" &\n"
          "\"BYPASS (11111111), IDCODE (00001001), ISC_ENABLE (10000111), ISC_DISABLE (00110000), \" &\n"
          "\"ISC_ERASE (01000011), ISC_STATUS (00111001), ISC_ADDRESS_SHIFT (00110010), \" &\n"
          "\"ISC_DATA_SHIFT (00110011), ISC_PROGRAM (00010101), ISC_READ (00110110)\";\n";
  text += "attribute INSTRUCTION_CAPTURE" + of + "\"XXXXXX01\";\n";
  text += "attribute IDCODE_REGISTER" + of + "\"" + std::string(idcode) + "\";\n";
  text += "attribute REGISTER_ACCESS" + of +
          "\"BOUNDARY (EXTEST, SAMPLE, PRELOAD), BYPASS (BYPASS), DEVICE_ID (IDCODE), \" &\n"
          "\"ISC_CODE[8] (ISC_ENABLE), STATUS[8] (ISC_STATUS)\";\n";
  text += "attribute BOUNDARY_LENGTH" + of + "2;\n";
  text += "attribute BOUNDARY_REGISTER" + of + "\"0 (BC_1, *, control, 1), 1 (BC_7, IO, bidir, X, 0, 1, Z)\";\n";
  text += "attribute ISC_CONFORMANCE" + of + "\"STD_1532_2002\";\n";
  text += "attribute ISC_FLOW" + of + "\"" + std::string(flowText) + "\";\n";
  text += "attribute ISC_PROCEDURE" + of + "\"" + std::string(procedureText) + "\";\n";
  text += "attribute ISC_ACTION" + of + "\"" + std::string(actionText) + "\";\n";
  return text + "end " + std::string(name) + ";\n";
}

inline const std::string_view idcode = "XXXX0001001000110100111111111101";

}  // namespace parttext
