#include <gtest/gtest.h>
#include <sys/resource.h>

#include <array>
#include <string>

#include "interfaces/portability/Secret.h"
#include "tests/unit/support/ChildProcess.h"

namespace {

using Port::Secret;

TEST(Secret, IsAnnouncedByTheKeySwitch) {
  for (const char* word : {"-key", "-KEY", "-Key", "-kEy"}) EXPECT_TRUE(Secret::announces(word)) << word;
  for (const char* word : {"", "-", "-k", "-ke", "key", "-keys", "-kez", "--key", "-key ", "+key", "-e", "\"-key\""})
    EXPECT_FALSE(Secret::announces(word)) << word;
}

TEST(Secret, WipeLeavesZerosAndNothingElse) {
  std::array<unsigned char, 8> memory{1, 2, 3, 4, 5, 6, 7, 8};
  Secret::wipe(memory.data(), 0);
  EXPECT_EQ(memory, (std::array<unsigned char, 8>{1, 2, 3, 4, 5, 6, 7, 8}));
  Secret::wipe(memory.data() + 1, 5);
  EXPECT_EQ(memory, (std::array<unsigned char, 8>{1, 0, 0, 0, 0, 0, 7, 8}));
}

TEST(Secret, CoreDumpsCanBeForbidden) {
  testsupport::ChildProcess child([] {
    rlimit limit{};
    ::getrlimit(RLIMIT_CORE, &limit);
    limit.rlim_cur = limit.rlim_max;
    ::setrlimit(RLIMIT_CORE, &limit);
    Secret::forbidCoreDump();
    ::getrlimit(RLIMIT_CORE, &limit);
    return limit.rlim_cur == 0 && limit.rlim_max == 0 ? 0 : 1;
  });
  EXPECT_EQ(child.wait(), "exit 0");
}

}  // namespace
