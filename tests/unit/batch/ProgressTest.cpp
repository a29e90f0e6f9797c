#include "batch/operations/Progress.h"
#include "interfaces/utility/Callback.h"
#include "tests/unit/batch/BatchTest.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::status;

class ProgressTest : public BatchTest {
 protected:
  ~ProgressTest() override { EXPECT_FALSE(stopped_); }

  /// The callback always answers false.
  void report(std::int32_t event, std::int32_t current, std::int32_t total) {
    Callback progress(event, current, total);
    stopped_ = progressCallback(progress) || stopped_;
  }

 private:
  bool stopped_ = false;
};

struct Row {
  std::int32_t current;
  std::int32_t total;
  int percent;
};

TEST_F(ProgressTest, AnUpdateIsAPercentageThatOverwritesItself) {
  constexpr std::int32_t largest = 2147483647;
  constexpr Row rows[] = {{1, 100, 1},
                          {50, 100, 50},
                          {99, 1000, 9},
                          {100, 100, 100},
                          {200, 100, 200},
                          {-5, 100, -5},
                          {5, -100, -5},
                          {21474836, 100, 21474836},
                          {21474837, 1, -2147483596},
                          {largest, 1, -100},
                          {7, -1, -700},
                          {-1, -1, 100}};
  for (const Row& row : rows) {
    testsupport::StandardOutputCapture output;
    report(Callback::update, row.current, row.total);
    EXPECT_EQ(output.text(), "");
    EXPECT_THAT(messages_.take(), ElementsAre(status(" " + std::to_string(row.percent) + "%\r\f")))
        << row.current << " of " << row.total;
  }
}

TEST_F(ProgressTest, NothingDoneYetBeginsALine) {
  constexpr Row rows[] = {{0, 100, 0}, {1, 101, 0}, {0, 0, 0}, {5, 0, 0}, {0, -1, 0}};
  for (const Row& row : rows) {
    testsupport::StandardOutputCapture output;
    report(Callback::update, row.current, row.total);
    EXPECT_EQ(output.text(), "\n");
    EXPECT_THAT(messages_.take(), ElementsAre(status(" 0%\r\f")));
  }
}

TEST_F(ProgressTest, StartAndEndAreTraces) {
  report(Callback::start, 0, 0);
  report(Callback::end, 0, 0);
  EXPECT_THAT(messages_.all(), ElementsAre(testsupport::debug("PROGRESS_START - Starting Operation.\n"),
                                           testsupport::debug("PROGRESS_END - End Operation.\n")));
}

TEST_F(ProgressTest, OtherEventsAreSilent) {
  for (const std::int32_t event : {-1, 3, 100}) report(event, 1, 2);
  EXPECT_THAT(messages_.all(), IsEmpty());
}

}  // namespace
