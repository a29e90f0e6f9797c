#include <gtest/gtest.h>

#include "manager/support/TextPlace.h"

namespace {

std::string textAt(std::string_view text, std::size_t offset) {
  return failureAt("f.json", text, offset, "expected a number").text;
}

TEST(TextPlace, NamesLineAndColumnAndShowsTheLine) {
  const std::string text = "{\n\n  \"length\": many\n}\n";
  EXPECT_EQ(textAt(text, text.find("many")),
            "f.json:3:13: expected a number\n"
            "    \"length\": many\n"
            "              ^");
}

TEST(TextPlace, FirstAndLastPlace) {
  EXPECT_EQ(textAt("ab", 0), "f.json:1:1: expected a number\n  ab\n  ^");
  EXPECT_EQ(textAt("ab", 2), "f.json:1:3: expected a number\n  ab\n    ^");
  EXPECT_EQ(textAt("ab\ncd", 2), "f.json:1:3: expected a number\n  ab\n    ^");
}

TEST(TextPlace, AnOffsetBeyondTheTextIsItsEnd) {
  EXPECT_EQ(textAt("ab\ncd", 100), "f.json:2:3: expected a number\n  cd\n    ^");
}

TEST(TextPlace, AnEmptyLineIsNotShown) {
  EXPECT_EQ(textAt("", 0), "f.json:1:1: expected a number");
  EXPECT_EQ(textAt("ab\n", 3), "f.json:2:1: expected a number");
}

TEST(TextPlace, ATabIsOneColumn) { EXPECT_EQ(textAt("\t\tx", 2), "f.json:1:3: expected a number\n    x\n    ^"); }

TEST(TextPlace, ACarriageReturnBelongsToTheLineEnd) {
  EXPECT_EQ(textAt("ab\r\ncd\r\n", 3), "f.json:1:3: expected a number\n  ab\n    ^");
  EXPECT_EQ(textAt("ab\r\ncd\r\n", 5), "f.json:2:2: expected a number\n  cd\n   ^");
}

TEST(TextPlace, ACharacterOfSeveralBytesIsOneColumn) {
  EXPECT_EQ(textAt("\xC3\xA4\xE2\x82\xAC=x", 6), "f.json:1:4: expected a number\n  \xC3\xA4\xE2\x82\xAC=x\n     ^");
}

TEST(TextPlace, ControlCharactersDoNotReachTheTerminal) {
  EXPECT_EQ(textAt(std::string("a\x1B[0m") + '\0' + "b", 1), "f.json:1:2: expected a number\n  a?[0m?b\n   ^");
}

TEST(TextPlace, ALongLineIsCutAroundThePlace) {
  const std::string text = std::string(200, 'a') + 'X' + std::string(200, 'b');
  EXPECT_EQ(textAt(text, 200), "f.json:1:201: expected a number\n  ..." + std::string(60, 'a') + 'X' +
                                   std::string(39, 'b') + "...\n" + std::string(65, ' ') + '^');
  EXPECT_EQ(textAt(text, 10),
            "f.json:1:11: expected a number\n  " + std::string(50, 'a') + "...\n" + std::string(12, ' ') + '^');
}

TEST(TextPlace, ACutKeepsCharactersWhole) {
  std::string text;
  for (int i = 0; i < 100; ++i) text += "\xC3\xA4";
  std::string shown;
  for (int i = 0; i < 30; ++i) shown += "\xC3\xA4";
  // 60 bytes before an odd place begin inside a character.
  const std::string result = textAt("x" + text, 101);
  EXPECT_NE(result.find("  ..." + shown + "\xC3\xA4"), std::string::npos) << result;
  EXPECT_TRUE(result.ends_with("...\n" + std::string(35, ' ') + '^')) << result;
}

}  // namespace
