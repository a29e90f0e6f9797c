// Handing operations over to those who carry them out.

#include "interfaces/portability/UT_CMDARGS.h"
#include "interfaces/portability/UT_STR.h"
#include "manager/manager/DeviceManager.h"
#include "manager/operations/Operations.h"
#include "manager/support/Report.h"

namespace {

/// The numbers of `getAttribute`.
constexpr int stateOfLastOperation = 2;

/// Whether a word may be written into the batch-command file: none with a key, and not the one that the interpreter
/// adds to each identify itself.
bool isRecorded(const UT_CMDARGS& args) {
  const auto is = [&args](const char* word) { return UT_STR::ICompare(args.getcmd(), word) == 0; };
  return !args.findsw("-key") && !is("programEFuse") && !is("identifyMPM");
}

/// The command line of an operation, positions from 1 again.
std::string lineOf(const UT_CMDARGS& args) {
  std::string line = args.getcmd();
  for (int i = 0; i < args.getnumsw(); ++i) {
    const UT_CMDSWINFO& each = *args.getsw(i);
    const std::string name = each.getswname();
    const bool positions =
        UT_STR::ICompare(name.c_str(), "-p") == 0 || UT_STR::ICompare(name.c_str(), "-position") == 0;
    line += " " + name;
    for (int j = 0; j < each.getnumargs(); ++j) {
      const std::string text = each.getargtxt(j);
      if (positions)
        line += " " + std::to_string(each.getargnum(j) + 1);
      else
        line += text.empty() || text.find_first_of(" \t") != std::string::npos ? " \"" + text + "\"" : " " + text;
    }
  }
  return line;
}

}  // namespace

int DeviceManager::multibootBpiWidth() const { return multiboot_.width == "8" ? 8 : 16; }

bool DeviceManager::performOperation(int count, const char* const* words) {
  if (count <= 0) return reportError("There is no operation without a word.\n");
  const UT_CMDARGS args(count, words);
  const std::string name = args.getcmd();
  if (!Operations::isBuilt(args.getcmd())) return reportError("%s is not built yet.\n", name);
  if (chain(name.c_str()) == nullptr) return false;
  // After identify its chain is searched for MPM parts; when it failed, that has been told.
  if (UT_STR::ICompare(args.getcmd(), "identifyMPM") == 0 && lastFailed_) return false;
  Cable* cable = openCable();
  const bool result = cable != nullptr && runOperation(*cable, args);
  lastFailed_ = !result;
  lastOperation_ = name + (result ? " succeeded" : " failed");
  return result;
}

bool DeviceManager::runOperation(Cable& cable, const UT_CMDARGS& args) {
  OperationContext context{.chain = chains_[activeMode_],
                           .cable = cable,
                           .parts = parts(),
                           .mode = activeMode_,
                           .progressCallback = progress_,
                           .multibootBpiWidth = multibootBpiWidth(),
                           .attachedTarget = target_.attached && args.findsw("-target")};
  bool linkLost = false;
  const bool result = Operations::run(context, args, linkLost);
  // The next operation opens the cable again.
  if (linkLost) disconnect();
  if (result && isRecorded(args)) recordStep(lineOf(args));
  return result;
}

const char* DeviceManager::getAttribute(int number) {
  return number == stateOfLastOperation ? lastOperation_.c_str() : "";
}
