#include <gtest/gtest.h>

#include <filesystem>

#include "manager/simulator/BoardFile.h"
#include "tests/unit/manager/simulator/Jtag.h"
#include "tests/unit/support/Files.h"

namespace {

std::string examples() {
  return (std::filesystem::path(__FILE__).parent_path() / "../../../../examples/boards").lexically_normal().string();
}

std::string failureOf(const std::string& text) { return TestBoard(text).failure; }

struct Bad {
  const char* text;
  const char* failure;
};

class BadBoard : public testing::TestWithParam<Bad> {};

}  // namespace

TEST_P(BadBoard, IsRefusedWithItsReason) { EXPECT_EQ(failureOf(GetParam().text), GetParam().failure); }

INSTANTIATE_TEST_SUITE_P(
    Texts, BadBoard,
    testing::Values(
        Bad{"[]", "board.json: expected an object, found array"}, Bad{"{}", "board.json: chain: missing"},
        Bad{R"({"chain": {}})", "board.json: chain: expected a list, found object"},
        Bad{R"({"chain": [7]})", "board.json: chain[0]: expected an object, found number"},
        Bad{R"({"chain": [{}]})", "board.json: chain[0].part: expected either \"part\" or \"bsdl\""},
        Bad{R"({"chain": [{"part": 3}]})", "board.json: chain[0].part: expected a text, found number"},
        Bad{R"({"chain": [], "colour": 1})",
            "board.json: colour: unknown key; known here are chain, faults, name, nets, state, tck"},
        Bad{R"({"chain": [{"part": "zp18v01", "size": 1}]})",
            "board.json: chain[0].size: unknown key; known here are bpi, bsdl, dna, faults, memory, model, monitors, "
            "part, registers, spi, usercode"},
        Bad{R"({"chain": [], "tck": 0})", "board.json: tck: expected a number from 1 to 1000000000, found 0"},
        Bad{R"({"chain": [], "tck": "fast"})", "board.json: tck: expected a number, found string"},
        Bad{R"({"chain": [], "faults": {"stuckTdo": 2}})",
            "board.json: faults.stuckTdo: expected a whole number from 0 to 1, found 2"},
        Bad{R"({"chain": [], "faults": {"flipTdo": {"seed": 1}}})", "board.json: faults.flipTdo.rate: missing"},
        Bad{R"({"chain": [], "faults": {"flipTdi": {"rate": 1.5}}})",
            "board.json: faults.flipTdi.rate: expected a number from 0 to 1, found 1.5"},
        Bad{R"({"chain": [], "faults": {"dropAfter": -1}})",
            "board.json: faults.dropAfter: expected a whole number from 0 to 9007199254740992, found -1"},
        Bad{R"({"chain": [{"part": "zp18v01", "dna": "12G4"}]})",
            "board.json: chain[0].dna: expected hex digits of at most 64 bits, found \"12G4\""},
        Bad{R"({"chain": [{"part": "zp18v01", "usercode": "123456789"}]})",
            "board.json: chain[0].usercode: expected hex digits of at most 32 bits, found \"123456789\""},
        Bad{R"({"chain": [{"part": "zp18v01", "spi": {"part": "w25q64"}}]})",
            "board.json: chain[0].spi: the part \"zp18v01\" reaches no SPI flash"},
        Bad{R"({"chain": [{"part": "zp18v01", "monitors": {"humidity": 3}}]})",
            "board.json: chain[0].monitors.humidity: the part \"zp18v01\" has no such monitor"},
        Bad{R"({"chain": [{"part": "zp18v01", "registers": {"depth": "3"}}]})",
            "board.json: chain[0].registers.depth: the part \"zp18v01\" has no such register"},
        Bad{R"({"chain": [{"part": "zp18v01", "model": {"pages": 0}}]})",
            "board.json: chain[0].model.pages: expected a whole number from 1 to 1073741824, found 0"},
        Bad{R"({"chain": [{"part": "zp18v01", "model": {"roles": {"erase": "WIPE"}}}]})",
            "board.json: chain[0].model.roles.erase: the part \"zp18v01\" has no instruction WIPE"},
        Bad{R"({"chain": [{"part": "zp18v01", "model": {"pages": 1000000, "bits": 1000000}}]})",
            "board.json: chain[0].model: the memory of \"zp18v01\" is larger than 2^30 bits"},
        Bad{R"({"chain": [{"part": "zp18v01", "memory": "content.txt"}]})",
            "board.json: chain[0].memory: the extension of content.txt tells no format; known are .bin, .bit, .mcs, "
            ".exo, .hex, .rbt"},
        Bad{R"({"chain": [{"part": "zp18v01", "faults": {"idcode": 5}}]})",
            "board.json: chain[0].faults.idcode: expected a text, found number"},
        Bad{R"({"chain": [{"part": "zp18v01"}], "nets": [["0.CE_N", "1.CE_N"]]})",
            "board.json: nets[0]: \"1.CE_N\" is no pin; expected a device's position, a dot, and a port of its "
            "boundary register, such as \"0.IO(3)\""},
        Bad{R"({"chain": [], "nets": ["a"]})", "board.json: nets: expected a list of lists of texts"}));

TEST(BoardFile, AnErrorOfTheTextHasItsPlace) {
  EXPECT_EQ(failureOf("{\n  \"chain\": [}\n}"),
            "board.json:2:13: syntax error while parsing value - unexpected '}'; expected '[', '{', or "
            "a literal\n"
            "    \"chain\": [}\n"
            "              ^");
  EXPECT_TRUE(failureOf("").starts_with("board.json:1:1: ")) << failureOf("");
  EXPECT_EQ(failureOf(std::string(100, '[') + std::string(100, ']')), "board.json: nests deeper than 32 levels");
}

TEST(BoardFile, UnknownPartsAndFlashesAreNamed) {
  const std::string part = failureOf(R"({"chain": [{"part": "marlin9"}]})");
  EXPECT_TRUE(part.starts_with("board.json: chain[0].part: ")) << part;
  EXPECT_NE(part.find("marlin9"), std::string::npos) << part;
  const std::string flash = failureOf(R"({"chain": [{"part": "marlin3-1", "spi": {"part": "w25q65"}}]})");
  EXPECT_TRUE(flash.starts_with("board.json: chain[0].spi.part: no SPI flash \"w25q65\"; known are ")) << flash;
  EXPECT_NE(flash.find("w25q64"), std::string::npos) << flash;
}

TEST(BoardFile, TheMemoriesOfABoardAreBounded) {
  std::string text = R"({"chain": [)";
  for (int i = 0; i < 100; ++i)
    text += std::string(i > 0 ? "," : "") + R"({"part": "marlin3-1", "spi": {"part": "mt25ql02g"}})";
  EXPECT_EQ(failureOf(text + "]}"), "board.json: chain[3]: the memories up to here are larger than 2^30 bytes in all");
}

TEST(BoardFile, MissingFilesAreNamed) {
  const std::string content = failureOf(R"({"chain": [{"part": "zp18v01", "memory": "none.bin"}]})");
  EXPECT_TRUE(content.starts_with("board.json: chain[0].memory: ")) << content;
  EXPECT_NE(content.find("none.bin"), std::string::npos) << content;
  PartLibrary parts;
  const auto board = SimulatedBoard::read("/nowhere/board.json", parts);
  ASSERT_FALSE(board.ok());
  EXPECT_NE(board.failure().text.find("/nowhere/board.json"), std::string::npos);
}

TEST(BoardFile, TheDefaultBoardIsTheExample) {
  PartLibrary parts;
  const auto board = SimulatedBoard::makeDefault();
  ASSERT_EQ(board->devices(), 3U);
  EXPECT_EQ(board->name(), "default");
  EXPECT_EQ(board->lockName(), "");
  EXPECT_EQ(board->spiMemory(0).size(), std::size_t{8} << 20);
  EXPECT_EQ(board->memory(1).size(), std::size_t{1} << 20);
  const auto example = SimulatedBoard::read(examples() + "/default.json", parts);
  ASSERT_TRUE(example.ok()) << example.failure().text;
  ASSERT_EQ((*example)->devices(), 3U);
  for (std::size_t i = 0; i < 3; ++i) {
    EXPECT_EQ((*example)->memory(i), board->memory(i)) << i;
    EXPECT_EQ((*example)->spiMemory(i), board->spiMemory(i)) << i;
  }
}

TEST(BoardFile, EveryExampleLoads) {
  std::size_t count = 0;
  for (const auto& entry : std::filesystem::directory_iterator(examples())) {
    if (entry.path().extension() != ".json") continue;
    PartLibrary parts;
    const auto board = SimulatedBoard::read(entry.path().string(), parts);
    EXPECT_TRUE(board.ok()) << board.failure().text;
    ++count;
  }
  EXPECT_GE(count, 8U);
}

TEST(BoardFile, ThePartOfAUsersOwnIsSimulatedFromItsDescription) {
  const std::string directory = examples();
  PartLibrary parts;
  auto board = SimulatedBoard::read(directory + "/minnow8.json", parts);
  ASSERT_TRUE(board.ok()) << board.failure().text;
  Jtag jtag(**board, {*parts.read(directory + "/parts/minnow8.bsd")});
  EXPECT_EQ(jtag.access(0, "ISC_ENABLE", 0xD0, 8), 0U);
  for (std::uint64_t page = 0; page < 8; ++page) {
    jtag.access(0, "ISC_ADDRESS_SHIFT", page, 8);
    jtag.access(0, "ISC_DATA_SHIFT", 0x1111111111111111U * page, 64);
    jtag.load(0, "ISC_PROGRAM");
    EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8) & 1, 1U);
    jtag.wait(0.002);
  }
  for (std::uint64_t page = 0; page < 8; ++page) {
    jtag.access(0, "ISC_ADDRESS_SHIFT", page, 8);
    EXPECT_EQ(jtag.access(0, "ISC_READ", 0, 64), 0x1111111111111111U * page);
  }
  EXPECT_EQ((*board)->memory(0).size(), 64U);
  jtag.access(0, "ISC_ERASE", 0xA5, 8);
  EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8) & 1, 1U);
  jtag.wait(0.07);
  EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8) & 1, 0U);
  EXPECT_EQ((*board)->memory(0), std::vector<std::uint8_t>(64, 0xFF));
}

TEST(BoardFile, AStatusOfAnotherFormat) {
  const std::string directory = examples();
  TestBoard test(R"({"chain": [{"bsdl": "parts/minnow8.bsd", "model": {"pages": 8, "bits": 64,
                     "status": {"mask": "C0", "busy": "40"}, "times": {"erase": 0.5}}}]})",
                 directory);
  ASSERT_NE(test.board, nullptr) << test.failure;
  Jtag jtag(*test.board, {*test.parts.read(directory + "/parts/minnow8.bsd")});
  EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8) & 0xC0, 0x80U);
  jtag.access(0, "ISC_ENABLE", 0xD0, 8);
  jtag.access(0, "ISC_ERASE", 0xA5, 8);
  EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8) & 0xC0, 0x40U);
  jtag.wait(0.6);
  EXPECT_EQ(jtag.access(0, "ISC_STATUS", 0, 8) & 0xC0, 0x80U);
}

TEST(BoardFile, ContentStandsInTheMemories) {
  const testsupport::TemporaryDirectory directory;
  testsupport::writeFile(directory.file("content.bin"), "abc");
  TestBoard test(R"({"chain": [{"part": "zp18v01", "memory": "content.bin"},
                     {"part": "marlin3-1", "spi": {"part": "w25q80", "file": "content.bin"}}]})",
                 directory.path());
  ASSERT_NE(test.board, nullptr) << test.failure;
  const std::vector<std::uint8_t> memory = test.board->memory(0);
  EXPECT_EQ(std::string(memory.begin(), memory.begin() + 4), "abc\xFF");
  const std::vector<std::uint8_t> flash = test.board->spiMemory(1);
  EXPECT_EQ(std::string(flash.begin(), flash.begin() + 4), "abc\xFF");
}
