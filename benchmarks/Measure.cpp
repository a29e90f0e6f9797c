#include "benchmarks/Measure.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <cstdlib>
#include <sstream>

extern char** environ;

Run runOnce(const std::vector<std::string>& words) {
  std::vector<std::string> copies = words;
  std::vector<char*> arguments;
  for (std::string& word : copies) arguments.push_back(word.data());
  arguments.push_back(nullptr);

  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
  posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
  posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, "/dev/null", O_WRONLY, 0);
  pid_t process = 0;
  const auto start = std::chrono::steady_clock::now();
  const bool started = ::posix_spawnp(&process, arguments[0], &actions, nullptr, arguments.data(), environ) == 0;
  posix_spawn_file_actions_destroy(&actions);
  if (!started) return {};

  int status = 0;
  rusage usage{};
  ::wait4(process, &status, 0, &usage);
  const std::chrono::duration<double> elapsed = std::chrono::steady_clock::now() - start;
  return {elapsed.count(), usage.ru_maxrss, WIFEXITED(status) && WEXITSTATUS(status) == 0};
}

std::vector<Run> fastestOf(int rounds, const std::vector<std::vector<std::string>>& programs) {
  std::vector<Run> fastest(programs.size());
  for (int round = 0; round < rounds; ++round)
    for (std::size_t i = 0; i < programs.size(); ++i) {
      const Run run = runOnce(programs[i]);
      if (round == 0 || run.seconds < fastest[i].seconds) fastest[i] = run;
    }
  return fastest;
}

bool isInstalled(const std::string& program) {
  const char* path = std::getenv("PATH");
  std::istringstream folders(path == nullptr ? "" : path);
  for (std::string folder; std::getline(folders, folder, ':');)
    if (::access((folder + "/" + program).c_str(), X_OK) == 0) return true;
  return false;
}
