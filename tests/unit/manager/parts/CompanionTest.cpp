#include <gtest/gtest.h>

#include "manager/parts/BsdlFile.h"

namespace {

Part base() {
  auto part =
      BsdlFile::parse("a.bsd",
                      "entity carp is\nattribute INSTRUCTION_LENGTH of carp : entity is 4;\n"
                      "attribute INSTRUCTION_OPCODE of carp : entity is \"STATUS (0001), USER1 (0010), OPT (0011)\";\n"
                      "attribute REGISTER_ACCESS of carp : entity is \"S[8] (STATUS)\";\nend carp;\n");
  EXPECT_TRUE(part) << part.failure().text;
  return *part;
}

TEST(CompanionTest, setsEverythingItKnows) {
  Part part = base();
  const Status status = BsdlFile::parseCompanion("carp.json", R"({
    "name": "Carp-7", "kind": "fpga", "memoryBits": 4194304, "revisions": 4,
    "registers": [
      {"name": "status", "instruction": "status", "length": 8,
       "fields": [{"name": "busy", "first": 0, "meaning": "works"},
                  {"name": "heat", "first": 1, "length": 7, "scale": 0.5, "offset": -40, "unit": "C"}]},
      {"name": "options", "instruction": "OPT", "writeInstruction": "OPT", "length": 16}],
    "bridge": {"spi": "user1", "bpi": "OPT"}})",
                                                 part);
  ASSERT_TRUE(status) << status.failure().text;
  EXPECT_EQ(part.name, "carp-7");
  EXPECT_EQ(part.kind, Part::Kind::fpga);
  EXPECT_EQ(part.memoryBits, 4194304U);
  EXPECT_EQ(part.revisions, 4U);
  EXPECT_EQ(part.bridge.spiInstruction, "USER1");
  EXPECT_EQ(part.bridge.bpiInstruction, "OPT");
  ASSERT_EQ(part.registers.size(), 2U);
  const NamedRegister* reg = part.findRegister("status");
  ASSERT_NE(reg, nullptr);
  EXPECT_EQ(reg->instruction, "STATUS");
  EXPECT_EQ(reg->writeInstruction, "");
  EXPECT_EQ(reg->length, 8U);
  ASSERT_EQ(reg->fields.size(), 2U);
  EXPECT_EQ(reg->fields[0].length, 1U);
  EXPECT_EQ(reg->fields[0].meaning, "works");
  EXPECT_EQ(reg->fields[1].first, 1U);
  EXPECT_DOUBLE_EQ(reg->fields[1].scale, 0.5);
  EXPECT_DOUBLE_EQ(reg->fields[1].offset, -40);
  EXPECT_EQ(reg->fields[1].unit, "C");
  EXPECT_EQ(part.findRegister("options")->writeInstruction, "OPT");
  EXPECT_EQ(part.findRegister("dna"), nullptr);
}

struct Row {
  const char* text;
  const char* error;  ///< behind "carp.json:"
};

void PrintTo(const Row& row, std::ostream* stream) { *stream << row.text; }

class CompanionErrorsTest : public testing::TestWithParam<Row> {};

TEST_P(CompanionErrorsTest, namesThePlaceOrTheKey) {
  Part part = base();
  const Status status = BsdlFile::parseCompanion("carp.json", GetParam().text, part);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, std::string("carp.json:") + GetParam().error);
  EXPECT_EQ(part.kind, Part::Kind::plain) << "a failure changes nothing";
  EXPECT_TRUE(part.registers.empty());
}

const Row rows[] = {
    {"", "1:1: this is no JSON from here on"},
    {"{\"kind\": \"fpga\",\n \"memoryBits\": many}",
     "2:16: this is no JSON from here on\n   \"memoryBits\": many}\n                 ^"},
    {"{\"kind\": \"fpga\"", "1:16: this is no JSON from here on\n  {\"kind\": \"fpga\"\n                 ^"},
    {"{\"memoryBits\": 1e999}", "1:1: this JSON file has a number out of range\n  {\"memoryBits\": 1e999}\n  ^"},
    {"[]", " the file: expected an object in {}"},
    {R"({"kind": "fpga", "memorybits": 3})", " memorybits: no such key"},
    {R"({"kind": 3})", " kind: expected a text that is not empty"},
    {R"({"kind": "dsp"})", " kind: expected \"plain\", \"fpga\", \"prom\", \"cpld\" or \"mpm\""},
    {R"({"name": ""})", " name: expected a text that is not empty"},
    {R"({"memoryBits": -1})", " memoryBits: expected a whole number from 1 to 68719476736"},
    {R"({"memoryBits": 1.5})", " memoryBits: expected a whole number from 1 to 68719476736"},
    {R"({"revisions": 257})", " revisions: expected a whole number from 0 to 256"},
    {R"({"kind": "fpga", "registers": {}})", " registers: expected a list in []"},
    {R"({"registers": [3]})", " registers[0]: expected an object in {}"},
    {R"({"registers": [{"name": "s", "instruction": "STATUS"}]})", " registers[0].length: is missing"},
    {R"({"registers": [{"name": "s", "instruction": "STATE", "length": 8}]})",
     " registers[0].instruction: the BSDL file has no instruction STATE"},
    {R"({"registers": [{"name": "s", "instruction": "OPT", "length": 0}]})",
     " registers[0].length: expected a whole number from 1 to 65536"},
    {R"({"registers": [{"name": "s", "instruction": "STATUS", "length": 9}]})",
     " registers[0].length: the register behind STATUS has 8 bits in the BSDL file"},
    {R"({"registers": [{"name": "s", "instruction": "OPT", "writeInstruction": "STATUS", "length": 9}]})",
     " registers[0].length: the register behind STATUS has 8 bits in the BSDL file"},
    {R"({"registers": [{"name": "s", "instruction": "OPT", "length": 8, "size": 8}]})",
     " registers[0].size: no such key"},
    {R"({"registers": [{"name": "s", "instruction": "OPT", "length": 8},
                       {"name": "s", "instruction": "OPT", "length": 8}]})",
     " registers[1].name: \"s\" is given twice"},
    {R"({"registers": [{"name": "s", "instruction": "OPT", "length": 8, "fields": [{"name": "b", "first": 8}]}]})",
     " registers[0].fields[0]: the field ends beyond the register's 8 bits"},
    {R"({"registers": [{"name": "s", "instruction": "OPT", "length": 8,
                        "fields": [{"name": "b", "first": 0, "scale": "2"}]}]})",
     " registers[0].fields[0].scale: expected a number"},
    {R"({"bridge": {"spi": "USER2"}})", " bridge.spi: the BSDL file has no instruction USER2"},
    {R"({"bridge": {"i2c": "USER1"}})", " bridge.i2c: no such key"},
};
INSTANTIATE_TEST_SUITE_P(Rows, CompanionErrorsTest, testing::ValuesIn(rows));

TEST(CompanionTest, listsAreBounded) {
  Part part = base();
  std::string text = "{\"registers\": [0";
  for (int i = 0; i < 1024; ++i) text += ", 0";
  const Status status = BsdlFile::parseCompanion("carp.json", text + "]}", part);
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "carp.json: registers: expected at most 1024 entries");
}

}  // namespace
