#include <gtest/gtest.h>

#include <algorithm>

#include "manager/parts/BsdlFile.h"
#include "tests/unit/manager/parts/TestFiles.h"

namespace {

struct Row {
  const char* about;
  const char* text;   ///< statements of the entity
  const char* error;  ///< the whole text behind "part.bsd:"
};

/// The statements stand from line 2 on. `INSTRUCTION_LENGTH` is 4 unless they give it.
std::string fileWith(const std::string& statements) {
  std::string text = "entity e is\n" + statements + "\n";
  if (statements.find("INSTRUCTION_LENGTH") == std::string::npos)
    text += "attribute INSTRUCTION_LENGTH of e : entity is 4;\n";
  return text + "end e;\n";
}

void PrintTo(const Row& row, std::ostream* stream) { *stream << row.about; }

class BsdlErrorsTest : public testing::TestWithParam<Row> {};

TEST_P(BsdlErrorsTest, namesThePlace) {
  const auto part = BsdlFile::parse("part.bsd", fileWith(GetParam().text));
  ASSERT_FALSE(part) << GetParam().about;
  EXPECT_EQ(part.failure().text, std::string("part.bsd:") + GetParam().error) << GetParam().about;
}

const Row lexicalRows[] = {
    {"a string without an end", "attribute X of e : entity is \"abc;\nuse Y;",
     "2:30: the string does not end on its line: '\"' is missing\n"
     "  attribute X of e : entity is \"abc;\n"
     "                               ^"},
    {"a statement without an end", "attribute INSTRUCTION_LENGTH of e : entity is 4",
     "3:1: expected ';', found 'end'\n  end e;\n  ^"},
    {"no string after &", "attribute IDCODE_REGISTER of e : entity is \"XXXX\" & FOO;",
     "2:53: expected a string, found 'FOO'\n"
     "  attribute IDCODE_REGISTER of e : entity is \"XXXX\" & FOO;\n"
     "                                                      ^"},
    {"an attribute twice",
     "attribute INSTRUCTION_LENGTH of e : entity is 4;\nattribute Instruction_Length of e : entity is 5;",
     "3:11: attribute INSTRUCTION_LENGTH is given twice\n"
     "  attribute Instruction_Length of e : entity is 5;\n"
     "            ^"},
    {"an attribute of nothing", "attribute INSTRUCTION_LENGTH of : entity is 4;",
     "2:33: expected what the attribute belongs to, found ':'\n"
     "  attribute INSTRUCTION_LENGTH of : entity is 4;\n"
     "                                  ^"},
    {"a port without a type", "port (A : in);",
     "2:13: expected a port's mode and type, found ')'\n"
     "  port (A : in);\n"
     "              ^"},
    {"an empty range", "port (A : in bit_vector(3 to 0));",
     "2:30: the range of a vector is empty: 'to' counts up\n"
     "  port (A : in bit_vector(3 to 0));\n"
     "                               ^"},
    {"a huge range", "port (A : in bit_vector(0 to 4000000000));",
     "2:30: expected an index (0 to 65535), found '4000000000'\n"
     "  port (A : in bit_vector(0 to 4000000000));\n"
     "                               ^"},
};
INSTANTIATE_TEST_SUITE_P(Lexical, BsdlErrorsTest, testing::ValuesIn(lexicalRows));

const Row instructionRows[] = {
    {"a length that is no number", "attribute INSTRUCTION_LENGTH of e : entity is four;",
     "2:47: INSTRUCTION_LENGTH: expected a number from 2 to 4096\n"
     "  attribute INSTRUCTION_LENGTH of e : entity is four;\n"
     "                                                ^"},
    {"a length with a base that there is not", "attribute INSTRUCTION_LENGTH of e : entity is 17#4#;",
     "2:47: INSTRUCTION_LENGTH: expected a number from 2 to 4096\n"
     "  attribute INSTRUCTION_LENGTH of e : entity is 17#4#;\n"
     "                                                ^"},
    {"a length that is a text", "attribute INSTRUCTION_LENGTH of e : entity is \"4\";",
     "2:47: INSTRUCTION_LENGTH: expected a number from 2 to 4096\n"
     "  attribute INSTRUCTION_LENGTH of e : entity is \"4\";\n"
     "                                                ^"},
    {"opcodes that are no text", "attribute INSTRUCTION_OPCODE of e : entity is 4;",
     "2:47: INSTRUCTION_OPCODE: expected a string\n"
     "  attribute INSTRUCTION_OPCODE of e : entity is 4;\n"
     "                                                ^"},
    {"an opcode that is too short, in the second literal",
     "attribute INSTRUCTION_OPCODE of e : entity is \"EXTEST (0000),\" &\n  \"SAMPLE (001)\";",
     "3:12: the opcode has 3 bits, expected 4\n"
     "    \"SAMPLE (001)\";\n"
     "             ^"},
    {"an opcode with other digits", "attribute INSTRUCTION_OPCODE of e : entity is \"EXTEST (0002)\";",
     "2:56: the opcode is written with 0, 1 and X\n"
     "  attribute INSTRUCTION_OPCODE of e : entity is \"EXTEST (0002)\";\n"
     "                                                         ^"},
    {"an instruction twice", "attribute INSTRUCTION_OPCODE of e : entity is\n\"EXTEST (0000), extest (0001)\";",
     "3:17: instruction EXTEST is given twice\n"
     "  \"EXTEST (0000), extest (0001)\";\n"
     "                  ^"},
    {"an opcode without an end", "attribute INSTRUCTION_OPCODE of e : entity is \"EXTEST (0000\";",
     "2:60: expected ')', found the end of the text\n"
     "  attribute INSTRUCTION_OPCODE of e : entity is \"EXTEST (0000\";\n"
     "                                                             ^"},
    {"a capture of another length", "attribute INSTRUCTION_CAPTURE of e : entity is \"XX001\";",
     "2:49: the instruction capture has 5 bits, expected 4\n"
     "  attribute INSTRUCTION_CAPTURE of e : entity is \"XX001\";\n"
     "                                                  ^"},
    {"an IDCODE that is too short",
     "attribute IDCODE_REGISTER of e : entity is \"XXXX\" & -- version\n \"0000000000000001\" & \"0000000000\";",
     "2:45: the IDCODE has 30 bits, expected 32\n"
     "  attribute IDCODE_REGISTER of e : entity is \"XXXX\" & -- version\n"
     "                                              ^"},
    {"a clock that is no number", "attribute TAP_SCAN_CLOCK of TCK : signal is (fast, BOTH);",
     "2:46: expected the highest TCK in Hz, found 'fast'\n"
     "  attribute TAP_SCAN_CLOCK of TCK : signal is (fast, BOTH);\n"
     "                                               ^"},
};
INSTANTIATE_TEST_SUITE_P(Instructions, BsdlErrorsTest, testing::ValuesIn(instructionRows));

const Row registerRows[] = {
    {"a register of no bits", "attribute REGISTER_ACCESS of e : entity is \"R[0] (EXTEST)\";",
     "2:47: expected a register's length in bits (1 to 268435456), found '0'\n"
     "  attribute REGISTER_ACCESS of e : entity is \"R[0] (EXTEST)\";\n"
     "                                                ^"},
    {"a huge register", "attribute REGISTER_ACCESS of e : entity is \"R[268435457] (EXTEST)\";",
     "2:47: expected a register's length in bits (1 to 268435456), found '268435457'\n"
     "  attribute REGISTER_ACCESS of e : entity is \"R[268435457] (EXTEST)\";\n"
     "                                                ^"},
    {"a place behind quotes in a text",
     "attribute REGISTER_ACCESS of e : entity is\n\"R (A CAPTURES \"\"), S[0] (B)\";",
     "3:23: expected a register's length in bits (1 to 268435456), found '0'\n"
     "  \"R (A CAPTURES \"\"), S[0] (B)\";\n"
     "                        ^"},
    {"a cell twice",
     "attribute BOUNDARY_LENGTH of e : entity is 2;\n"
     "attribute BOUNDARY_REGISTER of e : entity is \"0 (BC_1, A, input, X),\" &\n\"0 (BC_1, B, input, X)\";",
     "4:2: boundary cell 0 is given twice\n"
     "  \"0 (BC_1, B, input, X)\";\n"
     "   ^"},
    {"a cell beyond the end",
     "attribute BOUNDARY_LENGTH of e : entity is 1;\n"
     "attribute BOUNDARY_REGISTER of e : entity is \"1 (BC_1, A, input, X)\";",
     "3:47: boundary cell 1 is outside: the register has 1 cells\n"
     "  attribute BOUNDARY_REGISTER of e : entity is \"1 (BC_1, A, input, X)\";\n"
     "                                                ^"},
    {"a missing cell",
     "attribute BOUNDARY_LENGTH of e : entity is 3;\n"
     "attribute BOUNDARY_REGISTER of e : entity is\n\"2 (BC_1, A, input, X),\" & \"0 (BC_1, B, input, X)\";",
     "4:1: boundary cell 1 is missing\n"
     "  \"2 (BC_1, A, input, X),\" & \"0 (BC_1, B, ...\n"
     "  ^"},
    {"a control cell beyond the end",
     "attribute BOUNDARY_REGISTER of e : entity is \"0 (BC_1, A, output3, X, 7, 0, Z)\";",
     "2:47: the control cell of boundary cell 0 is outside: the register has 1 cells\n"
     "  attribute BOUNDARY_REGISTER of e : entity is \"0 (BC_1, A, output3, X, 7, 0, Z)\";\n"
     "                                                ^"},
    {"an unknown function", "attribute BOUNDARY_REGISTER of e : entity is \"0 (BC_1, A, output4, X)\";",
     "2:59: 'output4' is no function of a boundary cell\n"
     "  attribute BOUNDARY_REGISTER of e : entity is \"0 (BC_1, A, output4, X)\";\n"
     "                                                            ^"},
    {"an unknown safe level", "attribute BOUNDARY_REGISTER of e : entity is\n\"0 (BC_1, A, input, Z)\";",
     "3:21: expected the safe level of a cell (0, 1 or X), found 'Z'\n"
     "  \"0 (BC_1, A, input, Z)\";\n"
     "                      ^"},
    {"an unknown disabled state",
     "attribute BOUNDARY_REGISTER of e : entity is\n\"0 (BC_1, A, output3, X, 0, 1, HIGH)\";",
     "3:32: expected Z, WEAK0, WEAK1, PULL0, PULL1 or KEEPER, found 'HIGH'\n"
     "  \"0 (BC_1, A, output3, X, 0, 1, HIGH)\";\n"
     "                                 ^"},
    {"a huge boundary register", "attribute BOUNDARY_LENGTH of e : entity is 65537;",
     "2:44: BOUNDARY_LENGTH: expected a number from 1 to 65536\n"
     "  attribute BOUNDARY_LENGTH of e : entity is 65537;\n"
     "                                             ^"},
    {"a pin map without pins", "constant P : PIN_MAP_STRING := \"A:1, B:(2,3), C:\";",
     "2:49: expected a package pin, found the end of the text\n"
     "  constant P : PIN_MAP_STRING := \"A:1, B:(2,3), C:\";\n"
     "                                                  ^"},
};
INSTANTIATE_TEST_SUITE_P(Registers, BsdlErrorsTest, testing::ValuesIn(registerRows));

TEST(BsdlErrorsTest, theInstructionLengthMustBeThere) {
  const auto part = BsdlFile::parse("part.bsd", "-- none\nentity e is\nend e;\n");
  ASSERT_FALSE(part);
  EXPECT_EQ(part.failure().text,
            "part.bsd:2:8: attribute INSTRUCTION_LENGTH of e is missing\n  entity e is\n         ^");
}

TEST(BsdlErrorsTest, anEntityMustBeThere) {
  const auto empty = BsdlFile::parse("part.bsd", "");
  ASSERT_FALSE(empty);
  EXPECT_EQ(empty.failure().text, "part.bsd:1:1: expected an entity, found the end of the file");
  const auto open = BsdlFile::parse("part.bsd", "entity e is\nattribute INSTRUCTION_LENGTH of e : entity is 4;");
  ASSERT_FALSE(open);
  EXPECT_EQ(open.failure().text,
            "part.bsd:2:49: expected 'end', found the end of the file\n"
            "  attribute INSTRUCTION_LENGTH of e : entity is 4;\n"
            "                                                  ^");
}

TEST(BsdlErrorsTest, everyCutOfARealFileIsAFailure) {
  for (const char* file : {"minnow8.bsd", "perch20.bsdl", "gudgeon.bsm", "tench.bsd"}) {
    const std::string text = TestFiles::text(TestFiles::path(file));
    const std::size_t end = std::max(text.rfind("\nend ") + 1, text.rfind("\nEND ") + 1);
    for (std::size_t size = 0; size < end; size += 7) {
      const auto part = BsdlFile::parse(file, std::string_view(text).substr(0, size));
      ASSERT_FALSE(part) << file << " cut to " << size << " bytes";
      ASSERT_EQ(part.failure().text.find(std::string(file) + ':'), 0U) << part.failure().text;
    }
  }
}

}  // namespace
