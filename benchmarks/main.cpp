// Whole runs of the program, as a user would start it: lines a second, memory, start-up. Machines are noisy:
// compare figures of one run only.

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "benchmarks/Measure.h"
#include "benchmarks/Workloads.h"

namespace {

constexpr int rounds = 5;
constexpr int startRounds = 100;

/// An empty directory of its own, in which the programs run.
class Scratch {
 public:
  Scratch() {
    std::filesystem::create_directories(path_);
    std::filesystem::current_path(path_);
    ::setenv("XDG_RUNTIME_DIR", path_.c_str(), 1);
  }
  ~Scratch() {
    std::error_code ignored;
    std::filesystem::current_path("/", ignored);
    std::filesystem::remove_all(path_, ignored);
  }
  Scratch(const Scratch&) = delete;
  Scratch& operator=(const Scratch&) = delete;

 private:
  std::filesystem::path path_ =
      std::filesystem::temp_directory_path() / ("tessel-benchmark-" + std::to_string(::getpid()));
};

double linesPerSecond(const Workload& workload, const Run& run) {
  return static_cast<double>(workload.lines) / run.seconds;
}

/// The run, and one of ten times the lines.
void report(const Workload& workload, const Workload& tenfold) {
  const Run run = fastestOf(rounds, {prepare(workload)})[0];
  const Run longRun = fastestOf(2, {prepare(tenfold)})[0];
  std::printf("%-24s %7.2f million lines/s %8.1f MiB   10x the lines: %5.1fx the time, %7.1f MiB%s\n",
              workload.name.c_str(), linesPerSecond(workload, run) / 1e6, static_cast<double>(run.memory) / 1024,
              longRun.seconds / run.seconds, static_cast<double>(longRun.memory) / 1024,
              run.ok && longRun.ok ? "" : "   FAILED");
}

/// The cheapest commands of the installed peers beside ours, all in turn so that they meet the same noise.
void reportPeers(const Workload& ours, const std::vector<Workload>& peers) {
  std::vector<std::vector<std::string>> programs = {prepare(ours)};
  for (const Workload& peer : peers) programs.push_back(prepare(peer));
  const std::vector<Run> runs = fastestOf(2 * rounds, programs);
  const double own = linesPerSecond(ours, runs[0]);
  for (std::size_t i = 0; i < peers.size(); ++i) {
    const double rate = linesPerSecond(peers[i], runs[i + 1]);
    std::printf("%-24s %7.2f million lines/s; %s beside it %.2f, %.2f times as fast\n", peers[i].name.c_str(),
                rate / 1e6, ours.name.c_str(), own / 1e6, own / rate);
  }
}

void reportStart() {
  std::ofstream("quit.cmd") << "quit\n";
  const auto runs = fastestOf(startRounds, {{EMPTY_PROGRAM}, {TESSEL_PROGRAM, "--no-log", "quit.cmd"}});
  std::printf("start-up                 %7.2f ms, an empty C++ program %.2f ms, difference %.2f ms\n",
              runs[1].seconds * 1e3, runs[0].seconds * 1e3, (runs[1].seconds - runs[0].seconds) * 1e3);
}

}  // namespace

int main(int argc, char** argv) {
  const long lines = argc > 1 ? std::strtol(argv[1], nullptr, 10) : 1'000'000;
  if (lines < 1) {
    std::fprintf(stderr, "usage: tessel-benchmark [LINES]\n");
    return 2;
  }
  const Scratch scratch;
  const auto workloads = tesselWorkloads(lines);
  const auto tenfold = tesselWorkloads(10 * lines);
  for (std::size_t i = 0; i < workloads.size(); ++i) report(workloads[i], tenfold[i]);
  reportPeers(workloads[0], peerWorkloads(lines));
  reportStart();
  return 0;
}
