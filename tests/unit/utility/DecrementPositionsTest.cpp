#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "interfaces/utility/CommandSet.h"
#include "tests/unit/support/RecordedMessages.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::RecordedMessages;

std::string joined(const CommandSet& set) {
  std::string line;
  for (int i = 0; i < set.getNumberCommands(); ++i) line += (i == 0 ? "" : " ") + std::string(set.getCommand(i));
  return line;
}

struct Row {
  const char* line;
  const char* expected;
};
constexpr Row rows[] = {
    // which switches
    {"program -p 1", "program -p 0"},
    {"program -position 1", "program -position 0"},
    {"program -P 1 -POSITION 2 -pOsItIoN 3", "program -P 0 -POSITION 1 -pOsItIoN 2"},
    {"program -port 1 -part 2 -pos 3 -positions 4", "program -port 1 -part 2 -pos 3 -positions 4"},
    {"program 1 2", "program 1 2"},
    {"program", "program"},
    {"-p 1", "-p 1"},  // the command word is no switch
    // several numbers, up to the next switch
    {"erase -p 1 2 3", "erase -p 0 1 2"},
    {"erase -p 1 2 -size 3 4", "erase -p 0 1 -size 3 4"},
    {"erase -p 1 -e -p 2", "erase -p 0 -e -p 1"},
    {"erase -p -e 1", "erase -p -e 1"},
    {"erase -p", "erase -p"},
    {"erase -size 3 -p 3", "erase -size 3 -p 2"},
    // what a number is
    {"erase -p +1 -1 -0 +0 0", "erase -p 0 -2 -1 -1 -1"},
    {"erase -p 007 00", "erase -p 6 -1"},
    {"erase -p 1x x1 1.0 0x1 1e3 1,2", "erase -p 1x x1 1.0 0x1 1e3 1,2"},
    {"erase -p + - ++1 +-1 +-", "erase -p + - ++1 +-1 +-"},
    {"erase -p 1 -+1 1", "erase -p 0 -+1 1"},  // a switch
    {"erase -p - 4", "erase -p - 3"},
    {"erase -p \"\" \" 1\" \"1 \" \"4\"", "erase -p   1 1  3"},
    {"erase -p x 5", "erase -p x 4"},
    {"erase -p 99999999999999999999x", "erase -p 99999999999999999999x"},
    // the limits
    {"erase -p 2147483647", "erase -p 2147483646"},
    {"erase -p -2147483647", "erase -p -2147483648"},
    {"erase -p +00000000000000000000000000000000000000001", "erase -p 0"},
};

TEST(DecrementPositions, LowersTheNumbersOfPositionSwitches) {
  for (const Row& row : rows) {
    const RecordedMessages messages;
    const auto set = CommandSet::string2CommandSet(row.line);
    EXPECT_TRUE(set->decrementPositions()) << row.line;
    EXPECT_EQ(joined(*set), row.expected);
    EXPECT_THAT(messages.all(), IsEmpty());
  }
}

TEST(DecrementPositions, OnlyTheFirstCallChangesTheSet) {
  const auto set = CommandSet::string2CommandSet("erase -p 5");
  EXPECT_TRUE(set->decrementPositions());
  EXPECT_TRUE(set->decrementPositions());
  EXPECT_EQ(joined(*set), "erase -p 4");
  set->addCommand("-p");
  set->addCommand(4);
  EXPECT_TRUE(set->decrementPositions());
  EXPECT_EQ(joined(*set), "erase -p 4 -p 4");
}

TEST(DecrementPositions, ACopyOfAConvertedSetIsConverted) {
  const auto set = CommandSet::string2CommandSet("erase -p 5");
  CommandSet before(*set);
  EXPECT_TRUE(set->decrementPositions());
  CommandSet after(*set);
  EXPECT_TRUE(after.decrementPositions());
  EXPECT_EQ(joined(after), "erase -p 4");
  EXPECT_TRUE(before.decrementPositions());
  EXPECT_EQ(joined(before), "erase -p 4");
  CommandSet assigned(0);
  assigned = *set;
  EXPECT_TRUE(assigned.decrementPositions());
  EXPECT_EQ(joined(assigned), "erase -p 4");
}

TEST(DecrementPositions, ANumberThatGetsLongerFindsRoom) {
  for (int count = 1; count <= 40; ++count) {
    CommandSet set(0);
    set.addCommand("erase");
    set.addCommand("-p");
    std::string expected = "erase -p";
    for (int i = 0; i < count; ++i) {
      set.addCommand(i % 2 == 0 ? "0" : "-9");
      expected += i % 2 == 0 ? " -1" : " -10";
    }
    EXPECT_TRUE(set.decrementPositions());
    EXPECT_EQ(joined(set), expected);
    const CommandSet copy(set);
    EXPECT_EQ(joined(copy), expected);
  }
}

TEST(DecrementPositions, ASetThatIsFilledAgainIsConvertedAgain) {
  CommandSet set(0);
  for (const char* line : {"erase -p 5", "verify -p 12 3", "erase -p 5"}) {
    EXPECT_TRUE(CommandSet::string2CommandSet(line, set));
    EXPECT_TRUE(set.decrementPositions());
  }
  EXPECT_EQ(joined(set), "erase -p 4");
}

TEST(DecrementPositions, GivesTheArrayOfTheNewWords) {
  const auto set = CommandSet::string2CommandSet("erase -p 10");
  EXPECT_STREQ(set->getCommands()[2], "10");
  EXPECT_TRUE(set->decrementPositions());
  EXPECT_STREQ(set->getCommands()[2], "9");
}

TEST(DecrementPositions, ANumberThatDoesNotFitIsAnError) {
  for (const char* number :
       {"2147483648", "4294967296", "-2147483648", "-2147483649", "+2147483648", "9223372036854775807",
        "9223372036854775808", "-9223372036854775809", "99999999999999999999999999"}) {
    const std::string line = std::string("erase -p 1 ") + number + " 3";
    const auto set = CommandSet::string2CommandSet(line.c_str());
    RecordedMessages messages;
    EXPECT_FALSE(set->decrementPositions()) << number;
    EXPECT_THAT(messages.take(), ElementsAre(testsupport::error(std::string("Position ") + number +
                                                                " is out of range, positions start at 1.\n")));
  }
}

TEST(DecrementPositions, ANumberOfAnotherSwitchMayBeAsLargeAsItLikes) {
  const RecordedMessages messages;
  const auto set = CommandSet::string2CommandSet("readbacktofile -size 99999999999999999999 -p 1");
  EXPECT_TRUE(set->decrementPositions());
  EXPECT_EQ(joined(*set), "readbacktofile -size 99999999999999999999 -p 0");
  EXPECT_THAT(messages.all(), IsEmpty());
}

}  // namespace
