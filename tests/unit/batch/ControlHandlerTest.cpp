#include <sys/resource.h>

#include <cstdlib>

#include "batch/CmdParser.h"
#include "tests/unit/batch/BatchTest.h"

namespace {

using testing::ElementsAre;
using testsupport::status;

/// What is started at most once a process is looked at in a process that has not started it.
class ControlHandlerDeathTest : public BatchTest {
 protected:
  ControlHandlerDeathTest() { GTEST_FLAG_SET(death_test_style, "threadsafe"); }
};

/// Constructs a session while the process may open nothing more, and ends the process: with 0 when the session says
/// once that it listens to no control events, and carries out a line all the same.
[[noreturn]] void runWithoutControlHandler(testsupport::RecordedMessages& messages) {
  rlimit files{};
  ::getrlimit(RLIMIT_NOFILE, &files);
  const rlimit none{0, files.rlim_max};
  ::setrlimit(RLIMIT_NOFILE, &none);
  CmdParser session;
  ::setrlimit(RLIMIT_NOFILE, &files);
  CommandSet line(1);
  line.addCommand("clearCmd");
  const bool usable = session.processLine(line);
  const bool reported = messages.take() == std::vector{status("Could not set control handler.\n")};
  std::_Exit(usable && reported ? 0 : 1);
}

TEST_F(ControlHandlerDeathTest, ASessionThatCantListenSaysSoAndGoesOn) {
  EXPECT_EXIT(runWithoutControlHandler(messages_), testing::ExitedWithCode(0), "");
}

}  // namespace
