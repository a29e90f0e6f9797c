#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <memory>

#include "manager/manager/CableLock.h"
#include "tests/unit/support/ChildProcess.h"
#include "tests/unit/support/Files.h"
#include "tests/unit/support/RecordedMessages.h"
#include "tests/unit/support/ScopedVariable.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::ChildProcess;
using testsupport::exists;
using testsupport::readFile;
using testsupport::RecordedMessages;
using testsupport::writeFile;

class CableLockTest : public testing::Test {
 protected:
  /// A process that holds the lock until the end of its input, and then gives it back or dies with it.
  std::unique_ptr<ChildProcess> holder(bool givesBack) const {
    auto child = std::make_unique<ChildProcess>([this, givesBack] {
      CableLock lock(path_);
      std::puts(lock.lock(1) ? "held" : "refused");
      std::fflush(stdout);
      while (std::getchar() != EOF) continue;
      if (!givesBack) ::_exit(0);
      return lock.unlock() ? 0 : 1;
    });
    EXPECT_EQ(child->readLine(), "held");
    return child;
  }
  /// Leaves a lock behind; gives the id of the process that did so.
  int leaveStaleLock() const {
    const auto child = holder(false);
    const int id = child->id();
    EXPECT_EQ(child->wait(), "exit 0");
    return id;
  }

  std::string inUse(int process) const {
    return "The cable is in use by process " + std::to_string(process) + " (lock file " + path_ + ").\n";
  }
  std::string left(int process) const {
    return "The cable lock " + path_ + " was left by process " + std::to_string(process) +
           ", which has ended. Use cleanCableLock to remove it.\n";
  }

  testsupport::TemporaryDirectory directory_;
  RecordedMessages messages_;
  std::string path_ = directory_.file("cable.lock");
};

TEST_F(CableLockTest, IsTakenAndGivenBack) {
  CableLock lock(path_);
  EXPECT_EQ(lock.path(), path_);
  EXPECT_FALSE(lock.held());
  EXPECT_FALSE(exists(path_));
  EXPECT_TRUE(lock.lock(1));
  EXPECT_TRUE(lock.held());
  EXPECT_TRUE(exists(path_));
  EXPECT_TRUE(lock.lock(1));
  EXPECT_TRUE(lock.unlock());
  EXPECT_FALSE(lock.held());
  EXPECT_FALSE(exists(path_));
  EXPECT_TRUE(lock.unlock());
  EXPECT_TRUE(lock.lock(1));
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(CableLockTest, IsGivenBackAtTheEnd) {
  { EXPECT_TRUE(CableLock(path_).lock(1)); }
  EXPECT_FALSE(exists(path_));
}

TEST_F(CableLockTest, AnotherProcessHoldsIt) {
  const auto other = holder(true);
  CableLock lock(path_);
  EXPECT_FALSE(lock.lock(1));
  EXPECT_FALSE(lock.held());
  EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error(inUse(other->id()))));
  EXPECT_TRUE(lock.unlock());
  EXPECT_TRUE(exists(path_)) << "the other one's lock must stay";
  EXPECT_EQ(other->wait(), "exit 0");
  EXPECT_TRUE(lock.lock(1));
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(CableLockTest, NoTriesCountAsOne) {
  CableLock lock(path_);
  EXPECT_TRUE(lock.lock(0));
  EXPECT_TRUE(lock.unlock());
  EXPECT_TRUE(lock.lock(-5));
}

TEST_F(CableLockTest, WaitsForABusyCable) {
  const auto other = holder(true);
  CableLock lock(path_);
  const auto start = std::chrono::steady_clock::now();
  EXPECT_FALSE(lock.lock(3));
  EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(200));
  EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error(inUse(other->id()))));
  other->closeInput();
  EXPECT_TRUE(lock.lock(100));
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(CableLockTest, TheLockOfADeadProcessStaysUntilItIsCleaned) {
  const int dead = leaveStaleLock();
  CableLock lock(path_);
  const auto start = std::chrono::steady_clock::now();
  EXPECT_FALSE(lock.lock(100)) << "to wait for a dead process is no use";
  EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(5));
  EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error(left(dead))));
  EXPECT_TRUE(lock.clean());
  EXPECT_FALSE(exists(path_));
  EXPECT_TRUE(lock.lock(1));
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(CableLockTest, AnotherProcessWithTheSameIdDoesNotHoldIt) {
  {
    CableLock probe(path_);
    ASSERT_TRUE(probe.lock(1));
    if (readFile(path_) == std::to_string(::getpid()) + " \n") GTEST_SKIP() << "this system does not tell start times";
  }
  writeFile(path_, std::to_string(::getpid()) + " 1\n");
  CableLock lock(path_);
  EXPECT_FALSE(lock.lock(1));
  EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error(left(::getpid()))));
  EXPECT_TRUE(lock.clean());
  EXPECT_FALSE(exists(path_));
}

TEST_F(CableLockTest, AFileWithTheIdAloneCounts) {
  const auto other = holder(true);
  const std::string alone = std::to_string(other->id()) + "\n";
  writeFile(path_, alone);
  CableLock lock(path_);
  EXPECT_FALSE(lock.lock(1));
  EXPECT_FALSE(lock.clean());
  EXPECT_THAT(messages_.take(),
              ElementsAre(testsupport::error(inUse(other->id())), testsupport::error(inUse(other->id()))));
  EXPECT_EQ(readFile(path_), alone);
}

TEST_F(CableLockTest, AFileThatNamesNoProcessIsStale) {
  writeFile(path_, "busy\n");
  CableLock lock(path_);
  EXPECT_FALSE(lock.lock(1));
  EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error("Cable lock " + path_ +
                                                               " can't be taken: it exists and names no process.\n")));
  EXPECT_TRUE(lock.clean());
  EXPECT_FALSE(exists(path_));
}

TEST_F(CableLockTest, WhereNoFileCanBeMadeThereIsNoLock) {
  CableLock lock(directory_.file("missing/cable.lock"));
  EXPECT_FALSE(lock.lock(5));
  EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error("Cable lock " + lock.path() +
                                                               " can't be taken: No such file or directory.\n")));
  EXPECT_TRUE(lock.clean());
}

TEST_F(CableLockTest, CleanRefusesALiveLock) {
  const auto other = holder(true);
  const std::string content = readFile(path_);
  CableLock lock(path_);
  EXPECT_FALSE(lock.clean());
  EXPECT_THAT(messages_.take(), ElementsAre(testsupport::error(inUse(other->id()))));
  EXPECT_EQ(readFile(path_), content);
}

TEST_F(CableLockTest, CleanOfNoLockAndOfTheSessionsOwnSucceeds) {
  CableLock lock(path_);
  EXPECT_TRUE(lock.clean());
  EXPECT_TRUE(lock.lock(1));
  EXPECT_TRUE(lock.clean());
  EXPECT_TRUE(lock.held());
  EXPECT_TRUE(exists(path_));
  EXPECT_THAT(messages_.all(), IsEmpty());
}

TEST_F(CableLockTest, ALockFileThatWasTakenAwayIsTold) {
  CableLock lock(path_);
  EXPECT_TRUE(lock.lock(1));
  ::unlink(path_.c_str());
  EXPECT_FALSE(lock.unlock());
  EXPECT_FALSE(lock.held());
  EXPECT_THAT(messages_.all(), ElementsAre(testsupport::error("Cable lock " + path_ + " can't be removed.\n")));
}

TEST_F(CableLockTest, StandsInTheUsersRuntimeDirectory) {
  const testsupport::ScopedVariable runtime("XDG_RUNTIME_DIR", directory_.path().c_str());
  EXPECT_EQ(CableLock().path(), directory_.file("tessel/cable.lock"));
}

}  // namespace
