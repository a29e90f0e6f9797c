#include <gtest/gtest.h>

#include "batch/Messages.h"

namespace {

TEST(Messages, CarryTheirSourceAndTheLineThatIssuesThem) {
  const Messages::Format format("text");
  constexpr int line = __LINE__ - 1;
  const Port_MsgManData message = format.message();
  EXPECT_STREQ(message.sourceFile(), "../s/CmdParser");
  EXPECT_STREQ(message.revision(), "$Revision: 1.27.14.1 $");
  EXPECT_EQ(message.line(), line);
}

}  // namespace
