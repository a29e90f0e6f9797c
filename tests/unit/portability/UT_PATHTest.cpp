#include <gtest/gtest.h>

#include <array>
#include <string>

#include "interfaces/portability/UT_PATH.h"

namespace {

struct Row {
  const char* path;
  const char* extension;  ///< null when there is none
  const char* tail;
};
constexpr Row rows[] = {
    {"", nullptr, ""},
    {"file", nullptr, "file"},
    {"file.bit", "bit", "file.bit"},
    {"file.tar.GZ", "GZ", "file.tar.GZ"},
    {"file.", "", "file."},
    {".profile", "profile", ".profile"},
    {".", "", "."},
    {"..", "", ".."},
    {"dir/file.bit", "bit", "file.bit"},
    {"dir\\file.bit", "bit", "file.bit"},
    {"dir\\sub/file.bit", "bit", "file.bit"},
    {"dir/sub\\file.bit", "bit", "file.bit"},
    {"dir.d/file", nullptr, "file"},
    {"dir.d\\file", nullptr, "file"},
    {"dir.d/", nullptr, ""},
    {"/", nullptr, ""},
    {"C:\\dir.d\\a.b", "b", "a.b"},
};

TEST(UT_PATH, GetExtPointsIntoThePath) {
  for (const Row& row : rows) {
    SCOPED_TRACE(row.path);
    const char* extension = UT_PATH::GetExt(row.path);
    EXPECT_STREQ(extension, row.extension);
    if (extension == nullptr) continue;
    EXPECT_EQ(extension + std::string(extension).size(), row.path + std::string(row.path).size());
  }
  EXPECT_EQ(UT_PATH::GetExt(nullptr), nullptr);
}

TEST(UT_PATH, GetExtCopiesIntoABuffer) {
  for (const Row& row : rows) {
    std::array<char, 8> buffer{"xxxxxxx"};
    EXPECT_TRUE(UT_PATH::GetExt(row.path, buffer.data(), 8)) << row.path;
    EXPECT_STREQ(buffer.data(), row.extension == nullptr ? "" : row.extension) << row.path;
  }
}

TEST(UT_PATH, GetExtNeedsRoomForTheTerminatingZero) {
  std::array<char, 8> buffer{"xxxxxxx"};
  EXPECT_TRUE(UT_PATH::GetExt("a.bit", buffer.data(), 4));
  EXPECT_STREQ(buffer.data(), "bit");
  EXPECT_FALSE(UT_PATH::GetExt("a.bit", buffer.data(), 3));
  EXPECT_STREQ(buffer.data(), "");
  buffer[0] = 'x';
  EXPECT_FALSE(UT_PATH::GetExt("a.bit", buffer.data(), 0));
  EXPECT_EQ(buffer[0], 'x');
  EXPECT_TRUE(UT_PATH::GetExt(nullptr, buffer.data(), 8));
  EXPECT_STREQ(buffer.data(), "");
}

TEST(UT_PATH, GetTailIsTheLastComponent) {
  for (const Row& row : rows) EXPECT_STREQ(UT_PATH::GetTail(row.path), row.tail) << row.path;
}

}  // namespace
