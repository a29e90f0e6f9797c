#include <gtest/gtest.h>

#include <set>
#include <string>

#include "interfaces/constraints/ConstraintsManager.h"
#include "interfaces/constraints/ModeKeywords.h"

namespace {

struct Row {
  const char* keyword;
  int mode;
};
constexpr Row rows[] = {
    {"ss", 1},     {"sserial", 1}, {"bs", 0},       {"bscan", 0},  {"sm", 2},           {"smap", 2},
    {"cf", 6},     {"obacf", 6},   {"mpm", 7},      {"obampm", 7}, {"pff", 8},          {"promfile", 8},
    {"bsfile", 3}, {"hw520", 4},   {"dtconfig", 4}, {"spi", 5},    {"compactflash", 6},
};

TEST(ConstraintsManager, KnowsTheKeywordsOfModes) {
  for (const Row& row : rows) EXPECT_EQ(int{ConstraintsManager::modeString2Type(row.keyword)}, row.mode) << row.keyword;
  EXPECT_EQ(std::size(rows), std::size(ModeKeywords::modes));
}

TEST(ConstraintsManager, LetterCaseDoesNotCount) {
  EXPECT_EQ(ConstraintsManager::modeString2Type("BScan"), tESSELNS::BOUNDARY_SCAN);
  EXPECT_EQ(ConstraintsManager::modeString2Type("COMPACTFLASH"), tESSELNS::SYSTEM_OBA_CF);
  EXPECT_EQ(ConstraintsManager::modeString2Type("Hw520"), tESSELNS::DESKTOP_CONFIGURATION);
}

TEST(ConstraintsManager, AnyOtherTextIsNoMode) {
  for (const char* text : {"", "b", "bsca", "bscans", " bs", "-bs", "none", "9", "pffserial", "mpmss"})
    EXPECT_EQ(int{ConstraintsManager::modeString2Type(text)}, 9) << text;
  EXPECT_EQ(int{ConstraintsManager::modeString2Type(nullptr)}, 9);
}

struct SubmodeRow {
  const char* keyword;
  int mode;
  int submode;
};

TEST(ModeKeywords, SubmodesBelongToOneModeEach) {
  constexpr SubmodeRow expected[] = {{"mpmss", 7, 0},       {"mpmsm", 7, 1},      {"pffserial", 8, 0},
                                     {"pffparallel", 8, 1}, {"pffversion", 8, 2}, {"pffspi", 8, 3},
                                     {"pffbpi", 8, 4},      {"pffmbspi", 8, 5},   {"pffmbbpi", 8, 6}};
  ASSERT_EQ(std::size(ModeKeywords::submodes), std::size(expected));
  for (std::size_t i = 0; i < std::size(expected); ++i) {
    EXPECT_STREQ(ModeKeywords::submodes[i].keyword, expected[i].keyword);
    EXPECT_EQ(int{ModeKeywords::submodes[i].requiredMode}, expected[i].mode) << expected[i].keyword;
    EXPECT_EQ(int{ModeKeywords::submodes[i].submode}, expected[i].submode) << expected[i].keyword;
  }
}

TEST(ModeKeywords, NoKeywordStandsTwice) {
  std::set<std::string> keywords;
  for (const auto& row : ModeKeywords::modes) EXPECT_TRUE(keywords.insert(row.keyword).second) << row.keyword;
  for (const auto& row : ModeKeywords::submodes) EXPECT_TRUE(keywords.insert(row.keyword).second) << row.keyword;
}

}  // namespace
