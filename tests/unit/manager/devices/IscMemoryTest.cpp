#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "manager/content/Bitstream.h"
#include "manager/devices/Memory.h"
#include "tests/unit/manager/devices/BoardBench.h"
#include "tests/unit/manager/devices/PartText.h"

namespace {

using testing::HasSubstr;
using Bytes = BoardBench::Bytes;

class IscMemories : public testing::Test {
 protected:
  std::unique_ptr<Memory> open(const std::string& partName, std::size_t device = 0) {
    auto memory = bench.memory(makeIscMemory(*bench.chain, device, bench.part(partName)));
    if (memory != nullptr) {
      EXPECT_EQ(failureText(memory->open()), "(no failure)");
    }
    return memory;
  }

  /// A part of eight pages of 64 bits from the user's file.
  void minnow(const std::string& more = "", const std::string& faults = "") {
    bench.file("minnow8.bsd", parttext::bsdl("minnow8", parttext::idcode, parttext::flows()));
    bench.make(R"({"bsdl": "minnow8.bsd", "model": {"pages": 8, "bits": 64})" + more + "}", faults);
  }

  /// Sets bits of the security register.
  void protect(const std::string& partName, unsigned bits) {
    const BitVector opcode = *bench.part(partName)->opcode("ISC_PROGRAM_SECURITY");
    ASSERT_TRUE(bench.chain->loadInstruction(0, opcode));
    ASSERT_TRUE(bench.chain->scanData(0, {.out = BitVector::fromNumber(bits, 8)}));
  }

  BoardBench bench;
};

const Memory::ProgramOptions everything{.erase = true, .verify = true, .onlyFpga = false, .key = ""};

class Proms : public IscMemories, public testing::WithParamInterface<const char*> {};

TEST_P(Proms, AreErasedProgrammedVerifiedAndRead) {
  const std::string name = GetParam();
  bench.make(R"({"part": "mullet-32"}, {"part": ")" + name + R"("}, {"part": "zp18v02"})");
  const auto memory = open(name, 1);
  ASSERT_NE(memory, nullptr);
  EXPECT_EQ(memory->name(), bench.part(name)->name);
  const auto blank = memory->blankCheck({});
  ASSERT_TRUE(blank) << blank.failure().text;
  EXPECT_TRUE(blank->equal());
  EXPECT_EQ(blank->compared, memory->size());

  const Bytes first = BoardBench::random(memory->size(), 1);
  ASSERT_EQ(failureText(memory->program(BoardBench::image(first), everything, {})), "(no failure)");
  EXPECT_EQ(bench.board->memory(1), first);
  const Bytes second = BoardBench::random(memory->size() / 2 + 3, 2);
  std::uint64_t done = 0;
  std::uint64_t total = 0;
  ASSERT_EQ(failureText(memory->program(BoardBench::image(second), everything,
                                        [&](std::uint64_t now, std::uint64_t all) {
                                          EXPECT_GE(now, done);
                                          EXPECT_LE(now, all);
                                          done = now;
                                          total = all;
                                        })),
            "(no failure)");
  EXPECT_EQ(done, total);
  EXPECT_EQ(total, 2 * memory->size());
  Bytes wanted = second;
  wanted.resize(memory->size(), 0xFF);
  EXPECT_EQ(bench.board->memory(1), wanted);

  const auto equal = memory->compare(BoardBench::image(second), {});
  ASSERT_TRUE(equal) << equal.failure().text;
  EXPECT_TRUE(equal->equal());
  EXPECT_EQ(equal->compared, second.size());
  const auto differing = memory->compare(BoardBench::image(first), {});
  ASSERT_TRUE(differing);
  EXPECT_FALSE(differing->equal());
  EXPECT_EQ(differing->firstAddress, 0U);
  EXPECT_EQ(differing->expected, first[0]);
  EXPECT_EQ(differing->found, second[0]);

  const auto read = memory->read(100, 5000, {});
  ASSERT_TRUE(read) << read.failure().text;
  EXPECT_EQ(*read, Bytes(wanted.begin() + 100, wanted.begin() + 5100));

  ASSERT_EQ(failureText(memory->erase(nullptr, {})), "(no failure)");
  EXPECT_EQ(bench.board->memory(1), Bytes(memory->size(), 0xFF));
}

INSTANTIATE_TEST_SUITE_P(BuiltIn, Proms, testing::Values("zp18v01", "zp20s08", "herring-1"));

class Rows : public IscMemories, public testing::WithParamInterface<const char*> {};

TEST_P(Rows, OfCpldsAreProgrammed) {
  const std::string name = GetParam();
  bench.make(R"({"part": ")" + name + R"("})");
  const auto memory = open(name);
  ASSERT_NE(memory, nullptr);
  const Bytes data = BoardBench::random(memory->size(), 4);
  ASSERT_EQ(failureText(memory->program(BoardBench::image(data), everything, {})), "(no failure)");
  EXPECT_EQ(bench.board->memory(0), data);
  const auto read = memory->read(0, memory->size(), {});
  ASSERT_TRUE(read);
  EXPECT_EQ(*read, data);
}

INSTANTIATE_TEST_SUITE_P(BuiltIn, Rows, testing::Values("mullet-32", "mullet-128"));

TEST_F(IscMemories, AnFpgaStartsUpOnItsBitstream) {
  bench.make(R"({"part": "zp18v01"}, {"part": "marlin3-1"})");
  const PartPointer part = bench.part("marlin3-1");
  const auto memory = open("marlin3-1", 1);
  ASSERT_NE(memory, nullptr);
  EXPECT_EQ(memory->size(), 1U << 17);
  const auto idcode = static_cast<std::uint32_t>(part->idcodes[0].value.number());
  const Bytes data = Bitstream::make(idcode, memory->size(), 0x12345678, BoardBench::random(1U << 17, 5));
  ASSERT_EQ(failureText(memory->program(BoardBench::image(data), everything, {})), "(no failure)");
  EXPECT_EQ(bench.board->memory(1), data);
  EXPECT_EQ(failureText(memory->compare(BoardBench::image(data), {})), "(no failure)");
  const auto read = memory->read(0, memory->size(), {});
  ASSERT_TRUE(read) << read.failure().text;
  EXPECT_EQ(*read, data);
}

TEST_F(IscMemories, AnFpgaTakesOnlyBitstreamsOfItsOwn) {
  bench.make(R"({"part": "marlin3-1"})");
  const PartPointer part = bench.part("marlin3-1");
  const auto memory = open("marlin3-1");
  ASSERT_NE(memory, nullptr);
  const auto idcode = static_cast<std::uint32_t>(part->idcodes[0].value.number());
  const Bytes good = Bitstream::make(idcode, memory->size(), 1, Bytes{1, 2, 3});
  ASSERT_EQ(failureText(memory->program(BoardBench::image(good), everything, {})), "(no failure)");

  const Bytes other = Bitstream::make(idcode ^ 0x1000, memory->size(), 1, Bytes{});
  EXPECT_THAT(failureText(memory->check(BoardBench::image(other))),
              HasSubstr("the bitstream is for a part with IDCODE"));
  const Bytes small = Bitstream::make(idcode, memory->size() / 2, 1, Bytes{});
  EXPECT_EQ(failureText(memory->check(BoardBench::image(small))),
            "the bitstream says it has 65536 bytes, expected 131072 for marlin3-1");
  EXPECT_EQ(failureText(memory->check(BoardBench::image(Bytes(100, 0)))),
            "the data are no bitstream for marlin3-1: they do not begin with a bitstream header (\"TSLB\")");
  Bytes damaged = good;
  damaged[5000] ^= 1U;
  EXPECT_EQ(failureText(memory->program(BoardBench::image(damaged), everything, {})),
            "the data are no bitstream for marlin3-1: its CRC is wrong");
  EXPECT_EQ(bench.board->memory(0), good) << "what was refused changed nothing";
}

TEST_F(IscMemories, AnFpgaWithFlashHasTwoMemories) {
  bench.make(R"({"part": "marlin3an-1"})");
  const PartPointer part = bench.part("marlin3an-1");
  const auto memory = open("marlin3an-1");
  ASSERT_NE(memory, nullptr);
  const auto idcode = static_cast<std::uint32_t>(part->idcodes[0].value.number());
  const Bytes flash = Bitstream::make(idcode, memory->size(), 1, BoardBench::random(1000, 6));
  ASSERT_EQ(failureText(memory->program(BoardBench::image(flash), everything, {})), "(no failure)");
  EXPECT_EQ(bench.board->memory(0), flash);
  const Bytes config = Bitstream::make(idcode, memory->size(), 2, BoardBench::random(1000, 7));
  Memory::ProgramOptions options = everything;
  options.onlyFpga = true;
  ASSERT_EQ(failureText(memory->program(BoardBench::image(config), options, {})), "(no failure)");
  EXPECT_EQ(bench.board->memory(0), flash) << "the flash stays as it is";
  const auto equal = memory->compare(BoardBench::image(flash), {});
  ASSERT_TRUE(equal);
  EXPECT_TRUE(equal->equal());
}

TEST_F(IscMemories, DataWithHolesAreComparedWhereTheyAre) {
  minnow();
  const auto memory = open("minnow8.bsd");
  ASSERT_NE(memory, nullptr);
  EXPECT_EQ(memory->size(), 64U);
  DataImage data;
  EXPECT_TRUE(data.add(3, Bytes{1, 2}));
  EXPECT_TRUE(data.add(40, Bytes{0}));
  ASSERT_EQ(failureText(memory->program(data, everything, {})), "(no failure)");
  Bytes wanted(64, 0xFF);
  wanted[3] = 1;
  wanted[4] = 2;
  wanted[40] = 0;
  EXPECT_EQ(bench.board->memory(0), wanted);
  const auto equal = memory->compare(data, {});
  ASSERT_TRUE(equal);
  EXPECT_TRUE(equal->equal());
  EXPECT_EQ(equal->compared, 3U);
  const auto blank = memory->blankCheck({});
  ASSERT_TRUE(blank);
  EXPECT_EQ(blank->differences, 3U);
  EXPECT_EQ(blank->firstAddress, 3U);
  EXPECT_EQ(blank->expected, 0xFF);
  EXPECT_EQ(blank->found, 1);
}

TEST_F(IscMemories, WithoutEraseBitsAreOnlyCleared) {
  minnow();
  const auto memory = open("minnow8.bsd");
  ASSERT_NE(memory, nullptr);
  const Memory::ProgramOptions plain;
  ASSERT_EQ(failureText(memory->program(BoardBench::image(Bytes(64, 0x0F)), plain, {})), "(no failure)");
  Memory::ProgramOptions verify;
  verify.verify = true;
  EXPECT_EQ(failureText(memory->program(BoardBench::image(Bytes(64, 0x3C)), verify, {})),
            "the verification failed: 64 of 64 bytes differ, the first at address 0x0: expected 0x3C, found 0x0C");
  EXPECT_EQ(bench.board->memory(0), Bytes(64, 0x0C));
}

TEST_F(IscMemories, DataThatDoNotFitAreRefusedBeforeAnythingHappens) {
  minnow();
  const auto memory = open("minnow8.bsd");
  ASSERT_NE(memory, nullptr);
  EXPECT_EQ(failureText(memory->check({})), "there are no data");
  EXPECT_EQ(failureText(memory->program(BoardBench::image(Bytes(65, 0)), everything, {})),
            "the data go up to address 0x40, the memory ends at 0x3F");
  EXPECT_EQ(bench.board->memory(0), Bytes(64, 0xFF));
  EXPECT_EQ(failureText(memory->read(60, 5, {})), "5 bytes from address 0x3C on are not inside the memory of 64 bytes");
  Memory::ProgramOptions key;
  key.key = "00";
  EXPECT_EQ(failureText(memory->program(BoardBench::image(Bytes(1, 0)), key, {})),
            "minnow8 takes no encryption key with its data");
}

TEST_F(IscMemories, SeparateActionsStandInForMissingProcedures) {
  const std::string actions =
      "erase = (proc_enable, proc_erase, proc_disable), program = (proc_enable, proc_program(array), proc_disable), "
      "read = (proc_enable, proc_read(array), proc_disable)";
  bench.file("minnow8.bsd",
             parttext::bsdl("minnow8", parttext::idcode, parttext::flows(), parttext::procedures, actions));
  bench.make(R"({"bsdl": "minnow8.bsd", "model": {"pages": 8, "bits": 64}})");
  const auto memory = open("minnow8.bsd");
  ASSERT_NE(memory, nullptr);
  ASSERT_EQ(failureText(memory->program(BoardBench::image(Bytes(64, 0)), everything, {})), "(no failure)");
  const Bytes data = BoardBench::random(64, 9);
  ASSERT_EQ(failureText(memory->program(BoardBench::image(data), everything, {})), "(no failure)");
  EXPECT_EQ(bench.board->memory(0), data);
}

TEST_F(IscMemories, AVerifyThatLeavesBytesOutIsNoSuccess) {
  std::string flows = parttext::flows();
  const std::size_t verify = flows.find("repeat 7", flows.find("flow_verify"));
  flows.replace(verify, 8, "repeat 6");
  bench.file("minnow8.bsd", parttext::bsdl("minnow8", parttext::idcode, flows));
  bench.make(R"({"bsdl": "minnow8.bsd", "model": {"pages": 8, "bits": 64}})");
  const auto memory = open("minnow8.bsd");
  ASSERT_NE(memory, nullptr);
  const Bytes data = BoardBench::random(64, 10);
  EXPECT_EQ(failureText(memory->program(BoardBench::image(data), everything, {})),
            "the ISC actions of minnow8 left 8 bytes of the data uncompared");
  EXPECT_EQ(failureText(memory->compare(BoardBench::image(data), {})),
            "the ISC actions of minnow8 left 8 bytes of the data uncompared");
  const auto some = memory->compare(BoardBench::image(Bytes(data.begin(), data.begin() + 56)), {});
  ASSERT_TRUE(some);
  EXPECT_TRUE(some->equal());
}

TEST_F(IscMemories, ADeviceThatIsBusyForeverIsAFailure) {
  minnow(R"(, "faults": {"busyForever": true})");
  const auto memory = open("minnow8.bsd");
  ASSERT_NE(memory, nullptr);
  EXPECT_THAT(failureText(memory->program(BoardBench::image(Bytes(64, 0)), everything, {})),
              HasSubstr("flow \"erase\", instruction ISC_STATUS: expected 00 (mask 01), found "));
  EXPECT_THAT(failureText(memory->erase(nullptr, {})), HasSubstr(" after 20 tries"));
}

TEST_F(IscMemories, AnotherIdcodeIsAFailure) {
  minnow(R"(, "faults": {"idcode": "12345679"})");
  const auto memory = bench.memory(makeIscMemory(*bench.chain, 0, bench.part("minnow8.bsd")));
  EXPECT_EQ(failureText(memory->open()),
            "the IDCODE is 12345679, expected that of minnow8, XXXX0001001000110100111111111101");
}

TEST_F(IscMemories, AStuckLineIsABrokenChain) {
  for (const char* level : {"0", "1"}) {
    minnow("", std::string(R"(, "faults": {"stuckTdo": )") + level + "}");
    const auto memory = bench.memory(makeIscMemory(*bench.chain, 0, bench.part("minnow8.bsd")));
    EXPECT_THAT(failureText(memory->open()), HasSubstr("the chain is broken"));
    EXPECT_THAT(failureText(memory->program(BoardBench::image(Bytes(64, 0)), everything, {})),
                HasSubstr("the chain is broken"));
    EXPECT_EQ(bench.board->memory(0), Bytes(64, 0xFF));
  }
}

TEST_F(IscMemories, AReadProtectedDeviceIsNotCompared) {
  bench.make(R"({"part": "zp18v01"})");
  protect("zp18v01", 1);
  const auto memory = open("zp18v01");
  ASSERT_NE(memory, nullptr);
  const DataImage zeros = BoardBench::image(Bytes(10, 0));
  const std::string refusal = "zp18v01 is read-protected: what it holds can't be read or verified";
  EXPECT_EQ(failureText(memory->compare(zeros, {})), refusal);
  EXPECT_EQ(failureText(memory->read(0, 1, {})), refusal);
  EXPECT_EQ(failureText(memory->blankCheck({})), refusal);
  Memory::ProgramOptions verify;
  verify.verify = true;
  EXPECT_EQ(failureText(memory->program(zeros, verify, {})), refusal);
  EXPECT_EQ(bench.board->memory(0)[0], 0xFF) << "refused before anything was programmed";
  EXPECT_EQ(failureText(memory->program(zeros, everything, {})), "(no failure)") << "an erase takes protection away";
}

TEST_F(IscMemories, AWriteProtectedDeviceIsNotProgrammed) {
  bench.make(R"({"part": "zp18v01"})");
  protect("zp18v01", 2);
  const auto memory = open("zp18v01");
  ASSERT_NE(memory, nullptr);
  const DataImage zeros = BoardBench::image(Bytes(10, 0));
  EXPECT_EQ(failureText(memory->program(zeros, {}, {})), "zp18v01 is write-protected: erase it first");
  EXPECT_EQ(failureText(memory->program(zeros, everything, {})), "(no failure)");
}

TEST_F(IscMemories, APartWithoutActionsIsNamed) {
  minnow();
  auto plain = std::make_shared<Part>();
  plain->name = "plain1";
  EXPECT_EQ(failureText(makeIscMemory(*bench.chain, 0, plain)), "plain1 has no ISC actions, so it can't be programmed");
}

}  // namespace
