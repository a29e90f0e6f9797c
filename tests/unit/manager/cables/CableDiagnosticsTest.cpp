#include <gtest/gtest.h>

#include "manager/cables/CableDiagnostics.h"
#include "manager/cables/RemoteCable.h"
#include "tests/unit/manager/cables/TestServer.h"

namespace {

std::vector<FakeTap> threeTaps() { return {FakeTap(4, 0x10000001), FakeTap(6, std::nullopt), FakeTap(5, 0x20000003)}; }

std::string problem(FakeChain& chain, std::vector<std::string>* lines = nullptr) {
  FakeCable cable(chain);
  const Result<CableDiagnostics::Report> report = CableDiagnostics::run(cable, [&](const std::string& line) {
    if (lines != nullptr) lines->push_back(line);
  });
  return report ? "" : report.failure().text;
}

TEST(CableDiagnostics, ASoundChainIsDescribed) {
  FakeChain chain(threeTaps());
  FakeCable cable(chain);
  const Result<CableDiagnostics::Report> report = CableDiagnostics::run(cable);
  ASSERT_TRUE(report) << report.failure().text;
  EXPECT_EQ(report->idcodes.size(), 3U);
  EXPECT_EQ(report->totalIrLength, 15U);
  EXPECT_EQ(report->bypassLength, 3U);
  EXPECT_EQ(report->patternBits, 1048576U);
  EXPECT_EQ(report->patternErrors, 0U);
  EXPECT_EQ(report->lines,
            (std::vector<std::string>{
                "TDO works, 3 devices on the chain, the first behind TDI:", "  device 1: IDCODE 0x10000001",
                "  device 2: no IDCODE", "  device 3: IDCODE 0x20000003",
                "Instruction registers: 15 bits, captured 000100000100001", "Bypass registers: 3 bits",
                "Test pattern: 1048576 bits, no errors"}));
  EXPECT_EQ(chain.state, TapState::reset);
}

TEST(CableDiagnostics, WorksThroughTheNetwork) {
  FakeChain chain(threeTaps());
  TestServer server([&](int socket) { TestServer::serve(socket, chain); });
  Result<std::unique_ptr<RemoteCable>> cable = RemoteCable::connect(server.address());
  ASSERT_TRUE(cable) << cable.failure().text;
  const Result<CableDiagnostics::Report> report = CableDiagnostics::run(**cable);
  ASSERT_TRUE(report) << report.failure().text;
  EXPECT_EQ(report->idcodes.size(), 3U);
}

TEST(CableDiagnostics, AStuckTdoIsNamed) {
  FakeChain chain(threeTaps());
  chain.tdo = FakeChain::Tdo::low;
  EXPECT_TRUE(problem(chain).starts_with("TDO is stuck at 0: ")) << problem(chain);
  chain.tdo = FakeChain::Tdo::high;
  EXPECT_TRUE(problem(chain).starts_with("TDO is stuck at 1: ")) << problem(chain);
}

TEST(CableDiagnostics, ErrorsInThePatternAreCountedAndPlaced) {
  FakeChain chain(threeTaps());
  FakeCable plain(chain);
  ASSERT_TRUE(CableDiagnostics::run(plain));
  // The clocks before the pattern's first bit comes out, and those after.
  const std::uint64_t whole = chain.clocks;
  const std::uint64_t patternClock = 500000;
  FakeChain faulty(threeTaps());
  faulty.errorEvery = patternClock;
  std::vector<std::string> lines;
  const std::string text = problem(faulty, &lines);
  const std::uint64_t errors = whole / patternClock;
  EXPECT_TRUE(text.starts_with("the test pattern came out with " + std::to_string(errors) +
                               " errors in 1048576 bits, the first at bit "))
      << text;
  // The pattern starts after the scans before it, within the first few clocks of the 500000.
  const std::string place = text.substr(text.find("at bit ") + 7);
  const std::uint64_t before = whole - 1048576;
  EXPECT_NEAR(static_cast<double>(std::stoull(place)), static_cast<double>(patternClock - before), 20) << text;
  EXPECT_EQ(lines.back(), "Bypass registers: 3 bits");
}

/// A device whose bypass register has two bits.
TEST(CableDiagnostics, LengthsThatContradictEachOtherAreAFailure) {
  FakeTap stubborn(4, 0x10000001);
  stubborn.addRegister(0xF, 2);
  FakeChain chain({stubborn, FakeTap(6, std::nullopt)});
  EXPECT_EQ(problem(chain),
            "the chain contradicts itself: 2 devices answered after reset, but 3 bypass bits follow BYPASS");
}

}  // namespace
