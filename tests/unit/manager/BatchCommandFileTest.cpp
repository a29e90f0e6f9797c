#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>

#include "manager/manager/BatchCommandFile.h"
#include "tests/unit/support/Files.h"
#include "tests/unit/support/RecordedMessages.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::exists;
using testsupport::readFile;
using testsupport::writeFile;

class BatchCommandFileTest : public testing::Test {
 protected:
  static testsupport::Message cantWrite(const std::string& path, const std::string& reason) {
    return testsupport::error("Batch-command file " + path + " can't be written: " + reason +
                              ". Steps are not recorded; name another file with renameBatchCmdFile.\n");
  }

  testsupport::WorkingDirectory directory_;
  testsupport::RecordedMessages messages_;
  BatchCommandFile file_;
};

TEST_F(BatchCommandFileTest, IsMadeWithTheFirstLine) {
  EXPECT_THAT(testsupport::listDirectory(directory_.path()), IsEmpty());
  EXPECT_TRUE(file_.write("setMode -bscan"));
  EXPECT_EQ(readFile("_tesselbatch.cmd"), "setMode -bscan\n");
  EXPECT_TRUE(file_.write(""));
  EXPECT_TRUE(file_.write("quit"));
  EXPECT_EQ(readFile("_tesselbatch.cmd"), "setMode -bscan\n\nquit\n");
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(BatchCommandFileTest, KeepsWhatTheFileHolds) {
  writeFile("_tesselbatch.cmd", "before\n");
  EXPECT_TRUE(file_.write("after"));
  EXPECT_EQ(readFile("_tesselbatch.cmd"), "before\nafter\n");
}

TEST_F(BatchCommandFileTest, StaysInTheDirectoryOfTheFirstLine) {
  std::filesystem::create_directory("sub");
  EXPECT_TRUE(file_.write("one"));
  std::filesystem::current_path("sub");
  EXPECT_TRUE(file_.write("two"));
  EXPECT_EQ(readFile(directory_.file("_tesselbatch.cmd")), "one\ntwo\n");
  EXPECT_FALSE(exists("_tesselbatch.cmd"));
}

TEST_F(BatchCommandFileTest, RenamedItGoesOnInTheOtherFile) {
  EXPECT_TRUE(file_.write("one"));
  file_.rename("steps.cmd");
  EXPECT_FALSE(exists("steps.cmd"));
  EXPECT_TRUE(file_.write("two"));
  file_.rename("steps.cmd");
  EXPECT_TRUE(file_.write("three"));
  file_.rename("_tesselbatch.cmd");
  EXPECT_TRUE(file_.write("four"));
  EXPECT_EQ(readFile("_tesselbatch.cmd"), "one\nfour\n");
  EXPECT_EQ(readFile("steps.cmd"), "two\nthree\n");
}

TEST_F(BatchCommandFileTest, AnUnwritableFileIsToldOnce) {
  file_.rename("missing/steps.cmd");
  for (int i = 0; i < 3; ++i) EXPECT_FALSE(file_.write("lost"));
  EXPECT_THAT(messages_.take(), ElementsAre(cantWrite("missing/steps.cmd", "No such file or directory")));
  std::filesystem::create_directory("folder");
  file_.rename("folder");
  for (int i = 0; i < 3; ++i) EXPECT_FALSE(file_.write("lost"));
  EXPECT_THAT(messages_.take(), ElementsAre(cantWrite("folder", "Is a directory")));
}

TEST_F(BatchCommandFileTest, AFullDiskIsToldOnce) {
  if (::access("/dev/full", W_OK) != 0) GTEST_SKIP() << "this system has no /dev/full";
  file_.rename("/dev/full");
  for (int i = 0; i < 3; ++i) EXPECT_FALSE(file_.write("lost"));
  EXPECT_THAT(messages_.all(), ElementsAre(cantWrite("/dev/full", "No space left on device")));
}

TEST_F(BatchCommandFileTest, AnotherNameEndsTheTrouble) {
  file_.rename("missing/steps.cmd");
  EXPECT_FALSE(file_.write("lost"));
  file_.rename("missing/steps.cmd");
  EXPECT_FALSE(file_.write("lost"));
  file_.rename("steps.cmd");
  EXPECT_TRUE(file_.write("found"));
  EXPECT_EQ(readFile("steps.cmd"), "found\n");
  EXPECT_EQ(messages_.all().size(), 1U);
}

}  // namespace
