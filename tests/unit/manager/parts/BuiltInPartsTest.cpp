#include <gtest/gtest.h>

#include <bit>
#include <set>

#include "manager/parts/BsdlFile.h"
#include "manager/parts/BuiltInParts.h"
#include "manager/parts/PartLibrary.h"

namespace {

/// One of the built-in parts.
class BuiltInPartsTest : public testing::TestWithParam<std::string> {
 protected:
  void SetUp() override {
    auto part = library_.find(GetParam());
    ASSERT_TRUE(part) << part.failure().text;
    part_ = *part;
  }

  const Part& part() const { return *part_; }
  bool isFpga() const { return part().kind == Part::Kind::fpga; }
  std::uint64_t opcode(const std::string& instruction) const { return part().opcode(instruction)->number(); }
  /// Bits of the data file that a flow takes or gives.
  std::size_t dataBits(const Isc::Flow& flow) const;

 private:
  PartLibrary library_;
  PartPointer part_;
};

std::size_t BuiltInPartsTest::dataBits(const Isc::Flow& flow) const {
  using Kind = Isc::Value::Kind;
  std::size_t bits = 0;
  const auto count = [&](const std::vector<Isc::Field>& fields, std::size_t times) {
    for (const Isc::Field& field : fields)
      if (field.value.kind == Kind::input || field.value.kind == Kind::output) bits += field.length * times;
  };
  for (const Isc::Block& block : flow.blocks)
    for (const Isc::Item& item : block.items)
      for (const Isc::Step& step : item.steps) {
        count(step.updates, block.count);
        count(step.captures, block.count);
      }
  return bits;
}

/// Instructions that change something for good, or cut the device off.
constexpr const char* harmful[] = {"ISC_ENABLE",      "ISC_ERASE",
                                   "ISC_PROGRAM",     "ISC_PROGRAM_SECURITY",
                                   "CFG_IN",          "CFG_CLEAR",
                                   "CFG_LOAD",        "ISC_PROGRAM_USERCODE",
                                   "EFUSE_KEY",       "EFUSE_CONTROL",
                                   "REVISION_WRITE",  "PROM_OPTIONS_WRITE",
                                   "ISC_PROGRAM_UES", "PROGRAM_CUSTOMER_CODE"};

TEST_P(BuiltInPartsTest, hasTheStandardInstructions) {
  EXPECT_EQ(part().name, GetParam());
  EXPECT_EQ(part().source, "built in");
  EXPECT_EQ(part().irLength, 8U);
  for (const char* instruction : {"EXTEST", "SAMPLE", "PRELOAD", "BYPASS", "IDCODE", "USERCODE", "HIGHZ", "CLAMP"})
    EXPECT_NE(part().opcode(instruction), nullptr) << instruction;
  EXPECT_EQ(part().irCapture.value.number(0, 2), 0b01U);
  EXPECT_EQ(part().irCapture.care.number(0, 2), 0b11U);
  EXPECT_GT(part().maxTck, 0);
  EXPECT_TRUE(part().usercode.has_value());
  EXPECT_EQ(part().blankUsercode.value(), BitVector(32, true));
}

TEST_P(BuiltInPartsTest, hasAnIdcodeOfItsOwn) {
  ASSERT_EQ(part().idcodes.size(), 1U);
  const BitPattern& idcode = part().idcodes[0];
  EXPECT_EQ(idcode.care.number(), 0x0FFFFFFFU) << "any version";
  EXPECT_EQ(idcode.value.number(0, 12), 0xFFDU);
  PartLibrary library;
  for (const std::string& name : PartLibrary::builtInNames()) {
    const auto other = library.find(name);
    ASSERT_TRUE(other);
    EXPECT_EQ((*other)->matchesIdcode(idcode.value), name == part().name) << name;
  }
}

TEST_P(BuiltInPartsTest, aFlippedBitOrTwoMakeNoInstructionHarmful) {
  for (const char* instruction : harmful) {
    if (part().opcode(instruction) == nullptr) continue;
    for (const auto& [name, opcodes] : part().opcodes)
      for (const BitVector& other : opcodes)
        EXPECT_TRUE(name == instruction || std::popcount(opcode(instruction) ^ other.number()) >= 3)
            << instruction << " and " << name;
  }
}

TEST_P(BuiltInPartsTest, allButStandardInstructionsHaveOpcodesOfTheirOwn) {
  std::set<std::uint64_t> seen;
  for (const auto& [name, opcodes] : part().opcodes)
    EXPECT_TRUE(name == "PRELOAD" || seen.insert(opcodes.at(0).number()).second) << name;
}

TEST_P(BuiltInPartsTest, everyInstructionHasARegister) {
  for (const auto& [name, opcodes] : part().opcodes) {
    const auto access = part().access.find(name);
    ASSERT_NE(access, part().access.end()) << name;
    EXPECT_EQ(access->second.length == 0, name == part().bridge.spiInstruction) << name;
  }
  for (const auto& [name, access] : part().access) EXPECT_NE(part().opcode(name), nullptr) << name;
}

TEST_P(BuiltInPartsTest, theBoundaryRegisterHasPins) {
  EXPECT_GE(part().boundary.size(), 8U);
  EXPECT_LE(part().boundary.size(), 64U);
  for (const BoundaryCell& cell : part().boundary) {
    EXPECT_TRUE(cell.port.empty() || part().pins.count(cell.port) == 1) << cell.port;
    if (cell.function != "output3") continue;
    ASSERT_GE(cell.control, 0);
    const std::string& control = part().boundary.at(static_cast<std::size_t>(cell.control)).function;
    EXPECT_TRUE(control == "control" || control == "controlr") << cell.port;
  }
}

TEST_P(BuiltInPartsTest, flowsCoverTheWholeMemory) {
  std::size_t flows = 0;
  for (const Isc::Flow& flow : part().isc.flows) {
    if (flow.array.empty()) continue;
    EXPECT_EQ(dataBits(flow), part().memoryBits) << flow.name;
    ++flows;
  }
  EXPECT_GE(flows, 3U);
}

TEST_P(BuiltInPartsTest, fieldsHaveTheLengthOfTheirRegister) {
  for (const Isc::Flow& flow : part().isc.flows)
    for (const Isc::Block& block : flow.blocks)
      for (const Isc::Item& item : block.items)
        for (const Isc::Step& step : item.steps) {
          const std::size_t length = part().access.at(step.instruction).length;
          EXPECT_LE(step.updates.size() + step.captures.size(), 1U);
          for (const Isc::Field& field : step.updates) EXPECT_EQ(field.length, length) << step.instruction;
          for (const Isc::Field& field : step.captures) EXPECT_EQ(field.length, length) << step.instruction;
        }
}

TEST_P(BuiltInPartsTest, canBeProgrammed) {
  const Isc::Action* program = part().isc.findAction("program");
  ASSERT_NE(program, nullptr);
  using Choice = Isc::Use::Choice;
  ASSERT_GE(program->procedures.size(), 5U);
  EXPECT_EQ(program->procedures[0].name, "enable");
  EXPECT_EQ(program->procedures[1].name, "erase");
  EXPECT_EQ(program->procedures[1].choice, Choice::recommended);
  std::size_t verifies = 0;
  for (const Isc::Use& use : program->procedures)
    if (use.name == "verify" && use.choice == Choice::optional) ++verifies;
  EXPECT_EQ(verifies, 1U);
  for (const char* name : {"erase", "verify", "read"}) EXPECT_NE(part().isc.findAction(name), nullptr) << name;
}

TEST_P(BuiltInPartsTest, registersAreThere) {
  EXPECT_NE(part().findRegister("status"), nullptr);
  EXPECT_NE(part().findRegister("mfg_code"), nullptr);
  for (const char* name : {"dna", "efuse", "efuse_control", "monitor"})
    EXPECT_EQ(part().findRegister(name) != nullptr, isFpga()) << name;
  for (const char* name : {"security", "ues", "usercode"})
    EXPECT_EQ(part().findRegister(name) != nullptr, !isFpga()) << name;
  EXPECT_EQ(part().findRegister("revision") != nullptr, part().revisions > 0);
  EXPECT_EQ(part().bridge.spiInstruction, isFpga() ? "USER1" : "");
  EXPECT_EQ(part().bridge.bpiInstruction, isFpga() ? "USER2" : "");
}

std::string testName(const testing::TestParamInfo<std::string>& info) {
  std::string name = info.param;
  for (char& character : name)
    if (character == '-') character = '_';
  return name;
}
INSTANTIATE_TEST_SUITE_P(All, BuiltInPartsTest, testing::ValuesIn(PartLibrary::builtInNames()), testName);

TEST(BuiltInPartsListTest, theFamiliesAreComplete) {
  const std::vector<std::string> expected = {
      "marlin3-1", "marlin3-4", "marlin3-16", "marlin3an-1", "marlin3an-4", "marlin3an-16", "zp18v01",   "zp18v02",
      "zp18v04",   "zp20s08",   "zp20s16",    "zp20s32",     "mullet-32",   "mullet-128",   "herring-1", "herring-2"};
  EXPECT_EQ(PartLibrary::builtInNames(), expected);
}

TEST(BuiltInPartsListTest, kindsAndSizesAreAsTheirNamesSay) {
  struct Row {
    const char* name;
    Part::Kind kind;
    std::size_t bits;
    std::size_t revisions;
  };
  const Row rows[] = {{"marlin3-1", Part::Kind::fpga, 1U << 20U, 0},   {"marlin3-16", Part::Kind::fpga, 16U << 20U, 0},
                      {"marlin3an-4", Part::Kind::fpga, 4U << 20U, 0}, {"zp18v01", Part::Kind::prom, 1U << 20U, 0},
                      {"zp18v04", Part::Kind::prom, 4U << 20U, 0},     {"zp20s08", Part::Kind::prom, 8U << 20U, 4},
                      {"zp20s32", Part::Kind::prom, 32U << 20U, 4},    {"mullet-32", Part::Kind::cpld, 6144, 0},
                      {"mullet-128", Part::Kind::cpld, 24576, 0},      {"herring-1", Part::Kind::mpm, 16U << 20U, 8},
                      {"herring-2", Part::Kind::mpm, 32U << 20U, 8}};
  PartLibrary library;
  for (const Row& row : rows) {
    const auto part = library.find(row.name);
    ASSERT_TRUE(part) << part.failure().text;
    EXPECT_EQ((*part)->kind, row.kind) << row.name;
    EXPECT_EQ((*part)->memoryBits, row.bits) << row.name;
    EXPECT_EQ((*part)->revisions, row.revisions) << row.name;
  }
}

TEST(BuiltInPartsListTest, thePartsWithFlashInsideConfigureTheirMemoryToo) {
  PartLibrary library;
  const auto part = library.find("marlin3an-1");
  ASSERT_TRUE(part) << part.failure().text;
  for (const char* name : {"configure", "configure_verify", "configure_read", "configure_erase", "load"})
    EXPECT_NE((*part)->isc.findAction(name), nullptr) << name;
  EXPECT_EQ((*part)->isc.findFlow("program", "flash")->blocks.size(), 3U);
  EXPECT_NE((*part)->isc.findFlow("configure", "config"), nullptr);
}

}  // namespace
