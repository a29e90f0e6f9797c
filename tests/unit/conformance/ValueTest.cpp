#include <gtest/gtest.h>

#include "tests/conformance/runner/LineCursor.h"
#include "tests/conformance/runner/Value.h"

namespace conformance {
namespace {

Value parse(const std::string& text) {
  LineCursor cursor(text, {"test", 1});
  Value value = cursor.value();
  cursor.requireEnd();
  return value;
}

bool fitsPattern(const std::string& pattern, const std::string& value) { return matches(parse(pattern), parse(value)); }

class EveryForm : public testing::TestWithParam<const char*> {};

TEST_P(EveryForm, RendersAsItIsWritten) { EXPECT_EQ(GetParam(), render(parse(GetParam()))); }

INSTANTIATE_TEST_SUITE_P(Value, EveryForm,
                         testing::Values("*", "null", "true", "false", "0", "-1", "4294967295", "\"\"", "\"a b\"",
                                         R"("\n\t\r\f\"\\\x01\x7F")", "\"\u00E4\u20AC\U0001F600\"", R"("\xE4\xC3x")",
                                         "[]", "[\"a\", \"b\"]", "{}", "{1: \"a.bit\", 2: \"b.rbt\"}", "(9, -1, false)",
                                         "DeviceNS 57", "ConfigDeviceNS 1", "CollectionNS 2", "DesignNS -1",
                                         "interface", "throw InvalidArgumentException"));

TEST(Value, BlanksBetweenItsPartsDoNotCount) {
  EXPECT_EQ(parse("[\"a\", \"b\"]"), parse(" [ \"a\" ,\"b\" ] "));
  EXPECT_EQ(parse("{1: \"a\", 2: \"b\"}"), parse("{2:\"b\",1:\"a\"}"));
}

TEST(Value, HexadecimalEscapesGiveBytes) { EXPECT_EQ(std::string("A\0z", 3), parse("\"\\x41\\x00\\x7a\"").text); }

TEST(Value, EqualValuesMatch) {
  EXPECT_TRUE(fitsPattern("[\"a\"]", "[\"a\"]"));
  EXPECT_FALSE(fitsPattern("[\"a\"]", "[\"a\", \"b\"]"));
  EXPECT_FALSE(fitsPattern("[\"a\", \"b\"]", "[\"a\"]"));
  EXPECT_FALSE(fitsPattern("1", "true"));
  EXPECT_FALSE(fitsPattern("null", "\"null\""));
  EXPECT_FALSE(fitsPattern("DeviceNS 1", "DesignNS 1"));
  EXPECT_FALSE(fitsPattern("{1: \"a\"}", "{2: \"a\"}"));
}

TEST(Value, AStarMatchesAnythingInItsPlace) {
  EXPECT_TRUE(fitsPattern("*", "null"));
  EXPECT_TRUE(fitsPattern("*", "[\"a\"]"));
  EXPECT_TRUE(fitsPattern("[\"a\", *]", "[\"a\", \"b\"]"));
  EXPECT_FALSE(fitsPattern("[\"a\", *]", "[\"a\"]"));
  EXPECT_TRUE(fitsPattern("{1: *}", "{1: \"a\"}"));
  EXPECT_FALSE(fitsPattern("1", "*"));
  EXPECT_FALSE(fitsPattern("\"*\"", "\"a\""));
}

TEST(Value, TheWorkingDirectoryHasAName) {
  EXPECT_EQ("/tmp/x/a:/tmp/x", expandDirectory("${CWD}/a:${CWD}", "/tmp/x"));
  EXPECT_EQ("${CWD}/a:${CWD}", foldDirectory("/tmp/x/a:/tmp/x", "/tmp/x"));
  const Value list = foldDirectory(parse("[\"/tmp/x/a\", {1: \"/tmp/x\"}]"), "/tmp/x");
  EXPECT_EQ("[\"${CWD}/a\", {1: \"${CWD}\"}]", render(list));
}

}  // namespace
}  // namespace conformance
