// A program that runs a command file inside itself and lists what went wrong at the end:
//   embed FILE
// The session shows nothing; what it reports goes to a message manager of this program.

#include <cstdio>
#include <string>
#include <vector>

#include "batch/CmdParser.h"
#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/Port_MsgManDefault.h"
#include "interfaces/portability/UT_STR.h"

namespace {

/// Keeps errors and warnings and drops the rest.
class ProblemList : public Port_MsgManDefault {
 public:
  ProblemList() : Port_MsgManDefault("problems") {}

  void msgWrite(MsgType type, const wchar_t* text) override {
    if (type == MsgType::error || type == MsgType::warning) problems_.push_back(UT_STR::WstrToMbstr(text));
  }

  const std::vector<std::string>& problems() const { return problems_; }

 private:
  std::vector<std::string> problems_;
};

}  // namespace

int main(int argc, char** argv) {
  if (argc != 2) {
    std::fprintf(stderr, "Usage: embed FILE\n");
    return 2;
  }
  ProblemList list;
  Port_MsgDispatcher::addMsgMan(&list);
  bool succeeded = false;
  {
    CmdParser session;
    session.setMsgWrite(false);  // no batch log
    // The file should end with quit: one that does not goes on at the prompt.
    succeeded = session.runCommandFile(argv[1]);
  }
  for (const std::string& problem : list.problems()) std::printf("problem: %s", problem.c_str());
  std::printf("%s\n", succeeded ? "went well" : "failed");
  return succeeded ? 0 : 1;
}
