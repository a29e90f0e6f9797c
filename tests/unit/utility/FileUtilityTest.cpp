#include <gtest/gtest.h>

#include "interfaces/utility/FileUtility.h"
#include "tests/unit/support/Files.h"

namespace {

struct PathRow {
  const char* path;
  const char* base;
  const char* expected;
};

TEST(FileUtility, ConvertPathLeavesFullPathsAndJoinsOthers) {
  constexpr PathRow rows[] = {
      {"/a/b.bit", "/base", "/a/b.bit"},
      {"/", "/base", "/"},
      {"\\\\host\\a", "/base", "\\\\host\\a"},
      {"\\a", "/base", "\\a"},
      {"C:\\a\\b", "/base", "C:\\a\\b"},
      {"c:/a", "/base", "c:/a"},
      {"C:a", "/base", "/base/C:a"},
      {"C:", "/base", "/base/C:"},
      {"b.bit", "/base", "/base/b.bit"},
      {"b.bit", "/base/", "/base/b.bit"},
      {"b.bit", "C:\\base\\", "C:\\base\\b.bit"},
      {"b.bit", "C:\\base", "C:\\base/b.bit"},
      {"a/b.bit", "/base", "/base/a/b.bit"},
      {"../b.bit", "/base", "/base/../b.bit"},
      {"./b.bit", "rel", "rel/./b.bit"},
      {"", "/base", "/base/"},
      {"a b", "/ba se", "/ba se/a b"},
      {"b", "/", "/b"},
  };
  for (const PathRow& row : rows)
    EXPECT_EQ(FileUtility::convertPath(row.path, row.base), StringBase(row.expected)) << row.path << " at " << row.base;
}

TEST(FileUtility, ConvertPathGoesByTheCurrentDirectory) {
  const testsupport::WorkingDirectory directory;
  EXPECT_EQ(FileUtility::convertPath("b.bit", ""), StringBase(directory.file("b.bit")));
  EXPECT_EQ(FileUtility::convertPath("a/b.bit", StringBase()), StringBase(directory.file("a/b.bit")));
  EXPECT_EQ(FileUtility::convertPath("/b.bit", ""), StringBase("/b.bit"));
}

struct SplitRow {
  const char* path;
  const char* head;
  const char* tail;
};

TEST(FileUtility, HeadAndTailSplitAPath) {
  constexpr SplitRow rows[] = {
      {"", "", ""},
      {"b.bit", "", "b.bit"},
      {"a/b.bit", "a", "b.bit"},
      {"/a/b.bit", "/a", "b.bit"},
      {"a/b/c.bit", "a/b", "c.bit"},
      {"/b.bit", "/", "b.bit"},
      {"//b.bit", "/", "b.bit"},
      {"a//b.bit", "a", "b.bit"},
      {"a/", "a", ""},
      {"a/b//", "a/b", ""},
      {"/", "/", ""},
      {"a\\b.bit", "a", "b.bit"},
      {"\\b.bit", "\\", "b.bit"},
      {"C:\\a\\b.bit", "C:\\a", "b.bit"},
      {"a\\b/c.bit", "a\\b", "c.bit"},
      {"a/b\\c.bit", "a/b", "c.bit"},
      {"a/\\b.bit", "a", "b.bit"},
      {"./b.bit", ".", "b.bit"},
  };
  for (const SplitRow& row : rows) {
    EXPECT_EQ(FileUtility::getHead(row.path), StringBase(row.head)) << row.path;
    EXPECT_EQ(FileUtility::getTail(row.path), StringBase(row.tail)) << row.path;
  }
}

}  // namespace
