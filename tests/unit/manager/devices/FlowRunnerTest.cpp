#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "manager/devices/FlowRunner.h"
#include "tests/unit/manager/devices/PartText.h"
#include "tests/unit/manager/devices/ScriptedCable.h"

namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

/// Runs the action "act" of a part that has one flow "work", with arrays or without, before a procedure "disable".
class Bench {
 public:
  explicit Bench(const std::string& flow, const std::string& array = "")
      : Bench("flow_work" + brackets(array) + " " + flow + ", flow_disable initialize (ISC_DISABLE wait TCK 3)",
              "proc_work" + brackets(array) + " = (flow_work" + brackets(array) + "), proc_disable = (flow_disable)",
              "act = (proc_work" + brackets(array) + ", proc_disable)") {}

  Bench(const std::string& flows, const std::string& procedures, const std::string& actions)
      : part(parttext::part(parttext::bsdl("minnow", parttext::idcode, flows, procedures, actions))),
        cable(part),
        chain(cable, {8}),
        loader(chain, 0, part) {}

  Status run(const BitVector& data = {}, const BitVector* covered = nullptr) {
    layout = std::make_unique<IscLayout>(*IscLayout::make(part->isc, {"act"}));
    FlowRunner runner(loader, *layout);
    const FlowRunner::Input input{.data = data.empty() ? nullptr : &data, .covered = covered};
    auto result = runner.run(
        *part->isc.findAction("act"), [](const Isc::Use&) { return true; }, input,
        [this](std::uint64_t done, std::uint64_t total) {
          progress.push_back(std::to_string(done) + "/" + std::to_string(total));
        });
    if (!result) return result.failure();
    outcome = *result;
    return {};
  }

  std::shared_ptr<Part> part;
  ScriptedCable cable;
  ScanChain chain;
  InstructionLoader loader;
  std::unique_ptr<IscLayout> layout;
  FlowRunner::Outcome outcome;
  std::vector<std::string> progress;

 private:
  static std::string brackets(const std::string& array) { return array.empty() ? "" : "(" + array + ")"; }
};

BitVector bits(std::uint64_t number, std::size_t size) { return BitVector::fromNumber(number, size); }

TEST(FlowRunner, CarriesOutAStepInItsOrder) {
  Bench bench("initialize (ISC_ENABLE 8:D0 wait TCK 16, 1.0e-3 8:3C)");
  bench.cable.answers["ISC_ENABLE"] = {bits(0x3C, 8)};
  ASSERT_TRUE(bench.run());
  EXPECT_THAT(bench.cable.log, ElementsAre("ISC_ENABLE", "> 8:D0", "wait 16 0.001", "< 8", "ISC_DISABLE", "wait 3 0"));
}

TEST(FlowRunner, ShiftsFieldsInTheOrderWritten) {
  Bench bench("initialize (ISC_DATA_SHIFT 4:1, 8:A5, 4:F wait TCK 1)");
  ASSERT_TRUE(bench.run());
  EXPECT_EQ(bench.cable.log[1], "> 16:FA51");
}

TEST(FlowRunner, VariablesCountAndWrapAtTheWidthOfTheirField) {
  Bench bench(
      "initialize (ISC_ADDRESS_SHIFT 8:$a wait TCK 1) (ISC_ADDRESS_SHIFT 8:$a=FE wait TCK 1) "
      "repeat 3 (ISC_ADDRESS_SHIFT 8:$a+01 wait TCK 1) "
      "terminate (ISC_ADDRESS_SHIFT 8:$a-02 wait TCK 1) (ISC_ADDRESS_SHIFT 8:$a<<2 wait TCK 1) "
      "(ISC_ADDRESS_SHIFT 8:$a>>4 wait TCK 1) (ISC_ADDRESS_SHIFT 8:~$a wait TCK 1) (ISC_ADDRESS_SHIFT 8:$a wait TCK "
      "1)");
  ASSERT_TRUE(bench.run());
  std::vector<std::string> scans;
  for (const std::string& line : bench.cable.log)
    if (line.starts_with("> ")) scans.push_back(line.substr(4));
  EXPECT_THAT(scans, ElementsAre("00", "FE", "FF", "00", "01", "FF", "FC", "0F", "F0", "0F"));
}

TEST(FlowRunner, LongVariablesCarryOverTheirWholeWidth) {
  Bench bench(
      "initialize (ISC_DATA_SHIFT 100:$a=0FFFFFFFFFFFFFFFFFFFFFFFF wait TCK 1) (ISC_DATA_SHIFT 100:$a+1 wait TCK 1) "
      "(ISC_DATA_SHIFT 100:$a-1 wait TCK 1)");
  ASSERT_TRUE(bench.run());
  EXPECT_EQ(bench.cable.log[4], "> 100:1000000000000000000000000");
  EXPECT_EQ(bench.cable.log[7], "> 100:0FFFFFFFFFFFFFFFFFFFFFFFF");
}

TEST(FlowRunner, VariablesBeginAnewInEachFlow) {
  Bench bench("flow_one initialize (ISC_ADDRESS_SHIFT 8:$a+01 wait TCK 1)", "proc_work = (flow_one, flow_one)",
              "act = (proc_work)");
  ASSERT_TRUE(bench.run());
  EXPECT_EQ(bench.cable.log[1], "> 8:01");
  EXPECT_EQ(bench.cable.log[4], "> 8:01");
}

TEST(FlowRunner, TakesDataBitByBitAndTellsHowFarItIs) {
  Bench bench("initialize (ISC_DATA_SHIFT 12:? wait TCK 1) repeat 1 (ISC_DATA_SHIFT 12:~? wait TCK 1)", "array");
  ASSERT_TRUE(bench.run(bits(0xABCDEF, 24)));
  EXPECT_EQ(bench.cable.log[1], "> 12:DEF");
  EXPECT_EQ(bench.cable.log[4], "> 12:543");
  EXPECT_THAT(bench.progress, ElementsAre("0/3", "2/3", "3/3"));
  EXPECT_EQ(bench.outcome.written.count(), 24U);
}

TEST(FlowRunner, ArraysTakeConsecutivePartsAndProceduresBeginAnew) {
  Bench bench(
      "flow_p(one) initialize (ISC_DATA_SHIFT 8:? wait TCK 1), flow_p(two) initialize (ISC_DATA_SHIFT 8:? wait TCK 1), "
      "flow_v(two) initialize (ISC_READ wait TCK 1 8:?)",
      "proc_p(one) = (flow_p(one), flow_p(one)), proc_p(two) = (flow_p(two)), proc_v(two) = (flow_v(two))",
      "act = (proc_p(one), proc_p(two), proc_v(two))");
  bench.cable.answers["ISC_READ"] = {bits(0xCC, 8)};
  ASSERT_TRUE(bench.run(bits(0xCCBBAA, 24)));
  EXPECT_EQ(bench.layout->bits(), 24U) << "two flows of a procedure take consecutive bits";
  EXPECT_EQ(bench.cable.log[1], "> 8:AA");
  EXPECT_EQ(bench.cable.log[4], "> 8:BB");
  EXPECT_EQ(bench.cable.log[7], "> 8:CC");
  EXPECT_EQ(bench.outcome.differing.count(), 0U);
  EXPECT_EQ(bench.outcome.seen, bits(0xFF0000, 24));
}

TEST(FlowRunner, GoesOnAfterDataThatDiffer) {
  Bench bench("initialize (ISC_READ wait TCK 1 8:?) repeat 2 (ISC_READ wait TCK 1 8:?)", "array");
  bench.cable.answers["ISC_READ"] = {bits(0x11, 8), bits(0x32, 8), bits(0x31, 8)};
  const BitVector covered = bits(0x00FFFF, 24);
  ASSERT_TRUE(bench.run(bits(0x332211, 24), &covered));
  EXPECT_EQ(bench.outcome.found, bits(0x313211, 24));
  EXPECT_EQ(bench.outcome.differing, bits(0x001000, 24)) << "what is not covered is not compared";
  EXPECT_EQ(bench.outcome.seen.count(), 24U);
}

TEST(FlowRunner, StopsAtDataThatDifferWhenTheFlowSaysSo) {
  Bench bench("exit_on_error initialize (ISC_READ wait TCK 1 8:?) repeat 9 (ISC_READ wait TCK 1 8:?)", "array");
  bench.cable.answers["ISC_READ"] = {bits(0, 8), bits(1, 8)};
  ASSERT_TRUE(bench.run(BitVector(80)));
  EXPECT_EQ(bench.cable.drReads, 2);
  EXPECT_EQ(bench.outcome.differing.count(), 1U);
  EXPECT_EQ(bench.cable.log.back(), "wait 3 0") << "it is disabled all the same";
}

TEST(FlowRunner, KeepsWhatIsReadInOrder) {
  Bench bench("initialize (ISC_READ wait TCK 1 8:!) repeat 1 (ISC_READ wait TCK 1 8:!)", "array");
  bench.cable.answers["ISC_READ"] = {bits(0x5A, 8), bits(0xC3, 8)};
  ASSERT_TRUE(bench.run());
  EXPECT_EQ(bench.outcome.found, bits(0xC35A, 16));
  EXPECT_EQ(bench.outcome.seen.count(), 16U);
}

TEST(FlowRunner, ACaptureThatMustMatchAndDoesNotIsAFailure) {
  Bench bench("initialize (ISC_STATUS wait TCK 1 8:00*05)");
  bench.cable.answers["ISC_STATUS"] = {bits(0xFA, 8)};
  EXPECT_TRUE(bench.run());
  bench.cable.answers["ISC_STATUS"] = {bits(0xFE, 8)};
  const Status status = bench.run();
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "flow \"work\", instruction ISC_STATUS: expected 00 (mask 05), found FE");
  EXPECT_EQ(status.failure().kind, Failure::Kind::mismatch);
  EXPECT_EQ(bench.cable.log.back(), "wait 3 0") << "the device is disabled after a failure";
}

TEST(FlowRunner, ALoopRunsUntilEverythingMatches) {
  Bench bench("initialize loop max 5 (ISC_STATUS wait TCK 1 8:00*01) terminate (ISC_READ wait TCK 1)");
  bench.cable.answers["ISC_STATUS"] = {bits(1, 8), bits(1, 8), bits(2, 8)};
  ASSERT_TRUE(bench.run());
  EXPECT_EQ(bench.cable.drReads, 3);
}

TEST(FlowRunner, ALoopRunsAtLeastSoOften) {
  Bench bench("initialize loop min 4 max 5 (ISC_STATUS wait TCK 1 8:00*01)");
  ASSERT_TRUE(bench.run());
  EXPECT_EQ(bench.cable.drReads, 4);
}

TEST(FlowRunner, ALoopThatNeverMatchesIsAFailure) {
  Bench bench("initialize loop max 20 (ISC_STATUS wait TCK 1 8:00*01)");
  bench.cable.answers["ISC_STATUS"] = {bits(1, 8)};
  const Status status = bench.run();
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text,
            "flow \"work\", instruction ISC_STATUS: expected 00 (mask 01), found 01 after 20 tries");
  EXPECT_EQ(bench.cable.drReads, 20);
}

TEST(FlowRunner, ALoopTakesTheSameDataInEachTry) {
  Bench bench(
      "initialize loop max 3 (ISC_DATA_SHIFT 8:? wait TCK 1) (ISC_STATUS wait TCK 1 8:01) "
      "terminate (ISC_DATA_SHIFT 8:? wait TCK 1)",
      "array");
  bench.cable.answers["ISC_STATUS"] = {bits(0, 8), bits(0, 8), bits(1, 8)};
  ASSERT_TRUE(bench.run(bits(0x2211, 16)));
  std::vector<std::string> scans;
  for (const std::string& line : bench.cable.log)
    if (line.starts_with("> ")) scans.push_back(line);
  EXPECT_THAT(scans, ElementsAre("> 8:11", "> 8:11", "> 8:11", "> 8:22"));
  EXPECT_EQ(bench.progress.back(), "2/2");
}

TEST(FlowRunner, ABrokenChainIsSeenBeforeDataAreShifted) {
  Bench bench("initialize (ISC_ENABLE 8:D0 wait TCK 1)");
  bench.cable.irAnswers[0] = BitVector(8, true);
  const Status status = bench.run();
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text,
            "flow \"work\": the instruction register answered 11111111 to ISC_ENABLE, expected XXXXXX01: the chain is "
            "broken");
  EXPECT_THAT(bench.cable.log, Not(Contains(HasSubstr("D0"))));
}

TEST(FlowRunner, StepsThatOnlyWriteHardlyEverWaitForAnAnswer) {
  Bench bench("initialize (ISC_ADDRESS_SHIFT 8:$a=00 wait TCK 1) repeat 639 (ISC_ADDRESS_SHIFT 8:$a+01 wait TCK 1)");
  ASSERT_TRUE(bench.run());
  EXPECT_EQ(bench.cable.loads, 641);
  EXPECT_EQ(bench.cable.drReads, 0);
  EXPECT_EQ(bench.cable.irReads, 11) << "one in 64, and one for each flow";
}

TEST(FlowRunner, AChainThatBreaksHalfwayEndsTheAction) {
  Bench bench("initialize (ISC_ADDRESS_SHIFT 8:$a=00 wait TCK 1) repeat 639 (ISC_ADDRESS_SHIFT 8:$a+01 wait TCK 1)");
  bench.cable.irAnswers[100] = BitVector(8);
  ASSERT_FALSE(bench.run());
  EXPECT_LE(bench.cable.loads, 130);
}

TEST(FlowRunner, ALostLinkEndsEverything) {
  Bench bench("initialize (ISC_ADDRESS_SHIFT 8:00 wait TCK 1) (ISC_DATA_SHIFT 8:00 wait TCK 1)");
  bench.cable.linkDropsAt = 1;
  const Status status = bench.run();
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().kind, Failure::Kind::link);
  EXPECT_EQ(bench.cable.log.back(), "ISC_DATA_SHIFT");
}

TEST(FlowRunner, RecordsCapturesAsExpectations) {
  Bench bench(
      "initialize (ISC_ENABLE 8:D0 wait TCK 1) loop max 20 (ISC_STATUS wait TCK 8, 1.0e-3 8:00*01) "
      "terminate (ISC_READ wait TCK 1 8:?)",
      "array");
  bench.cable.records = true;
  const BitVector covered = bits(0x0F, 8);
  ASSERT_TRUE(bench.run(bits(0xA7, 8), &covered));
  EXPECT_THAT(bench.cable.log,
              ElementsAre("ISC_ENABLE", "> 8:D0", "wait 1 0", "ISC_STATUS", "wait 160 0.02", "< 8:00*01", "ISC_READ",
                          "wait 1 0", "< 8:A7*0F", "ISC_DISABLE", "wait 3 0"));
}

TEST(FlowRunner, RefusesWhatWouldNeverEnd) {
  Bench waits("initialize (ISC_ENABLE wait 4.0e3)");
  Status status = waits.run();
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text,
            "flow \"work\", instruction ISC_ENABLE: the wait is longer than an hour or 4294967296 cycles");
}

TEST(FlowRunner, AnInstructionThatThePartLacksIsNamed) {
  Bench bench("initialize (ISC_ENABLE wait TCK 1)");
  bench.part->isc.flows[0].blocks[0].items[0].steps[0].instruction = "ISC_NONE";
  const Status status = bench.run();
  ASSERT_FALSE(status);
  EXPECT_EQ(status.failure().text, "flow \"work\": minnow has no instruction ISC_NONE");
}

TEST(IscLayout, IsAsLongAsWhatIsWritten) {
  const auto part = parttext::part(parttext::bsdl("minnow8", parttext::idcode, parttext::flows()));
  const auto layout = IscLayout::make(part->isc, {"program", "verify", "read", "none"});
  ASSERT_TRUE(layout);
  EXPECT_EQ(layout->bits(), 512U);
  ASSERT_NE(layout->find("array"), nullptr);
  EXPECT_EQ(layout->find("array")->size, 512U);
  EXPECT_EQ(layout->find("other"), nullptr);
}

TEST(IscLayout, RefusesSizesOutOfAllProportion) {
  Isc::Program program;
  Isc::Field field;
  field.length = std::size_t{1} << 20;
  field.value.kind = Isc::Value::Kind::input;
  Isc::Step step;
  step.updates = {field};
  Isc::Item item;
  item.steps = {step};
  Isc::Block block;
  block.kind = Isc::Block::Kind::repeat;
  block.count = ~std::uint64_t{0};
  block.items = {item};
  Isc::Flow flow;
  flow.name = "big";
  flow.blocks = {block};
  program.flows = {flow};
  Isc::Procedure procedure;
  procedure.name = "p";
  procedure.flows.resize(1);
  procedure.flows[0].name = "big";
  program.procedures = {procedure};
  Isc::Action action;
  action.name = "program";
  action.procedures.resize(1);
  action.procedures[0].name = "p";
  program.actions = {action};
  auto layout = IscLayout::make(program, {"program"});
  ASSERT_FALSE(layout);
  EXPECT_EQ(layout.failure().text,
            "flow \"big\": a field or the data are too long, expected at most 8589934592 bits in all");
  program.procedures[0].flows[0].name = "small";
  layout = IscLayout::make(program, {"program"});
  ASSERT_FALSE(layout);
  EXPECT_EQ(layout.failure().text, "procedure \"p\" needs a flow \"small\", there is none");
}

}  // namespace
