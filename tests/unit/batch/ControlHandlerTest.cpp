#include <pthread.h>

#include <cstddef>
#include <cstdlib>
#include <vector>

#include "batch/CmdParser.h"
#include "tests/unit/batch/BatchTest.h"

namespace {

using testsupport::status;

/// What is started at most once a process is looked at in a process that has not started it.
class ControlHandlerDeathTest : public BatchTest {
 protected:
  ControlHandlerDeathTest() { GTEST_FLAG_SET(death_test_style, "threadsafe"); }
};

void setThreadStackSize(std::size_t size) {
  pthread_attr_t attributes;
  pthread_attr_init(&attributes);
  pthread_attr_setstacksize(&attributes, size);
  pthread_setattr_default_np(&attributes);
  pthread_attr_destroy(&attributes);
}

/// Constructs a session while the process can start no thread, and ends the process: with 0 when the session says
/// once that it listens to no control events, and carries out a line all the same.
[[noreturn]] void runWithoutControlHandler(testsupport::RecordedMessages& messages) {
  constexpr std::size_t moreThanThereIs = std::size_t{1} << 60;
  constexpr std::size_t enough = std::size_t{8} << 20;
  setThreadStackSize(moreThanThereIs);
  CmdParser session;
  setThreadStackSize(enough);
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
