#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "manager/parts/BsdlFile.h"
#include "tests/unit/manager/parts/TestFiles.h"

namespace {

using testing::ElementsAre;
using testing::Pair;

Part readPart(const std::string& file) {
  Result<Part> part = BsdlFile::read(TestFiles::path(file));
  if (part) return *part;
  ADD_FAILURE() << part.failure().text;
  return {};
}

/// As it is written in the file: X where the value does not count.
std::string pattern(const BitPattern& bits) {
  std::string text = bits.value.binary();
  const std::string care = bits.care.binary();
  for (std::size_t i = 0; i < text.size(); ++i)
    if (care[i] == '0') text[i] = 'X';
  return text;
}

std::string opcodes(const Part& part, const std::string& instruction) {
  std::string text;
  for (const BitVector& opcode : part.opcodes.at(instruction)) text += opcode.binary() + ' ';
  return text;
}

std::string access(const Part& part, const std::string& instruction) {
  const auto place = part.access.find(instruction);
  return place == part.access.end() ? "-" : place->second.reg + ' ' + std::to_string(place->second.length);
}

std::string cell(const Part& part, std::size_t number) {
  const BoundaryCell& cell = part.boundary.at(number);
  std::string text = cell.type + ' ' + (cell.port.empty() ? "*" : cell.port) + ' ' + cell.function + ' ' + cell.safe;
  if (cell.control >= 0)
    text += ' ' + std::to_string(cell.control) + ' ' + cell.disableValue + ' ' + cell.disableResult;
  return text;
}

TEST(BsdlFileTest, readsAPartOfEightPages) {
  const Part part = readPart("minnow8.bsd");
  EXPECT_EQ(part.name, "minnow8");
  EXPECT_EQ(part.source, TestFiles::path("minnow8.bsd"));
  EXPECT_EQ(part.kind, Part::Kind::plain);
  EXPECT_EQ(part.irLength, 8U);
  EXPECT_EQ(pattern(part.irCapture), "XXXXXX01");
  EXPECT_EQ(part.opcodes.size(), 13U);
  EXPECT_EQ(opcodes(part, "ISC_ERASE"), "11101101 ");
  ASSERT_EQ(part.idcodes.size(), 1U);
  EXPECT_EQ(pattern(part.idcodes[0]), "XXXX1000000000000001111111111101");
  EXPECT_FALSE(part.usercode.has_value());
  EXPECT_DOUBLE_EQ(part.maxTck, 10e6);
  EXPECT_EQ(cell(part, 0), "BC_1 Q output2 X");
  EXPECT_EQ(cell(part, 1), "BC_4 CE input X");
  EXPECT_THAT(part.pins, ElementsAre(Pair("CE", "6"), Pair("GND", "8"), Pair("Q", "5"), Pair("TCK", "1"),
                                     Pair("TDI", "3"), Pair("TDO", "4"), Pair("TMS", "2"), Pair("VCC", "7")));
  EXPECT_EQ(access(part, "ISC_READ"), "PAGE 64");
  EXPECT_EQ(access(part, "SAMPLE"), "BOUNDARY 2");
  EXPECT_EQ(access(part, "ISC_STATUS"), "-");
  EXPECT_TRUE(part.hasIsc);
  EXPECT_FALSE(part.isc.empty());
}

TEST(BsdlFileTest, readsWhatMakersWrite) {
  const Part part = readPart("perch20.bsdl");
  EXPECT_EQ(part.name, "perch20");
  EXPECT_EQ(part.irLength, 5U);
  EXPECT_DOUBLE_EQ(part.maxTck, 20e6);
  EXPECT_EQ(part.opcodes.size(), 12U);
  EXPECT_EQ(opcodes(part, "EXTEST"), "00000 10000 ");
  EXPECT_EQ(opcodes(part, "SECRET_1"), "01010 ") << "a digit that may be anything is 0";
  EXPECT_EQ(opcodes(part, "BYPASS"), "11111 11000 ");
  ASSERT_EQ(part.idcodes.size(), 2U);
  EXPECT_EQ(pattern(part.idcodes[0]), "00010100001000010000000011101101");
  EXPECT_EQ(pattern(part.idcodes[1]), "XXXX0100001000010001000011101101");
  EXPECT_EQ(pattern(part.usercode.value()), "0000000000000000111100001111XXXX");
  EXPECT_FALSE(part.hasIsc);
  EXPECT_TRUE(part.isc.empty());
}

TEST(BsdlFileTest, readsRegistersOfAllForms) {
  const Part part = readPart("perch20.bsdl");
  EXPECT_EQ(access(part, "RUNBIST"), "BIST 4");
  EXPECT_EQ(access(part, "TRIM"), "TRIMS 12");
  EXPECT_EQ(access(part, "SECRET_2"), "WIDE 0");
  EXPECT_EQ(access(part, "EXTEST_TRAIN"), "BOUNDARY 16");
  EXPECT_EQ(access(part, "EXTEST"), "BOUNDARY 16");
  EXPECT_EQ(access(part, "HIGHZ"), "BYPASS 1");
  EXPECT_EQ(access(part, "IDCODE"), "DEVICE_ID 32");
  EXPECT_EQ(access(part, "CLAMP"), "-") << "the part has no such instruction";
}

TEST(BsdlFileTest, readsBoundaryCellsOfAllForms) {
  const Part part = readPart("perch20.bsdl");
  ASSERT_EQ(part.boundary.size(), 16U);
  EXPECT_EQ(cell(part, 15), "BC_4 CLK clock X");
  EXPECT_EQ(cell(part, 14), "BC_1 * controlr 0");
  EXPECT_EQ(cell(part, 12), "BC_1 Y(1) output3 X 14 0 Z");
  EXPECT_EQ(cell(part, 11), "BC_1 Y(2) output2 1 11 1 WEAK1");
  EXPECT_EQ(cell(part, 9), "BC_2 A(3) input X");
  EXPECT_EQ(cell(part, 8), "BC_2 A(2) input X") << "what an open input reads does not matter";
  EXPECT_EQ(cell(part, 4), "PC_7 BUS_IO(1) bidir X 5 1 KEEPER") << "a comma is missing before it";
  EXPECT_EQ(cell(part, 1), "BC_4 RXP observe_only X");
  EXPECT_EQ(cell(part, 0), "BC_1 * internal X");
}

TEST(BsdlFileTest, takesThePinsOfTheFirstPackage) {
  const Part part = readPart("perch20.bsdl");
  EXPECT_EQ(part.pins.size(), 23U);
  EXPECT_EQ(part.pins.at("A(3)"), "P1") << "3 downto 0";
  EXPECT_EQ(part.pins.at("A(0)"), "P4");
  EXPECT_EQ(part.pins.at("Y(0)"), "P5");
  EXPECT_EQ(part.pins.at("BUS_IO(2)"), "P10");
  EXPECT_EQ(part.pins.at("TRST_B"), "P21");
}

TEST(BsdlFileTest, readsAnOldFile) {
  const Part part = readPart("gudgeon.bsm");
  EXPECT_EQ(part.name, "gudgeon");
  EXPECT_EQ(part.irLength, 8U) << "2#1000#";
  EXPECT_EQ(opcodes(part, "BYPASS"), "11111111 10000100 ");
  EXPECT_EQ(cell(part, 0), "BC_1 Q(2) output3 X 4 1 Z");
  EXPECT_TRUE(part.idcodes.empty());
  EXPECT_DOUBLE_EQ(part.maxTck, 6.25e6);
}

TEST(BsdlFileTest, bypassIsAllOnesAndAlwaysThere) {
  const auto part =
      BsdlFile::parse("a.bsd",
                      "entity a is\nattribute INSTRUCTION_LENGTH of a : entity is 3;\n"
                      "attribute INSTRUCTION_OPCODE of a : entity is \"EXTEST (000), BYPASS (10X, 111)\";\n"
                      "end a;\n");
  ASSERT_TRUE(part) << part.failure().text;
  EXPECT_EQ(opcodes(*part, "BYPASS"), "111 100 ");
  const auto bare = BsdlFile::parse("b.bsd", "entity b is\nattribute INSTRUCTION_LENGTH of b : entity is 4;\nend b;\n");
  ASSERT_TRUE(bare) << bare.failure().text;
  ASSERT_NE(bare->opcode("BYPASS"), nullptr);
  EXPECT_EQ(bare->opcode("BYPASS")->binary(), "1111");
  EXPECT_EQ(bare->opcode("EXTEST"), nullptr);
}

TEST(BsdlFileTest, numbersMayHaveABase) {
  for (const char* number : {"16#1F#", "31", "3_1", "2#1_1111#"}) {
    const auto part = BsdlFile::parse(
        "a.bsd", std::string("entity a is\nattribute INSTRUCTION_LENGTH of a : entity is ") + number + ";\nend a;\n");
    ASSERT_TRUE(part) << part.failure().text;
    EXPECT_EQ(part->irLength, 31U) << number;
  }
}

TEST(BsdlFileTest, attributesMayComeInAnyOrder) {
  const auto part = BsdlFile::parse("a.bsd",
                                    "entity a is\n"
                                    "attribute BOUNDARY_REGISTER of a : entity is \"0 (BC_1, *, internal, X)\";\n"
                                    "attribute INSTRUCTION_OPCODE of a : entity is \"EXTEST (000)\";\n"
                                    "attribute INSTRUCTION_LENGTH of a : entity is 3;\n"
                                    "end a;\n");
  ASSERT_TRUE(part) << part.failure().text;
  EXPECT_EQ(access(*part, "EXTEST"), "BOUNDARY 1");
}

TEST(BsdlFileTest, aCellMayDriveOnePortAndObserveAnother) {
  const auto part = BsdlFile::parse("a.bsd",
                                    "entity a is\n"
                                    "attribute INSTRUCTION_LENGTH of a : entity is 3;\n"
                                    "attribute BOUNDARY_LENGTH of a : entity is 2;\n"
                                    "attribute BOUNDARY_REGISTER of a : entity is\n"
                                    "\"0 (BC_1, A, input, X), 0 (BC_1, B, output2, 0), 1 (BC_1, C, output2, 1)\";\n"
                                    "end a;\n");
  ASSERT_TRUE(part.ok()) << part.failure().text;
  ASSERT_EQ(part->boundary.size(), 2U);
  EXPECT_EQ(part->boundary[0].port, "B");
  EXPECT_EQ(part->boundary[0].function, "output2");
  EXPECT_EQ(part->boundary[0].observedPort, "A");
  EXPECT_EQ(part->boundary[1].observedPort, "");
}

TEST(BsdlFileTest, aMissingFileIsAFailure) {
  const auto part = BsdlFile::read("/nowhere/part.bsd");
  ASSERT_FALSE(part);
  EXPECT_EQ(part.failure().text, "Cannot read /nowhere/part.bsd: No such file or directory.");
  const auto directory = BsdlFile::read("/");
  ASSERT_FALSE(directory);
  EXPECT_EQ(directory.failure().text, "/ is a directory.");
}

TEST(BsdlFileTest, readsTheJsonFileBesideIt) {
  const TestFiles::Directory directory;
  const std::string path = directory.write("minnow8.bsd", TestFiles::text(TestFiles::path("minnow8.bsd")));
  directory.write("minnow8.json", R"({"name": "Minnow-8", "kind": "prom", "memoryBits": 512})");
  const auto part = BsdlFile::read(path);
  ASSERT_TRUE(part) << part.failure().text;
  EXPECT_EQ(part->name, "minnow-8");
  EXPECT_EQ(part->kind, Part::Kind::prom);
  EXPECT_EQ(part->memoryBits, 512U);

  directory.write("minnow8.json", "{");
  const auto bad = BsdlFile::read(path);
  ASSERT_FALSE(bad);
  EXPECT_EQ(bad.failure().text, directory.path() + "/minnow8.json:1:2: this is no JSON from here on\n  {\n   ^");
}

TEST(BitPatternTest, comparesOnlyTheBitsThatCount) {
  const BitPattern bits{BitVector::fromNumber(0b1001, 4), BitVector::fromNumber(0b1101, 4)};
  EXPECT_TRUE(bits.matches(BitVector::fromNumber(0b1011, 4)));
  EXPECT_FALSE(bits.matches(BitVector::fromNumber(0b1000, 4)));
  EXPECT_FALSE(bits.matches(BitVector::fromNumber(0b01001, 5))) << "of another size";
}

}  // namespace
