#include <gtest/gtest.h>

#include <string>
#include <utility>

#include "interfaces/portability/StringBase.h"

namespace {

using WideString = Port::StringBase<wchar_t>;

TEST(StringBase, HoldsACopyOfItsText) {
  std::string source = "text";
  const StringBase text(source.c_str());
  source[0] = 'n';
  EXPECT_STREQ(text.c_str(), "text");
  EXPECT_EQ(text.view(), "text");
  EXPECT_EQ(text.size(), 4U);
  EXPECT_FALSE(text.empty());
}

TEST(StringBase, NullAndNothingAreTheEmptyText) {
  const char* null = nullptr;
  for (const StringBase& text : {StringBase(), StringBase(null), StringBase(""), StringBase("", 2048)}) {
    EXPECT_STREQ(text.c_str(), "");
    EXPECT_EQ(text.size(), 0U);
    EXPECT_TRUE(text.empty());
  }
}

TEST(StringBase, TakesViewsAndStandardTexts) {
  EXPECT_EQ(StringBase(std::string_view("text").substr(1, 2)), StringBase("ex"));
  EXPECT_EQ(StringBase(std::string("text")), StringBase("text"));
  EXPECT_EQ(StringBase("hinted", 100), StringBase("hinted"));
}

TEST(StringBase, Grows) {
  StringBase text("a");
  text += "bc";
  text += 'd';
  text += std::string_view("\0e", 2);
  EXPECT_EQ(text.view(), std::string_view("abcd\0e", 6));
  text += text.view();
  EXPECT_EQ(text.size(), 12U);
  text.clear();
  EXPECT_TRUE(text.empty());
}

TEST(StringBase, MayBeAddedToItself) {
  StringBase text("ab");
  text += text.view();
  text += text.c_str();
  text += text.view().substr(6, 1);
  EXPECT_EQ(text, StringBase("ababababa"));
  StringBase empty;
  empty += empty.view();
  EXPECT_STREQ(empty.c_str(), "");
}

TEST(StringBase, GrowsToAnySize) {
  StringBase text("", 4);
  std::string expected;
  for (int i = 0; i < 20000; ++i) {
    const std::string line = "line " + std::to_string(i) + "\n";
    text += line;
    expected += line;
  }
  EXPECT_TRUE(text.view() == expected);
  EXPECT_EQ(text.c_str()[text.size()], '\0');
  text.clear();
  text += "again";
  EXPECT_STREQ(text.c_str(), "again");
}

TEST(StringBase, CopiesAreTextsOfTheirOwn) {
  StringBase text("text");
  const StringBase copy(text);
  StringBase assigned("something else");
  assigned = text;
  text += "s";
  EXPECT_EQ(copy, StringBase("text"));
  EXPECT_EQ(assigned, StringBase("text"));
  const StringBase& itself = assigned;
  assigned = itself;
  EXPECT_EQ(assigned, StringBase("text"));
  assigned = "plain";
  EXPECT_EQ(assigned, StringBase("plain"));
}

TEST(StringBase, AMovedFromTextCanBeUsedAgain) {
  StringBase text("text");
  StringBase moved(std::move(text));
  EXPECT_EQ(moved, StringBase("text"));
  text = "new";
  text += "er";
  EXPECT_STREQ(text.c_str(), "newer");
  moved = std::move(text);
  EXPECT_STREQ(moved.c_str(), "newer");
}

struct SearchRow {
  const char* part;
  std::size_t start;
  int expected;
};

TEST(StringBase, GetIndexOfStringSearchesFromAPlace) {
  const StringBase text("one two one");
  constexpr SearchRow rows[] = {{"one", 0, 0},    {"one", 1, 8},    {"one", 8, 8}, {"one", 9, -1}, {"ONE", 0, -1},
                                {"three", 0, -1}, {"one", 100, -1}, {"", 0, 0},    {"", 11, 11},   {"", 12, -1}};
  for (const SearchRow& row : rows)
    EXPECT_EQ(text.GetIndexOfString(row.part, row.start), row.expected) << row.part << " from " << row.start;
  EXPECT_EQ(StringBase().GetIndexOfString("a", 0), -1);
}

struct TrimRow {
  const char* text;
  const char* characters;
  int type;
  const char* expected;
};

TEST(StringBase, TrimStripsTheStartTheEndOrBoth) {
  constexpr TrimRow rows[] = {{"  a b  ", " ", 1, "a b  "}, {"  a b  ", " ", 2, "  a b"},
                              {"  a b  ", " ", 3, "a b"},   {"  a b  ", " ", 0, "  a b  "},
                              {"a\n\n", "\n", 2, "a"},      {"\n\n", "\n", 1, ""},
                              {"\n\n", "\n", 2, ""},        {"\n\n", "\n", 3, ""},
                              {"xyaxy", "yx", 3, "a"},      {"", "\n", 3, ""},
                              {"abc", "\n", 3, "abc"},      {"abc", "", 3, "abc"}};
  for (const TrimRow& row : rows) {
    StringBase text(row.text);
    text.Trim(row.characters, row.type);
    EXPECT_STREQ(text.c_str(), row.expected) << '"' << row.text << "\" " << row.type;
  }
}

TEST(StringBase, HoldsWideTextToo) {
  WideString text(L" wide ");
  text += L'!';
  text.Trim(L" !", WideString::trimBoth);
  EXPECT_EQ(text, WideString(L"wide"));
  EXPECT_EQ(text.GetIndexOfString(L"d", 0), 2);
}

TEST(StringBase, ComparesByText) {
  EXPECT_EQ(StringBase("a"), StringBase("a"));
  EXPECT_NE(StringBase("a"), StringBase("A"));
  EXPECT_NE(StringBase("a"), StringBase());
}

}  // namespace
