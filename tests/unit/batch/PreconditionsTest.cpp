// The precondition that no command asks for; the others are seen through the commands.

#include "tests/unit/batch/BatchTest.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::error;

class PreconditionsTest : public BatchTest {
 protected:
  CmdParser session_;
};

TEST_F(PreconditionsTest, AFailedIdentifyAsksForTheUnknownDevices) {
  EXPECT_TRUE(session_.checkIdentify());
  EXPECT_THAT(messages_.take(), IsEmpty());
  session_.lastIdentifyOk = false;
  EXPECT_FALSE(session_.checkIdentify());
  EXPECT_THAT(messages_.all(),
              ElementsAre(error("Use defineDevice to describe unknown devices on the boundary-scan chain\n")));
}

}  // namespace
