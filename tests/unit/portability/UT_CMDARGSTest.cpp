#include <gtest/gtest.h>

#include <limits>
#include <string>

#include "interfaces/portability/UT_CMDARGS.h"

namespace {

/// The command `words` as `cmd own... | -switch argument... | -switch ...`.
std::string shown(const UT_CMDARGS& args) {
  std::string text = std::string(args.getcmd()) + "+" + std::to_string(args.getnumargs());
  for (int i = 0; i < args.getnumsw(); ++i) {
    text += std::string(" | ") + args.getsw(i)->getswname();
    for (int j = 0; j < args.getsw(i)->getnumargs(); ++j) text += std::string(" ") + args.getsw(i)->getargtxt(j);
  }
  return text;
}

template <std::size_t count>
std::string grouped(const char* const (&words)[count]) {
  return shown(UT_CMDARGS(static_cast<int>(count), words));
}

TEST(UT_CMDARGS, GroupsWordsBySwitch) {
  EXPECT_EQ(grouped({"program"}), "program+0");
  EXPECT_EQ(grouped({"program", "-p", "1", "2", "-e", "-v"}), "program+0 | -p 1 2 | -e | -v");
  EXPECT_EQ(grouped({"svf2Oba", "in", "out", "-x", "y"}), "svf2Oba+2 | -x y");
  EXPECT_EQ(grouped({"a", "-p", "-1", "-", "+3", ""}), "a+0 | -p -1 - +3 ");
  EXPECT_EQ(grouped({"-p", "-q"}), "-p+0 | -q");
  EXPECT_EQ(grouped({"", "-q"}), "+0 | -q");
}

TEST(UT_CMDARGS, NoWordsGiveNoCommand) {
  const UT_CMDARGS args(0, nullptr);
  EXPECT_STREQ(args.getcmd(), "");
  EXPECT_EQ(args.getnumargs(), 0);
  EXPECT_EQ(args.getnumsw(), 0);
  EXPECT_EQ(args.getsw(0), nullptr);
  EXPECT_EQ(args.getsw("-p", 0), nullptr);
}

TEST(UT_CMDARGS, HoldsCopiesOfItsWords) {
  std::string command = "program";
  std::string name = "-p";
  std::string argument = "12";
  const char* words[] = {command.c_str(), name.c_str(), argument.c_str()};
  const UT_CMDARGS args(3, words);
  command[0] = name[1] = argument[0] = 'x';
  EXPECT_EQ(shown(args), "program+0 | -p 12");
}

struct SwitchRow {
  const char* word;
  bool isSwitch;
};

TEST(UT_CMDARGS, ASwitchBeginsWithADashAndNoDigit) {
  constexpr SwitchRow rows[] = {{"-p", true},  {"-P1", true}, {"--", true},    {"-.5", true},  {"-_", true},
                                {"- ", true},  {"-", false},  {"-0", false},   {"-9x", false}, {"", false},
                                {"p-", false}, {"p", false},  {"\xC3-", false}};
  for (const SwitchRow& row : rows) EXPECT_EQ(UT_CMDARGS::isSwitch(row.word), row.isSwitch) << row.word;
}

TEST(UT_CMDARGS, FindsSwitchesByNameIgnoringLetterCase) {
  const char* words[] = {"cmd", "-File", "a", "-q", "-FILE", "b", "-file", "c"};
  const UT_CMDARGS args(8, words);
  EXPECT_STREQ(args.getsw("-file", 0)->getargtxt(0), "a");
  EXPECT_STREQ(args.getsw("-file", 1)->getargtxt(0), "b");
  EXPECT_STREQ(args.getsw("-FILE", 2)->getargtxt(0), "c");
  EXPECT_STREQ(args.getsw("-fIlE", 1)->getswname(), "-FILE");
  EXPECT_EQ(args.getsw("-file", 3), nullptr);
  EXPECT_EQ(args.getsw("-file", -1), nullptr);
  EXPECT_EQ(args.getsw("file", 0), nullptr);
  EXPECT_EQ(args.getsw("-fil", 0), nullptr);
  EXPECT_TRUE(args.findsw("-Q"));
  EXPECT_FALSE(args.findsw("-p"));
}

TEST(UT_CMDARGS, FindsSwitchesByPlace) {
  const char* words[] = {"cmd", "-a", "-b", "x"};
  const UT_CMDARGS args(4, words);
  EXPECT_EQ(args.getnumsw(), 2);
  EXPECT_STREQ(args.getsw(0)->getswname(), "-a");
  EXPECT_STREQ(args.getsw(1)->getswname(), "-b");
  EXPECT_EQ(args.getsw(2), nullptr);
  EXPECT_EQ(args.getsw(-1), nullptr);
}

TEST(UT_CMDARGS, AnArgumentPastTheLastIsNullOrMinusOne) {
  const char* words[] = {"cmd", "-a", "7"};
  const UT_CMDARGS args(3, words);
  const UT_CMDSWINFO& given = *args.getsw(0);
  EXPECT_EQ(given.getnumargs(), 1);
  EXPECT_STREQ(given.getarg(0)->getargtxt(), "7");
  EXPECT_EQ(given.getargnum(0), 7);
  EXPECT_EQ(given.getargnum32(0), 7);
  for (const int index : {1, 100, -1}) {
    EXPECT_EQ(given.getarg(index), nullptr) << index;
    EXPECT_EQ(given.getargtxt(index), nullptr) << index;
    EXPECT_EQ(given.getargnum(index), -1) << index;
    EXPECT_EQ(given.getargnum32(index), -1) << index;
  }
}

struct NumberRow {
  const char* text;
  std::int32_t wide;
  std::int16_t narrow;
};
constexpr std::int32_t largest = std::numeric_limits<std::int32_t>::max();
constexpr std::int32_t smallest = std::numeric_limits<std::int32_t>::min();
constexpr NumberRow numberRows[] = {
    {"0", 0, 0},
    {"12", 12, 12},
    {"-12", -12, -12},
    {"12a", 12, 12},
    {"a12", 0, 0},
    {"", 0, 0},
    {"32767", 32767, 32767},
    {"32768", 32768, -32768},
    {"65535", 65535, -1},
    {"65536", 65536, 0},
    {"70000", 70000, 4464},
    {"-32768", -32768, -32768},
    {"-32769", -32769, 32767},
    {"2147483647", largest, -1},
    {"99999999999", largest, -1},
    {"-99999999999", smallest, 0},
};

TEST(UT_CMDARGS, NumbersHave32BitsOrTheLow16OfThem) {
  for (const NumberRow& row : numberRows) {
    SCOPED_TRACE(row.text);
    const UT_CMDARGINFO argument(row.text);
    EXPECT_STREQ(argument.getargtxt(), row.text);
    EXPECT_EQ(argument.getargnum32(), row.wide);
    EXPECT_EQ(argument.getargnum(), row.narrow);
    const UT_CMDSWINFO given("-a", {&argument, 1});
    EXPECT_EQ(given.getargnum32(0), row.wide);
    EXPECT_EQ(given.getargnum(0), row.narrow);
  }
}

}  // namespace
