#include "benchmarks/Workloads.h"

#include <fstream>

#include "benchmarks/Measure.h"

namespace {

Workload inFile(const std::string& name, const std::string& line, long lines) {
  return {name, TESSEL_PROGRAM, {"--no-log"}, "lines.cmd", "", line, "quit\n", lines, lines};
}

Workload inLoop(const std::string& name, const std::string& line, long lines) {
  const std::string start = "repeatStart -loop " + std::to_string(lines) + "\n";
  return {name + " (loop)", TESSEL_PROGRAM, {"--no-log"}, "loop.cmd", start, line, "repeatEnd\nquit\n", 1, lines};
}

}  // namespace

std::vector<Workload> tesselWorkloads(long lines) {
  struct Command {
    const char* name;
    const char* line;
  };
  static constexpr Command commands[] = {{"setTargetDevice", "setTargetDevice -p 1"},
                                         {"setEnv", "setEnv -env A -value 1"}};
  std::vector<Workload> workloads;
  for (const Command& command : commands) workloads.push_back(inFile(command.name, command.line, lines));
  workloads.push_back(inFile("blank line", "", lines));
  workloads.push_back(inFile("comment", "# a comment of usual length", lines));
  for (const Command& command : commands) workloads.push_back(inLoop(command.name, command.line, lines));
  return workloads;
}

std::vector<Workload> peerWorkloads(long lines) {
  const Workload all[] = {
      {"UrJTAG: debug normal", "jtag", {"-q", "-n"}, "peer.jtag", "", "debug normal", "quit\n", lines, lines},
      {"OpenOCD: set a 1", "openocd", {"-d0", "-f"}, "peer.cfg", "", "set a 1", "shutdown\n", lines, lines},
  };
  std::vector<Workload> installed;
  for (const Workload& workload : all)
    if (isInstalled(workload.program)) installed.push_back(workload);
  return installed;
}

std::vector<std::string> prepare(const Workload& workload) {
  std::ofstream file(workload.file);
  file << workload.before;
  for (long i = 0; i < workload.repeats; ++i) file << workload.line << '\n';
  file << workload.after;
  std::vector<std::string> words = {workload.program};
  words.insert(words.end(), workload.arguments.begin(), workload.arguments.end());
  words.push_back(workload.file);
  return words;
}
