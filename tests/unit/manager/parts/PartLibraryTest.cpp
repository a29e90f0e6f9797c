#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "manager/parts/PartLibrary.h"
#include "tests/unit/manager/parts/TestFiles.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

std::string smallFile(const std::string& entity, const std::string& partNumber) {
  return "entity " + entity + " is\nattribute INSTRUCTION_LENGTH of " + entity +
         " : entity is 5;\nattribute IDCODE_REGISTER of " + entity + " : entity is \"XXXX" + partNumber +
         "111111111101\";\nend " + entity + ";\n";
}

/// The IDCODE of a part with this part number, version 7.
BitVector idcode(std::uint32_t partNumber) { return BitVector::fromNumber(0x70000FFDU | partNumber << 12U, 32); }

std::string nameOf(const PartPointer& part) { return part ? part->name : "none"; }

TEST(PartLibraryTest, findsBuiltInPartsInAnyLetterCase) {
  PartLibrary library;
  for (const char* name : {"marlin3-4", "MARLIN3-4", "Marlin3_4"}) {
    const auto part = library.find(name);
    ASSERT_TRUE(part) << part.failure().text;
    EXPECT_EQ((*part)->name, "marlin3-4");
  }
  EXPECT_EQ(*library.find("marlin3-4"), *library.find("MARLIN3_4")) << "read once";
}

TEST(PartLibraryTest, tellsWhatComesNear) {
  PartLibrary library;
  EXPECT_EQ(library.find("mulet-32").failure().text, "There is no part mulet-32. Did you mean mullet-32?");
  EXPECT_EQ(library.find("zp18v").failure().text, "There is no part zp18v. Did you mean zp18v01, zp18v02, zp18v04?");
  EXPECT_EQ(library.find("pike").failure().text,
            "There is no part pike. Built in are marlin3-1, marlin3-4, marlin3-16, marlin3an-1, marlin3an-4, "
            "marlin3an-16, zp18v01, zp18v02, zp18v04, zp20s08, zp20s16, zp20s32, mullet-32, mullet-128, herring-1, "
            "herring-2.");
  EXPECT_FALSE(library.find("")) << "no name";
}

TEST(PartLibraryTest, identifiesBuiltInParts) {
  PartLibrary library;
  EXPECT_EQ(nameOf(library.identify(idcode(0x3A10))), "marlin3an-16");
  EXPECT_EQ(nameOf(library.identify(idcode(0x6020))), "mullet-32");
  EXPECT_EQ(nameOf(library.identify(idcode(0x6021))), "none");
  EXPECT_EQ(nameOf(library.identify(BitVector(32))), "none");
  EXPECT_EQ(nameOf(library.identify(BitVector(31))), "none");
}

TEST(PartLibraryTest, theUsersPartsWin) {
  const TestFiles::Directory first;
  const TestFiles::Directory second;
  first.write("own.bsd", smallFile("zp18v01", "0101000100000001"));
  second.write("b.BSDL", smallFile("zp18v01", "1111000000000001"));
  second.write("c.bsm", smallFile("roach_9", "1111000000000010"));
  second.write("notes.txt", "not a part");
  PartLibrary library({first.path(), second.path()});
  const auto part = library.find("zp18v01");
  ASSERT_TRUE(part) << part.failure().text;
  EXPECT_EQ((*part)->source, first.path() + "/own.bsd");
  EXPECT_EQ(library.identify(idcode(0x5101)), *part);
  EXPECT_EQ(nameOf(library.identify(idcode(0x5102))), "zp18v02") << "a built-in part behind those of the user";
  const auto roach = library.find("ROACH-9");
  ASSERT_TRUE(roach) << roach.failure().text;
  EXPECT_EQ((*roach)->name, "roach_9");
  EXPECT_EQ(library.identify(idcode(0xF002)), *roach);
  EXPECT_EQ(library.find("roach-8").failure().text, "There is no part roach-8. Did you mean roach-9?");
}

TEST(PartLibraryTest, theNameOfTheJsonFileCounts) {
  const TestFiles::Directory directory;
  directory.write("x.bsd", smallFile("entity_x", "1111000000000001"));
  directory.write("x.json", R"({"name": "Roach-9/C", "kind": "cpld"})");
  PartLibrary library({directory.path()});
  const auto part = library.find("roach-9/c");
  ASSERT_TRUE(part) << part.failure().text;
  EXPECT_EQ((*part)->kind, Part::Kind::cpld);
  EXPECT_FALSE(library.find("entity_x"));
}

TEST(PartLibraryTest, aDamagedFileIsAFailureOfItsPartAlone) {
  const TestFiles::Directory directory;
  const std::string path = directory.write("roach.bsd", "entity roach is\nend roach;\n");
  directory.write("perch.bsd", smallFile("perch", "1111000000000001"));
  PartLibrary library({directory.path()});
  const std::string failure =
      path + ":1:8: attribute INSTRUCTION_LENGTH of roach is missing\n  entity roach is\n         ^";
  EXPECT_EQ(library.find("roach").failure().text, failure);
  EXPECT_TRUE(library.find("perch"));

  std::vector<std::string> problems;
  EXPECT_EQ(nameOf(library.identify(idcode(0x5102), &problems)), "zp18v02");
  EXPECT_THAT(problems, ElementsAre(failure));
  problems.clear();
  EXPECT_EQ(nameOf(library.identify(idcode(0x5102), &problems)), "zp18v02");
  EXPECT_THAT(problems, IsEmpty()) << "told once";
}

TEST(PartLibraryTest, aDirectoryThatIsNotThereIsTheFailureOfWhatIsNotFound) {
  PartLibrary library({"/nowhere/parts"});
  EXPECT_TRUE(library.find("zp18v01")) << "what is built in is there nevertheless";
  for (int i = 0; i < 2; ++i) {
    const auto missing = library.find("roach");
    ASSERT_FALSE(missing);
    EXPECT_EQ(missing.failure().text, "Cannot read the directory of parts /nowhere/parts: No such file or directory.");
  }

  PartLibrary other({"/nowhere/parts"});
  std::vector<std::string> problems;
  EXPECT_EQ(nameOf(other.identify(idcode(0x5102), &problems)), "zp18v02");
  EXPECT_THAT(problems, ElementsAre("Cannot read the directory of parts /nowhere/parts: No such file or directory."));
}

TEST(PartLibraryTest, readsAFileByItsPath) {
  const TestFiles::Directory directory;
  const std::string path = directory.write("roach.bsd", smallFile("roach", "1111000000000001"));
  PartLibrary library({directory.path()});
  const auto part = library.read(path);
  ASSERT_TRUE(part) << part.failure().text;
  EXPECT_EQ((*part)->name, "roach");
  EXPECT_EQ(library.read("/nowhere.bsd").failure().text, "Cannot read /nowhere.bsd: No such file or directory.");
}

}  // namespace
