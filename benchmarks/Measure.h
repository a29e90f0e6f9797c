#pragma once

#include <string>
#include <vector>

/// One run of a program: wall-clock seconds, and the most memory it had in use, in KiB.
struct Run {
  double seconds = 0;
  long memory = 0;
  bool ok = false;  ///< it ended with exit code 0
};

/// Runs a program in the current directory with its standard streams on /dev/null. `words` begins with the
/// program, which is looked up in the PATH.
Run runOnce(const std::vector<std::string>& words);

/// The fastest of several runs of each of some programs, run in turn so that all meet the same noise.
std::vector<Run> fastestOf(int rounds, const std::vector<std::vector<std::string>>& programs);

/// Whether a program of that name is in the PATH.
bool isInstalled(const std::string& program);
