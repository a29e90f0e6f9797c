#include <gtest/gtest.h>

#include "manager/parts/BsdlFile.h"
#include "manager/parts/IscProgram.h"
#include "tests/unit/manager/parts/IscText.h"
#include "tests/unit/manager/parts/TestFiles.h"

namespace {

Part readPart(const std::string& file) {
  Result<Part> part = BsdlFile::read(TestFiles::path(file));
  if (part) return *part;
  ADD_FAILURE() << part.failure().text;
  return {};
}

std::string flow(const Part& part, const std::string& name, const std::string& array = "") {
  const Isc::Flow* flow = part.isc.findFlow(name, array);
  return flow == nullptr ? "none" : IscText::of(*flow);
}

TEST(IscProgramTest, readsTheFlowsOfAPartOfEightPages) {
  const Part part = readPart("minnow8.bsd");
  EXPECT_EQ(part.isc.flows.size(), 6U);
  EXPECT_EQ(flow(part, "enable"), "initialize (ISC_ENABLE 8:D0 wait 16,0)");
  EXPECT_EQ(flow(part, "disable"), "initialize (ISC_DISABLE wait 0,0.001)");
  EXPECT_EQ(flow(part, "erase"),
            "initialize (ISC_ERASE 8:A5 wait 0,0.05) loop 0..20 [(ISC_STATUS wait 8,0.001 / 8:00*01)]");
  EXPECT_EQ(
      flow(part, "program", "array"),
      "initialize (ISC_ADDRESS_SHIFT 8:$adr=00 wait 1,0) (ISC_DATA_SHIFT 64:? wait 1,0) (ISC_PROGRAM wait 0,0.002)"
      " repeat 7 (ISC_ADDRESS_SHIFT 8:$adr+01 wait 1,0) (ISC_DATA_SHIFT 64:? wait 1,0) (ISC_PROGRAM wait 0,0.002)");
  EXPECT_EQ(flow(part, "verify", "array"),
            "initialize (ISC_ADDRESS_SHIFT 8:$adr=00 wait 1,0) (ISC_READ wait 0,0.0001 / 64:?)"
            " repeat 7 (ISC_ADDRESS_SHIFT 8:$adr+01 wait 1,0) (ISC_READ wait 0,0.0001 / 64:?)");
  EXPECT_EQ(flow(part, "read", "array"),
            "initialize (ISC_ADDRESS_SHIFT 8:$adr=00 wait 1,0) (ISC_READ wait 0,0.0001 / 64:!)"
            " repeat 7 (ISC_ADDRESS_SHIFT 8:$adr+01 wait 1,0) (ISC_READ wait 0,0.0001 / 64:!)");
}

TEST(IscProgramTest, readsTheActionsOfAPartOfEightPages) {
  const Part part = readPart("minnow8.bsd");
  EXPECT_EQ(part.isc.procedures.size(), 6U);
  const Isc::Procedure* procedure = part.isc.findProcedure("program", "array");
  ASSERT_NE(procedure, nullptr);
  EXPECT_EQ(IscText::of(procedure->flows), "program(array)");
  EXPECT_EQ(part.isc.findProcedure("program", ""), nullptr);
  EXPECT_EQ(part.isc.actions.size(), 4U);
  const Isc::Action* action = part.isc.findAction("program");
  ASSERT_NE(action, nullptr);
  EXPECT_EQ(action->array, "");
  EXPECT_EQ(IscText::of(action->procedures),
            "enable, erase recommended, program(array), verify(array) optional, disable");
  EXPECT_EQ(part.isc.findAction("blank_check"), nullptr);
}

TEST(IscProgramTest, readsWhatMakersWrite) {
  const Part part = readPart("tench.bsd");
  EXPECT_EQ(flow(part, "enable"),
            "unprocessed exit_on_error initialize (ISC_ENABLE 6:3F wait 1,0:100,0)"
            " (IDCODE wait 1,0 / 32:0CCCCCCD*0FFFFFFF)");
  EXPECT_EQ(
      flow(part, "disable"),
      "initialize (ISC_DISABLE wait 0,0.00011:0,0.002) (BYPASS wait 16,0.001 / 1:0) terminate (ISC_NOOP wait 0,0)");
  EXPECT_EQ(flow(part, "erase"),
            "exit_on_error initialize (ISC_ERASE 16:~A55A 8:$block=1F wait 0,1)"
            " loop 2..400 [(BUSY_TEST wait 3,0 / 1:1) (ISC_NOOP wait 1,0)]"
            " loop 0..3 [(BUSY_TEST wait 0,0:0,0.5 / 2:0*1)]");
  EXPECT_EQ(flow(part, "program", "array"),
            "initialize (ISC_PROGRAM 12:$addr=000 40:? wait 1,0)"
            " (ISC_INCREMENT 12:$addr-001 8:$block<<1 8:$block>>3 8:~$block 24:00FF00 wait 2,0)"
            " repeat 1023 (ISC_PROGRAM 12:$addr+001 40:? wait 1,0)");
  EXPECT_EQ(flow(part, "verify", "array"), "repeat 2 (ISC_READ wait 1,1e-05 / 40:? 16:0000*0000 32:00120000 8:$block)");
  EXPECT_EQ(flow(part, "program", "usercode"), "initialize (ISC_PROGRAM 32:? wait 1,0)");
  EXPECT_EQ(part.isc.flows.size(), 6U);
}

TEST(IscProgramTest, readsActionsOfMakers) {
  const Part part = readPart("tench.bsd");
  ASSERT_EQ(part.isc.procedures.size(), 5U);
  EXPECT_EQ(IscText::of(part.isc.findProcedure("program", "array")->flows), "program(array), verify(array)");
  ASSERT_EQ(part.isc.actions.size(), 3U);
  EXPECT_EQ(IscText::of(part.isc.findAction("program")->procedures),
            "enable, erase recommended, program(array), program(usercode) optional, disable");
  EXPECT_EQ(part.isc.actions[2].name, "program");
  EXPECT_EQ(part.isc.actions[2].array, "usercode");
}

TEST(IscProgramTest, readsSecurityAndTheBlankUsercode) {
  const Part part = readPart("tench.bsd");
  EXPECT_EQ(part.blankUsercode.value().hex(), "FFFFFFFE");
  ASSERT_EQ(part.isc.security.size(), 3U) << "the part has no bit against erasing";
  EXPECT_EQ(part.isc.security.at("isc_disable_read").first, 7U);
  EXPECT_EQ(part.isc.security.at("isc_disable_program").last, 6U);
  EXPECT_EQ(part.isc.security.at("isc_disable_key").first, 8U);
  EXPECT_EQ(part.isc.security.at("isc_disable_key").last, 23U);
}

struct Row {
  const char* about;
  const char* attribute;
  const char* text;
  const char* error;  ///< behind "e.bsd:"
};

std::string fileWith(const Row& row) {
  const std::string start =
      "entity e is\nattribute INSTRUCTION_LENGTH of e : entity is 4;\n"
      "attribute INSTRUCTION_OPCODE of e : entity is \"A (0001), B (0010)\";\n";
  const std::string flows = "attribute ISC_FLOW of e : entity is \"flow_a initialize (A wait TCK 1)\";\n";
  const std::string procedures = "attribute ISC_PROCEDURE of e : entity is \"proc_a = (flow_a)\";\n";
  const std::string name = row.attribute;
  return start + (name == "ISC_FLOW" ? "" : flows) + (name == "ISC_ACTION" ? procedures : "") + "attribute " + name +
         " of e : entity is\n" + row.text + ";\nend e;\n";
}

void PrintTo(const Row& row, std::ostream* stream) { *stream << row.about; }

class IscErrorsTest : public testing::TestWithParam<Row> {};

TEST_P(IscErrorsTest, namesThePlace) {
  const auto part = BsdlFile::parse("e.bsd", fileWith(GetParam()));
  ASSERT_FALSE(part) << GetParam().about;
  EXPECT_EQ(part.failure().text, std::string("e.bsd:") + GetParam().error) << GetParam().about;
}

const Row flowRows[] = {
    {"a name without its beginning", "ISC_FLOW", "\"erase initialize (A wait TCK 1)\"",
     "5:2: expected a name that begins with 'flow_', found 'erase'\n  \"erase initialize (A wait TCK 1)\";\n   ^"},
    {"a flow without blocks", "ISC_FLOW", "\"flow_a (A wait TCK 1)\"",
     "5:12: expected ')', found 'wait'\n  \"flow_a (A wait TCK 1)\";\n             ^"},
    {"a block without steps", "ISC_FLOW", "\"flow_a initialize\"",
     "5:19: expected '(' or 'loop', found the end of the text\n  \"flow_a initialize\";\n                    ^"},
    {"an instruction without an opcode", "ISC_FLOW", "\"flow_a initialize (A wait TCK 1)\" &\n\"(C wait TCK 1)\"",
     "6:3: instruction C has no opcode\n  \"(C wait TCK 1)\";\n    ^"},
    {"an update that is too wide", "ISC_FLOW", "\"flow_a initialize (A 8:1FF wait TCK 1)\"",
     "5:25: the value does not fit into 8 bits\n  \"flow_a initialize (A 8:1FF wait TCK 1)\";\n"
     "                          ^"},
    {"a capture that is too wide", "ISC_FLOW", "\"flow_a initialize (A wait TCK 1 3:8)\"",
     "5:36: the value does not fit into 3 bits\n  \"flow_a initialize (A wait TCK 1 3:8)\";\n"
     "                                     ^"},
    {"a mask that is too wide", "ISC_FLOW", "\"flow_a initialize (A wait TCK 1 3:0*F)\"",
     "5:38: the value does not fit into 3 bits\n  \"flow_a initialize (A wait TCK 1 3:0*F)\";\n"
     "                                       ^"},
    {"digits that are not hex", "ISC_FLOW", "\"flow_a initialize (A 8:G0 wait TCK 1)\"",
     "5:25: expected hex digits, found 'G0'\n  \"flow_a initialize (A 8:G0 wait TCK 1)\";\n"
     "                          ^"},
    {"an update that is read", "ISC_FLOW", "\"flow_a initialize (A 8:! wait TCK 1)\"",
     "5:25: expected hex digits, found '!'\n  \"flow_a initialize (A 8:! wait TCK 1)\";\n"
     "                          ^"},
    {"a field of no bits", "ISC_FLOW", "\"flow_a initialize (A 0:0 wait TCK 1)\"",
     "5:23: expected the length of a field (1 to 268435456), found '0'\n"
     "  \"flow_a initialize (A 0:0 wait TCK 1)\";\n                        ^"},
    {"a loop without a bound", "ISC_FLOW", "\"flow_a initialize loop (A wait TCK 1)\"",
     "5:25: expected 'max', found '('\n  \"flow_a initialize loop (A wait TCK 1)\";\n                          ^"},
    {"a loop with bounds the wrong way round", "ISC_FLOW", "\"flow_a initialize loop min 5 max 2 (A wait TCK 1)\"",
     "5:35: a loop's max is less than its min\n"
     "  \"flow_a initialize loop min 5 max 2 (A wait TCK 1)\";\n                                    ^"},
    {"waits the wrong way round", "ISC_FLOW", "\"flow_a initialize (A wait 2.0e-3:1.0e-3)\"",
     "5:35: the longest wait is shorter than the shortest\n"
     "  \"flow_a initialize (A wait 2.0e-3:1.0e-3)\";\n                                    ^"},
    {"an endless wait", "ISC_FLOW", "\"flow_a initialize (A wait 1.0e9)\"",
     "5:28: expected 'TCK' or a time in seconds, found '1.0e9'\n"
     "  \"flow_a initialize (A wait 1.0e9)\";\n                             ^"},
    {"a step without an end", "ISC_FLOW", "\"flow_a initialize (A wait TCK 1\"",
     "5:33: expected ')', found the end of the text\n"
     "  \"flow_a initialize (A wait TCK 1\";\n                                  ^"},
    {"a flow twice", "ISC_FLOW", "\"flow_a initialize (A wait TCK 1), flow_a initialize (A wait TCK 1)\"",
     "5:36: flow a is given twice\n"
     "  \"flow_a initialize (A wait TCK 1), flow_a initialize (A wait TCK 1)\";\n"
     "                                     ^"},
};
INSTANTIATE_TEST_SUITE_P(Flows, IscErrorsTest, testing::ValuesIn(flowRows));

const Row useRows[] = {
    {"a procedure with an unknown flow", "ISC_PROCEDURE", "\"proc_a = (flow_b)\"",
     "6:12: there is no flow b\n  \"proc_a = (flow_b)\";\n             ^"},
    {"a procedure with a flow of another array", "ISC_PROCEDURE", "\"proc_a = (flow_a(array))\"",
     "6:12: there is no flow a(array)\n  \"proc_a = (flow_a(array))\";\n             ^"},
    {"a procedure without its flows", "ISC_PROCEDURE", "\"proc_a, proc_b\"",
     "6:8: expected '=', found ','\n  \"proc_a, proc_b\";\n         ^"},
    {"a procedure twice", "ISC_PROCEDURE", "\"proc_a = (flow_a), proc_a = (flow_a)\"",
     "6:21: procedure a is given twice\n  \"proc_a = (flow_a), proc_a = (flow_a)\";\n                      ^"},
    {"an action with an unknown procedure", "ISC_ACTION", "\"erase = (proc_a,\" &\n\"proc_b)\"",
     "8:2: there is no procedure b\n  \"proc_b)\";\n   ^"},
    {"an action with a flow", "ISC_ACTION", "\"erase = (flow_a)\"",
     "7:11: expected a name that begins with 'proc_', found 'flow_a'\n  \"erase = (flow_a)\";\n            ^"},
    {"an action twice", "ISC_ACTION", "\"erase = (proc_a), ERASE = (proc_a)\"",
     "7:20: action erase is given twice\n  \"erase = (proc_a), ERASE = (proc_a)\";\n                     ^"},
    {"a security bit without a place", "ISC_SECURITY", "\"isc_disable_read\"",
     "6:18: expected the place of a security bit (0 to 65535), found the end of the text\n"
     "  \"isc_disable_read\";\n                   ^"},
};
INSTANTIATE_TEST_SUITE_P(Uses, IscErrorsTest, testing::ValuesIn(useRows));

TEST(IscErrorsTest, whatFlowsTakeIsBounded) {
  std::string text = "\"flow_a initialize\"";
  for (int i = 0; i < 3; ++i) text += " & \n\" (A 33000000:0 wait TCK 1)\"";
  const auto part = BsdlFile::parse("e.bsd", fileWith({"", "ISC_FLOW", text.c_str(), ""}));
  ASSERT_FALSE(part);
  EXPECT_EQ(part.failure().text,
            "e.bsd:8:15: the flows are too long\n  \" (A 33000000:0 wait TCK 1)\";\n                ^");
}

}  // namespace
