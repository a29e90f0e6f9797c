#include <fcntl.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <filesystem>

#include "interfaces/portability/File.h"
#include "tests/unit/support/ChildProcess.h"
#include "tests/unit/support/ConsoleCapture.h"
#include "tests/unit/support/Files.h"

namespace {

using Port::File;
using testsupport::ChildProcess;
using testsupport::exists;
using testsupport::readFile;
using testsupport::writeFile;

class FileTest : public testing::Test {
 protected:
  std::string path(const char* name) const { return directory_.file(name); }
  /// Opens, writes a text and closes; false when one of them fails.
  static bool write(const std::string& path, int access, const char* text) {
    auto stream = File::open(path.c_str(), access, true);
    if (stream == nullptr) return false;
    *stream << text;
    return File::close(stream);
  }

  testsupport::WorkingDirectory directory_;
};

TEST_F(FileTest, OpenForWritingMakesOrEmptiesTheFile) {
  EXPECT_TRUE(write(path("a"), File::write, "first text"));
  EXPECT_EQ(readFile(path("a")), "first text");
  EXPECT_TRUE(write(path("a"), File::write, "2nd"));
  EXPECT_EQ(readFile(path("a")), "2nd");
}

TEST_F(FileTest, OpenForExtendingMakesTheFileOrAddsToIt) {
  EXPECT_TRUE(write(path("a"), File::extend, "one"));
  EXPECT_TRUE(write(path("a"), File::extend, "two"));
  EXPECT_EQ(readFile(path("a")), "onetwo");
}

TEST_F(FileTest, AccessHasTheNumbersOfTheContract) {
  EXPECT_EQ(int{File::read}, 1);
  EXPECT_EQ(int{File::write}, 2);
  EXPECT_EQ(int{File::extend}, 3);
}

TEST_F(FileTest, OpenForReadingLeavesTheFileAlone) {
  writeFile(path("a"), "text\n");
  auto stream = File::open(path("a").c_str(), File::read, true);
  std::array<char, 16> line{};
  EXPECT_TRUE(Port::Stream::readline(*stream, line.data(), 16));
  EXPECT_STREQ(line.data(), "text");
  EXPECT_TRUE(File::close(stream));
  EXPECT_EQ(readFile(path("a")), "text\n");
}

TEST_F(FileTest, OpenGivesNullForWhatCantBeOpened) {
  for (const int access : {File::read, File::write, File::extend}) {
    EXPECT_EQ(File::open(directory_.path().c_str(), access, true), nullptr) << access;
    EXPECT_EQ(File::open(path("missing/a").c_str(), access, true), nullptr) << access;
    EXPECT_EQ(File::open("", access, true), nullptr) << access;
  }
  EXPECT_EQ(File::open(path("missing").c_str(), File::read, true), nullptr);
  EXPECT_FALSE(exists(path("missing")));
}

TEST_F(FileTest, OpenGivesNullForAFileThatBelongsToOthers) {
  if (::geteuid() == 0) GTEST_SKIP() << "root may open every file";
  writeFile(path("a"), "text");
  ::chmod(path("a").c_str(), 0);
  for (const int access : {File::read, File::write, File::extend})
    EXPECT_EQ(File::open(path("a").c_str(), access, true), nullptr) << access;
  EXPECT_FALSE(File::probe(path("a").c_str()));
}

TEST_F(FileTest, ADashIsStandardInput) {
  const testsupport::StandardInput input("one\ntwo\n");
  auto stream = File::open("-", File::read, true);
  std::array<char, 16> line{};
  EXPECT_TRUE(Port::Stream::readline(*stream, line.data(), 16));
  EXPECT_STREQ(line.data(), "one");
  EXPECT_TRUE(File::close(stream));
  EXPECT_GE(::fcntl(STDIN_FILENO, F_GETFD), 0);
}

TEST_F(FileTest, ADashToWriteIsAFileOfThatName) {
  testsupport::StandardOutputCapture output;
  const bool written = write("-", File::write, "one ") && write("-", File::extend, "two\n");
  EXPECT_EQ(output.text(), "");
  EXPECT_TRUE(written);
  EXPECT_EQ(readFile(path("-")), "one two\n");
}

TEST_F(FileTest, CloseOfNothingSucceeds) {
  std::unique_ptr<Port::Stream> stream;
  EXPECT_TRUE(File::close(stream));
  stream = File::open(path("a").c_str(), File::write, true);
  EXPECT_TRUE(File::close(stream));
  EXPECT_EQ(stream, nullptr);
}

TEST_F(FileTest, ProbeTellsWhetherAFileCanBeRead) {
  writeFile(path("a"), "");
  EXPECT_TRUE(File::probe(path("a").c_str()));
  EXPECT_FALSE(File::probe(path("b").c_str()));
  EXPECT_FALSE(File::probe(path("a/b").c_str()));
  EXPECT_FALSE(File::probe(""));
  EXPECT_FALSE(exists(path("b")));
}

TEST_F(FileTest, RemoveTakesAFileAway) {
  writeFile(path("a"), "text");
  EXPECT_TRUE(File::remove(path("a").c_str()));
  EXPECT_FALSE(exists(path("a")));
  EXPECT_FALSE(File::remove(path("a").c_str()));
  EXPECT_FALSE(File::remove(""));
}

TEST_F(FileTest, CopyReplacesTheTarget) {
  std::string content(300000, '\0');
  for (std::size_t i = 0; i < content.size(); ++i) content[i] = static_cast<char>(i * 31);
  writeFile(path("a"), content);
  EXPECT_TRUE(File::copy(path("a").c_str(), path("b").c_str()));
  EXPECT_TRUE(readFile(path("b")) == content);
  writeFile(path("a"), "");
  EXPECT_TRUE(File::copy(path("a").c_str(), path("b").c_str()));
  EXPECT_EQ(readFile(path("b")), "");
}

TEST_F(FileTest, CopyWithoutASourceLeavesTheTargetAlone) {
  writeFile(path("b"), "kept");
  for (const char* source : {"missing", ".", ""}) {
    EXPECT_FALSE(File::copy(source, path("b").c_str())) << source;
    EXPECT_FALSE(File::copy(source, path("new").c_str())) << source;
  }
  EXPECT_EQ(readFile(path("b")), "kept");
  EXPECT_FALSE(exists(path("new")));
}

TEST_F(FileTest, CopyToWhereNothingCanBeWrittenFails) {
  writeFile(path("a"), "text");
  EXPECT_FALSE(File::copy(path("a").c_str(), path("missing/b").c_str()));
  EXPECT_FALSE(File::copy(path("a").c_str(), directory_.path().c_str()));
  EXPECT_FALSE(File::copy(path("a").c_str(), ""));
}

TEST_F(FileTest, CopyAndAppendToAFullDiskFail) {
  if (::access("/dev/full", W_OK) != 0) GTEST_SKIP() << "this system has no /dev/full";
  writeFile(path("a"), "text");
  EXPECT_FALSE(File::copy(path("a").c_str(), "/dev/full"));
  EXPECT_FALSE(File::append(path("a").c_str(), "/dev/full"));
}

TEST_F(FileTest, CopyOntoItselfIsRefused) {
  writeFile(path("a"), "text");
  std::filesystem::create_hard_link(path("a"), path("link"));
  std::filesystem::create_symlink("a", path("symlink"));
  for (const char* other : {"a", "./a", "link", "symlink"}) {
    EXPECT_FALSE(File::copy(path("a").c_str(), path(other).c_str())) << other;
    EXPECT_EQ(readFile(path("a")), "text") << other;
  }
}

TEST_F(FileTest, AppendAddsToTheTargetOrMakesIt) {
  writeFile(path("a"), "one\n");
  EXPECT_TRUE(File::append(path("a").c_str(), path("b").c_str()));
  EXPECT_EQ(readFile(path("b")), "one\n");
  EXPECT_TRUE(File::append(path("a").c_str(), path("b").c_str()));
  EXPECT_EQ(readFile(path("b")), "one\none\n");
  EXPECT_EQ(readFile(path("a")), "one\n");
}

TEST_F(FileTest, AppendReportsFailure) {
  writeFile(path("a"), "text");
  EXPECT_FALSE(File::append(path("missing").c_str(), path("b").c_str()));
  EXPECT_FALSE(exists(path("b")));
  EXPECT_FALSE(File::append(path("a").c_str(), path("missing/b").c_str()));
}

TEST_F(FileTest, AppendOfAFileToItselfIsRefused) {
  writeFile(path("a"), "text");
  std::filesystem::create_hard_link(path("a"), path("link"));
  for (const char* other : {"a", "link"}) {
    ChildProcess child([this, other] {
      const rlimit limit{1 << 20, 1 << 20};  // it must not fill the disk
      ::setrlimit(RLIMIT_FSIZE, &limit);
      ::signal(SIGXFSZ, SIG_IGN);
      return File::append(path("a").c_str(), path(other).c_str()) ? 1 : 0;
    });
    EXPECT_EQ(child.wait(), "exit 0") << other;
    EXPECT_EQ(readFile(path("a")), "text") << other;
  }
}

TEST_F(FileTest, GetcwdNeedsRoomForTheTerminatingZero) {
  const std::string current = directory_.path();
  std::vector<char> buffer(current.size() + 1, 'x');
  const int size = static_cast<int>(buffer.size());
  EXPECT_TRUE(File::getcwd(buffer.data(), size));
  EXPECT_EQ(buffer.data(), current);
  for (const int small : {size - 1, 2, 1}) {
    buffer[0] = 'x';
    EXPECT_FALSE(File::getcwd(buffer.data(), small)) << small;
    EXPECT_STREQ(buffer.data(), "") << small;
  }
}

TEST_F(FileTest, GetcwdWritesNothingIntoABufferWithoutRoom) {
  char buffer = 'x';
  EXPECT_FALSE(File::getcwd(&buffer, 0));
  EXPECT_FALSE(File::getcwd(&buffer, -1));
  EXPECT_EQ(buffer, 'x');
}

TEST_F(FileTest, GetcwdGivesATextOfAnyLength) {
  EXPECT_EQ(File::getcwd(), StringBase(directory_.path().c_str()));
  std::string deep = directory_.path();
  for (int i = 0; i < 10; ++i) deep += "/" + std::string(40, 'd');
  std::filesystem::create_directories(deep);
  std::filesystem::current_path(deep);
  EXPECT_EQ(File::getcwd(), StringBase(deep.c_str()));
}

TEST_F(FileTest, GetcwdOfARemovedDirectoryIsEmpty) {
  std::filesystem::create_directory(path("gone"));
  std::filesystem::current_path(path("gone"));
  std::filesystem::remove(path("gone"));
  std::array<char, 256> buffer{'x'};
  EXPECT_FALSE(File::getcwd(buffer.data(), 256));
  EXPECT_STREQ(buffer.data(), "");
  EXPECT_TRUE(File::getcwd().empty());
}

}  // namespace
