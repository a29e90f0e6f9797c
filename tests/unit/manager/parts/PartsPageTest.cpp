#include <gtest/gtest.h>

#include <filesystem>

#include "manager/parts/BsdlFile.h"
#include "manager/parts/PartLibrary.h"
#include "tests/unit/manager/parts/TestFiles.h"

namespace {

/// The blocks of docs/parts.md in this language.
std::vector<std::string> blocks(const std::string& language) {
  static const std::string page =
      TestFiles::text((std::filesystem::path(__FILE__).parent_path() / "../../../../docs/parts.md").string());
  const std::string begin = "\n```" + language + "\n";
  std::vector<std::string> result;
  for (std::size_t place = page.find(begin); place != std::string::npos; place = page.find(begin, place + 1)) {
    const std::size_t first = place + begin.size();
    result.push_back(page.substr(first, page.find("\n```", first) - first + 1));
  }
  return result;
}

TEST(PartsPageTest, thePartOfOnesOwnCanBeUsed) {
  ASSERT_EQ(blocks("vhdl").size(), 1U);
  ASSERT_EQ(blocks("json").size(), 2U);
  const TestFiles::Directory directory;
  directory.write("minnow8.bsd", blocks("vhdl")[0]);
  directory.write("minnow8.json", blocks("json")[1]);
  PartLibrary library({directory.path()});
  const auto part = library.find("minnow8");
  ASSERT_TRUE(part) << part.failure().text;
  EXPECT_EQ((*part)->kind, Part::Kind::prom);
  EXPECT_EQ((*part)->memoryBits, 512U);
  EXPECT_EQ((*part)->isc.actions.size(), 4U);
  EXPECT_EQ((*part)->registers.size(), 2U);
  EXPECT_EQ(library.identify(BitVector::fromNumber(0x38001FFD, 32)), *part);
}

TEST(PartsPageTest, theJsonFileWithAllKeysIsValid) {
  auto part =
      BsdlFile::parse("a.bsd",
                      "entity a is\nattribute INSTRUCTION_LENGTH of a : entity is 4;\n"
                      "attribute INSTRUCTION_OPCODE of a : entity is \"ISC_STATUS (0001), USERCODE (0010), \" &\n"
                      "\"ISC_PROGRAM_USERCODE (0011), USER1 (0100), USER2 (0101)\";\nend a;\n");
  ASSERT_TRUE(part) << part.failure().text;
  ASSERT_EQ(blocks("json").size(), 2U);
  const Status status = BsdlFile::parseCompanion("a.json", blocks("json")[0], *part);
  ASSERT_TRUE(status) << status.failure().text;
  EXPECT_EQ(part->name, "minnow-8");
  EXPECT_EQ(part->bridge.bpiInstruction, "USER2");
  EXPECT_EQ(part->findRegister("status")->fields.size(), 2U);
}

}  // namespace
