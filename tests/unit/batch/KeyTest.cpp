#include <pthread.h>

#include <array>
#include <functional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "batch/CmdParser.h"
#include "tests/unit/batch/BatchTest.h"

namespace {

using testsupport::writeFile;

/// Runs a function on a stack that can be looked at afterwards.
class StackUse {
 public:
  explicit StackUse(std::function<void()> function) : function_(std::move(function)) {
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setstack(&attributes, stack_.data(), stack_.size() * sizeof(Page));
    pthread_t thread{};
    started_ = pthread_create(&thread, &attributes, run, this) == 0;
    if (started_) pthread_join(thread, nullptr);
    pthread_attr_destroy(&attributes);
  }

  bool started() const { return started_; }
  bool left(std::string_view text) const {
    const std::string_view bytes(stack_.front().data(), stack_.size() * sizeof(Page));
    return bytes.find(text) != std::string_view::npos;
  }

 private:
  struct alignas(4096) Page : std::array<char, 4096> {};

  static void* run(void* self) {
    // What ends the thread uses the stack from the top again: the function stays out of its way.
    std::array<volatile char, 65536> distance;
    distance.front() = 0;
    static_cast<StackUse*>(self)->function_();
    return nullptr;
  }

  std::function<void()> function_;
  std::vector<Page> stack_{512};
  bool started_ = false;
};

/// Where the keys of device-key lines may stay behind: in the line that the session has read.
class KeyTest : public BatchTest {
 protected:
  const std::string key_ = "00112233445566778899aabbccddeeff";
  const std::string line_ = "programEFuse -p 1 -key " + key_ + "\n";
};

TEST_F(KeyTest, AnOrdinaryLineStaysOnTheStack) {
  writeFile("session.cmd", "setEnv -env TESSEL_TEST_VARIABLE -bad " + key_ + "\n");
  CmdParser session;
  session.setMsgWrite(false);
  const StackUse use([&session] { session.runCommandFile("session.cmd"); });
  ASSERT_TRUE(use.started());
  EXPECT_TRUE(use.left(key_)) << "the tests below could not fail";
}

TEST_F(KeyTest, AFileRunLeavesNoneBehind) {
  writeFile("session.cmd", line_);
  CmdParser session;
  session.setMsgWrite(false);
  const StackUse use([&session] { session.runCommandFile("session.cmd"); });
  ASSERT_TRUE(use.started());
  EXPECT_FALSE(use.left(key_));
}

TEST_F(KeyTest, AConsoleRunLeavesNoneBehind) {
  const testsupport::StandardInput input(line_ + "quit\n");
  testsupport::StandardOutputCapture output;
  CmdParser session;
  const StackUse use([&session] { session.runCommandLine(); });
  EXPECT_EQ(output.text(), ">>");
  ASSERT_TRUE(use.started());
  EXPECT_FALSE(use.left(key_));
}

}  // namespace
