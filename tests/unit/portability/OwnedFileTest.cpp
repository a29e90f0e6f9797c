#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>

#include "interfaces/portability/OwnedFile.h"
#include "tests/unit/support/ChildProcess.h"
#include "tests/unit/support/Files.h"
#include "tests/unit/support/ScopedVariable.h"

namespace {

using Port::OwnedFile;
using testsupport::ChildProcess;
using testsupport::exists;
using testsupport::listDirectory;
using testsupport::readFile;
using testsupport::ScopedVariable;
using testsupport::writeFile;

class OwnedFileTest : public testing::Test {
 protected:
  /// Makes the file in a process that has ended by now; gives its id.
  int makeStale() const {
    ChildProcess child([this] {
      OwnedFile::Owner owner;
      return OwnedFile::create(path_, owner) ? 0 : 1;
    });
    const int id = child.id();
    EXPECT_EQ(child.wait(), "exit 0");
    return id;
  }

  testsupport::TemporaryDirectory directory_;
  std::string path_ = directory_.file("owned");
  OwnedFile::Owner owner_;
};

TEST_F(OwnedFileTest, CreateNamesThisProcess) {
  EXPECT_TRUE(OwnedFile::create(path_, owner_));
  const OwnedFile::Owner owner = OwnedFile::owner(path_);
  EXPECT_TRUE(owner.exists);
  EXPECT_EQ(owner.process, ::getpid());
  EXPECT_TRUE(owner.running);
  EXPECT_EQ(owner.problem, "");
  EXPECT_EQ(owner.content, readFile(path_));
  EXPECT_EQ(owner.content.find(std::to_string(::getpid()) + " "), 0U);
  EXPECT_EQ(listDirectory(directory_.path()), std::vector<std::string>{"owned"});
}

TEST_F(OwnedFileTest, CreateLeavesAFileOfAnotherOwnerAlone) {
  EXPECT_TRUE(OwnedFile::create(path_, owner_));
  const std::string content = readFile(path_);
  ChildProcess child([this] {
    OwnedFile::Owner owner;
    if (OwnedFile::create(path_, owner)) return 1;
    return owner.exists && owner.running && owner.process == ::getppid() ? 0 : 2;
  });
  EXPECT_EQ(child.wait(), "exit 0");
  EXPECT_EQ(readFile(path_), content);
  EXPECT_EQ(listDirectory(directory_.path()), std::vector<std::string>{"owned"});
}

TEST_F(OwnedFileTest, AnOwnerThatHasEndedIsNotRunning) {
  const int id = makeStale();
  const OwnedFile::Owner owner = OwnedFile::owner(path_);
  EXPECT_TRUE(owner.exists);
  EXPECT_EQ(owner.process, id);
  EXPECT_FALSE(owner.running);
  EXPECT_FALSE(OwnedFile::create(path_, owner_));
  EXPECT_EQ(owner_.process, id);
  EXPECT_FALSE(owner_.running);
}

TEST_F(OwnedFileTest, AnotherProcessWithTheSameIdIsNotTheOwner) {
  EXPECT_TRUE(OwnedFile::create(path_, owner_));
  if (readFile(path_) == std::to_string(::getpid()) + " \n") GTEST_SKIP() << "this system does not tell start times";
  writeFile(path_, std::to_string(::getpid()) + " 1\n");
  EXPECT_FALSE(OwnedFile::owner(path_).running);
  EXPECT_EQ(OwnedFile::owner(path_).process, ::getpid());
}

struct ContentRow {
  std::string content;
  int process;
  bool running;
  const char* problem;
};

TEST_F(OwnedFileTest, ReadsWhatOthersWrote) {
  const std::string self = std::to_string(::getpid());
  const char* nameless = "it exists and names no process";
  const ContentRow rows[] = {
      {self, ::getpid(), true, ""},
      {self + "\n", ::getpid(), true, ""},
      {"  " + self + " \r\n", ::getpid(), true, ""},
      {"", 0, false, nameless},
      {"\n", 0, false, nameless},
      {"busy\n", 0, false, nameless},
      {"99999999999\n", 0, false, nameless},
      {std::string(100000, 'x'), 0, false, nameless},
      {"0\n", 0, false, nameless},
  };
  for (const ContentRow& row : rows) {
    SCOPED_TRACE(row.content.substr(0, 20));
    writeFile(path_, row.content);
    const OwnedFile::Owner owner = OwnedFile::owner(path_);
    EXPECT_TRUE(owner.exists);
    EXPECT_EQ(owner.process, row.process);
    EXPECT_EQ(owner.running, row.running);
    EXPECT_EQ(owner.problem, row.problem);
  }
}

TEST_F(OwnedFileTest, WithoutAFileThereIsNoOwner) {
  const OwnedFile::Owner owner = OwnedFile::owner(path_);
  EXPECT_FALSE(owner.exists);
  EXPECT_EQ(owner.process, 0);
  EXPECT_FALSE(owner.running);
  EXPECT_EQ(owner.problem, "");
}

TEST_F(OwnedFileTest, ADirectoryInTheFilesPlaceIsThere) {
  std::filesystem::create_directory(path_);
  errno = ENOENT;  // left over from whatever the program did before
  EXPECT_TRUE(OwnedFile::owner(path_).exists);
  errno = 0;
  EXPECT_TRUE(OwnedFile::owner(path_).exists);
  EXPECT_FALSE(OwnedFile::create(path_, owner_));
  EXPECT_EQ(owner_.problem, "it exists and names no process");
}

TEST_F(OwnedFileTest, CreateTellsWhyItCant) {
  EXPECT_FALSE(OwnedFile::create(directory_.file("missing/owned"), owner_));
  EXPECT_EQ(owner_.problem, "No such file or directory");
  EXPECT_FALSE(owner_.exists);
  EXPECT_EQ(owner_.process, 0);
}

TEST_F(OwnedFileTest, RemoveTakesTheFileAway) {
  EXPECT_TRUE(OwnedFile::create(path_, owner_));
  EXPECT_TRUE(OwnedFile::remove(path_));
  EXPECT_FALSE(exists(path_));
  EXPECT_FALSE(OwnedFile::remove(path_));
}

TEST_F(OwnedFileTest, RemoveStaleTakesTheFileThatWasSeen) {
  makeStale();
  EXPECT_TRUE(OwnedFile::removeStale(path_, OwnedFile::owner(path_)));
  EXPECT_TRUE(listDirectory(directory_.path()).empty());
}

TEST_F(OwnedFileTest, RemoveStaleOfAFileThatIsGoneSucceeds) {
  makeStale();
  const OwnedFile::Owner seen = OwnedFile::owner(path_);
  OwnedFile::remove(path_);
  EXPECT_TRUE(OwnedFile::removeStale(path_, seen));
}

TEST_F(OwnedFileTest, RemoveStaleLeavesAFreshFileInPlace) {
  makeStale();
  const OwnedFile::Owner seen = OwnedFile::owner(path_);
  OwnedFile::remove(path_);
  EXPECT_TRUE(OwnedFile::create(path_, owner_));
  const std::string fresh = readFile(path_);
  EXPECT_FALSE(OwnedFile::removeStale(path_, seen));
  EXPECT_EQ(readFile(path_), fresh);
  EXPECT_EQ(listDirectory(directory_.path()), std::vector<std::string>{"owned"});
}

TEST_F(OwnedFileTest, TheRuntimeDirectoryIsTheUsersOwn) {
  const ScopedVariable runtime("XDG_RUNTIME_DIR", directory_.path().c_str());
  EXPECT_EQ(OwnedFile::runtimeDirectory(), directory_.file("tessel"));
  struct stat status {};
  ASSERT_EQ(::stat(directory_.file("tessel").c_str(), &status), 0);
  EXPECT_EQ(status.st_uid, ::getuid());
  EXPECT_EQ(status.st_mode & 0777U, 0700U);
  EXPECT_EQ(OwnedFile::runtimeDirectory(), directory_.file("tessel"));
}

TEST_F(OwnedFileTest, ADirectoryThatOthersCanWriteInIsNotUsed) {
  const std::string fallback = "/tmp/tessel-" + std::to_string(::getuid());
  const bool wasThere = exists(fallback);
  const ScopedVariable runtime("XDG_RUNTIME_DIR", directory_.path().c_str());
  std::filesystem::create_directory(directory_.file("tessel"));
  ::chmod(directory_.file("tessel").c_str(), 0777);
  EXPECT_EQ(OwnedFile::runtimeDirectory(), fallback);
  std::filesystem::remove(directory_.file("tessel"));
  std::filesystem::create_directory(directory_.file("elsewhere"));
  std::filesystem::create_symlink(directory_.file("elsewhere"), directory_.file("tessel"));
  EXPECT_EQ(OwnedFile::runtimeDirectory(), fallback);
  for (const char* value : {static_cast<const char*>(nullptr), "", "relative"}) {
    const ScopedVariable other("XDG_RUNTIME_DIR", value);
    EXPECT_EQ(OwnedFile::runtimeDirectory(), fallback);
  }
  if (!wasThere) ::rmdir(fallback.c_str());
}

}  // namespace
