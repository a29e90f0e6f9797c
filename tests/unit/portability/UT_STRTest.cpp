#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <limits>

#include "interfaces/portability/UT_STR.h"

namespace {

constexpr std::int32_t largest = std::numeric_limits<std::int32_t>::max();
constexpr std::int32_t smallest = std::numeric_limits<std::int32_t>::min();

int sign(int value) { return value < 0 ? -1 : value > 0 ? 1 : 0; }

TEST(UT_STR, LenCountsBytes) {
  EXPECT_EQ(UT_STR::Len("abc"), 3);
  EXPECT_EQ(UT_STR::Len("\xC3\xA9"), 2);
  EXPECT_EQ(UT_STR::Len(""), 0);
  EXPECT_EQ(UT_STR::Len(nullptr), 0);
}

struct CompareRow {
  const char* a;
  const char* b;
  int exact;
  int ignoringCase;
};
constexpr CompareRow compareRows[] = {{"", "", 0, 0},           {nullptr, "", 0, 0},    {nullptr, nullptr, 0, 0},
                                      {"", "a", -1, -1},        {"a", "", 1, 1},        {nullptr, "a", -1, -1},
                                      {"abc", "abc", 0, 0},     {"abc", "abd", -1, -1}, {"abc", "ab", 1, 1},
                                      {"ABC", "abc", -1, 0},    {"aBc", "AbC", 1, 0},   {"Z", "a", -1, 1},
                                      {"_", "A", 1, -1},        {"[", "a", -1, -1},     {"@", "`", -1, -1},
                                      {"\xC4", "\xE4", -1, -1}, {"z", "\x80", -1, -1}};

TEST(UT_STR, CompareAndICompare) {
  for (const CompareRow& row : compareRows) {
    SCOPED_TRACE(testing::Message() << '"' << UT_STR::Dup(row.a).c_str() << "\" and \"" << UT_STR::Dup(row.b).c_str()
                                    << '"');
    EXPECT_EQ(sign(UT_STR::Compare(row.a, row.b)), row.exact);
    EXPECT_EQ(sign(UT_STR::Compare(row.b, row.a)), -row.exact);
    EXPECT_EQ(sign(UT_STR::ICompare(row.a, row.b)), row.ignoringCase);
    EXPECT_EQ(sign(UT_STR::ICompare(row.b, row.a)), -row.ignoringCase);
  }
}

struct PrefixRow {
  const char* a;
  const char* b;
  int count;
  int expected;
};

TEST(UT_STR, INCompareLooksAtTheFirstCharactersOnly) {
  constexpr PrefixRow rows[] = {{"exit", "EXam", 2, 0},   {"exit", "EXam", 3, 1},    {"ex", "exit", 2, 0},
                                {"ex", "exit", 3, -1},    {"null", "NULL", 5, 0},    {"nullx", "null", 5, 1},
                                {"abc", "xyz", 0, 0},     {"abc", "xyz", -1, 0},     {nullptr, "a", 1, -1},
                                {nullptr, nullptr, 9, 0}, {"abc", "ABC", largest, 0}};
  for (const PrefixRow& row : rows)
    EXPECT_EQ(sign(UT_STR::INCompare(row.a, row.b, row.count)), row.expected) << row.b << ' ' << row.count;
}

struct MatchRow {
  const char* text;
  const char* pattern;
  bool expected;
};
constexpr MatchRow matchRows[] = {{"", "", true},
                                  {"a", "", false},
                                  {"", "a", false},
                                  {"", "*", true},
                                  {"", "***", true},
                                  {"abc", "*", true},
                                  {"abc", "ABC", true},
                                  {"ABC", "abc", true},
                                  {"abcd", "abc", false},
                                  {"abc", "abcd", false},
                                  {"abc", "a*", true},
                                  {"abc", "*c", true},
                                  {"abc", "*b*", true},
                                  {"abc", "a*c", true},
                                  {"ac", "a*c", true},
                                  {"abd", "a*c", false},
                                  {"abcabc", "*abc", true},
                                  {"abcabd", "*abc", false},
                                  {"aab", "*ab", true},
                                  {"abab", "a*ab", true},
                                  {"aba", "a*ab", false},
                                  {"abc", "**a**c**", true},
                                  {"abc", "*a*b*c*", true},
                                  {"abc", "*c*b*a*", false},
                                  {"a?c", "a?c", true},
                                  {"abc", "a?c", false},
                                  {"a*c", "a*c", true},
                                  {"*", "*", true},
                                  {"a", "*b*", false},
                                  {"DEFAULT", "default", true},
                                  {"default.log", "default", false}};

TEST(UT_STR, IMatchFitsTheWholeText) {
  for (const MatchRow& row : matchRows)
    EXPECT_EQ(UT_STR::IMatch(row.text, row.pattern), row.expected) << row.text << " to " << row.pattern;
}

TEST(UT_STR, IMatchOfNullFitsNothing) {
  EXPECT_FALSE(UT_STR::IMatch(nullptr, "*"));
  EXPECT_FALSE(UT_STR::IMatch("", nullptr));
  EXPECT_FALSE(UT_STR::IMatch(nullptr, nullptr));
}

TEST(UT_STR, IMatchOfManyStarsEndsSoon) {
  const std::string text(5000, 'a');
  std::string pattern;
  for (int i = 0; i < 500; ++i) pattern += "a*";
  EXPECT_TRUE(UT_STR::IMatch(text.c_str(), pattern.c_str()));
  EXPECT_FALSE(UT_STR::IMatch(text.c_str(), (pattern + "b").c_str()));
  EXPECT_TRUE(UT_STR::IMatch(text.c_str(), std::string(20000, '*').c_str()));
}

TEST(UT_STR, FindStringTellsLetterCaseApart) {
  const char* text = "one two one";
  EXPECT_EQ(UT_STR::FindString(text, "one"), text);
  EXPECT_EQ(UT_STR::FindString(text, "two"), text + 4);
  EXPECT_EQ(UT_STR::FindString(text, ""), text);
  EXPECT_EQ(UT_STR::FindString(text, nullptr), text);
  EXPECT_EQ(UT_STR::FindString(text, "ONE"), nullptr);
  EXPECT_EQ(UT_STR::FindString(text, "three"), nullptr);
  EXPECT_EQ(UT_STR::FindString("", "a"), nullptr);
  EXPECT_EQ(UT_STR::FindString(nullptr, "a"), nullptr);
}

TEST(UT_STR, DupIsACopy) {
  std::string text = "text";
  const StringBase copy = UT_STR::Dup(text.c_str());
  text[0] = 'n';
  EXPECT_EQ(copy, StringBase("text"));
  EXPECT_EQ(UT_STR::Dup(nullptr), StringBase());
}

struct CopyRow {
  int size;
  const char* text;
  bool fits;
  const char* expected;
};

TEST(UT_STR, CopyNeverLeavesTheBuffer) {
  constexpr CopyRow rows[] = {{4, "abc", true, "abc"},      {5, "abc", true, "abc"},   {3, "abc", false, ""},
                              {1, "abc", false, ""},        {1, "", true, ""},         {1, nullptr, true, ""},
                              {0, "abc", false, "xxxxxxx"}, {0, "", false, "xxxxxxx"}, {-1, "", false, "xxxxxxx"}};
  for (const CopyRow& row : rows) {
    std::array<char, 8> buffer{"xxxxxxx"};
    EXPECT_EQ(UT_STR::Copy(buffer.data(), row.size, row.text), row.fits) << row.size;
    EXPECT_STREQ(buffer.data(), row.expected) << row.size;
    for (std::size_t i = static_cast<std::size_t>(std::max(row.size, 0)); i + 1 < buffer.size(); ++i)
      EXPECT_EQ(buffer[i], 'x') << row.size << " at " << i;
  }
}

struct NumberRow {
  const char* text;
  std::int32_t expected;
};
constexpr NumberRow numberRows[] = {{nullptr, 0},
                                    {"", 0},
                                    {"x", 0},
                                    {"0", 0},
                                    {"7", 7},
                                    {"007", 7},
                                    {"+7", 7},
                                    {"-7", -7},
                                    {" \t\n\v\f\r7", 7},
                                    {"7x", 7},
                                    {"7.9", 7},
                                    {"7 8", 7},
                                    {"- 7", 0},
                                    {"--7", 0},
                                    {"+-7", 0},
                                    {"-", 0},
                                    {"+", 0},
                                    {"0x10", 0},
                                    {"2147483646", 2147483646},
                                    {"2147483647", largest},
                                    {"2147483648", largest},
                                    {"4294967295", largest},
                                    {"9223372036854775807", largest},
                                    {"99999999999999999999999999", largest},
                                    {"-2147483647", -2147483647},
                                    {"-2147483648", smallest},
                                    {"-2147483649", smallest},
                                    {"-9223372036854775808", smallest},
                                    {"-99999999999999999999999999", smallest}};

TEST(UT_STR, AToLClamps) {
  for (const NumberRow& row : numberRows) {
    const char* shown = row.text == nullptr ? "null" : row.text;
    EXPECT_EQ(UT_STR::AToL(row.text), row.expected) << shown;
    EXPECT_EQ(UT_STR::AToI(row.text), row.expected) << shown;
  }
}

TEST(UT_STR, WideTextHoldsCodePoints) {
  EXPECT_EQ(UT_STR::MbstrToWstr("a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80"), L"a\u00E9\u20AC\U0001F600");
  EXPECT_EQ(UT_STR::WstrToMbstr(L"a\u00E9\u20AC\U0001F600"), "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
  EXPECT_EQ(UT_STR::MbstrToWstr("\x7F\xC2\x80\xDF\xBF\xE0\xA0\x80\xEF\xBF\xBF\xF0\x90\x80\x80\xF4\x8F\xBF\xBF"),
            L"\x7F\x80\x7FF\x800\xFFFF\U00010000\U0010FFFF");
  EXPECT_EQ(UT_STR::MbstrToWstr(""), L"");
  EXPECT_EQ(UT_STR::MbstrToWstr(nullptr), L"");
  EXPECT_EQ(UT_STR::WstrToMbstr(L""), "");
  EXPECT_EQ(UT_STR::WstrToMbstr(nullptr), "");
}

TEST(UT_STR, EveryCodePointSurvives) {
  for (std::uint32_t code = 1; code <= 0x10FFFF; code += code < 0x3000 ? 1 : 97) {
    if (code >= 0xD800 && code <= 0xDFFF) continue;
    const std::wstring wide(1, static_cast<wchar_t>(code));
    ASSERT_EQ(UT_STR::MbstrToWstr(UT_STR::WstrToMbstr(wide.c_str()).c_str()), wide) << code;
  }
}

TEST(UT_STR, EveryStrayByteIsACharacterOfItsOwn) {
  for (const char* text :
       {"\x80", "\xBF", "\xC3", "\xE2\x82", "\xF0\x9F\x98", "\xFF", "\xC0\xAF", "\xC1\xBF", "\xE0\x80\xAF",
        "\xED\xA0\x80", "\xED\xB2\x80", "\xF0\x80\x80\xAF", "\xF4\x90\x80\x80", "\xF8\x88\x80\x80\x80"}) {
    EXPECT_EQ(UT_STR::MbstrToWstr(text).size(), std::string(text).size());
    EXPECT_EQ(UT_STR::WstrToMbstr(UT_STR::MbstrToWstr(text).c_str()), text);
  }
  EXPECT_EQ(UT_STR::WstrToMbstr(UT_STR::MbstrToWstr("\xE2\x82z\xC3").c_str()), "\xE2\x82z\xC3");
}

TEST(UT_STR, EveryPairOfBytesSurvives) {
  for (int first = 1; first < 256; ++first)
    for (int second = 1; second < 256; ++second)
      for (const char* tail : {"", "\x80", "\xBF\xBF"}) {
        const std::string text = std::string{static_cast<char>(first), static_cast<char>(second)} + tail;
        ASSERT_EQ(UT_STR::WstrToMbstr(UT_STR::MbstrToWstr(text.c_str()).c_str()), text) << first << ' ' << second;
      }
}

TEST(UT_STR, WDelStringsTakesTheLinesAway) {
  std::vector<std::wstring> lines = {L"a", L"b", L"c"};
  UT_STR::WDelStrings(lines, 0);
  EXPECT_EQ(lines.size(), 3U);
  UT_STR::WDelStrings(lines, 2);
  EXPECT_EQ(lines, std::vector<std::wstring>{L"c"});
  UT_STR::WDelStrings(lines, 9);
  EXPECT_TRUE(lines.empty());
  UT_STR::WDelStrings(lines, 1);
  EXPECT_TRUE(lines.empty());
}

}  // namespace
