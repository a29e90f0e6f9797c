#pragma once

#include <string>
#include <vector>

/// A file of many equal lines for a program to run.
struct Workload {
  std::string name;
  std::string program;
  std::vector<std::string> arguments;  ///< before the file's name
  std::string file;
  std::string before;  ///< the file's first lines
  std::string line;
  std::string after;  ///< its last lines
  long repeats = 0;   ///< how often `line` stands in the file
  long lines = 0;     ///< how many lines are carried out; more than `repeats` in a loop
};

/// What tessel is measured with: `lines` lines of each kind, in files and in repeat loops.
std::vector<Workload> tesselWorkloads(long lines);

/// The cheapest command of the JTAG shells that are installed.
std::vector<Workload> peerWorkloads(long lines);

/// Writes the workload's file; the words that run it.
std::vector<std::string> prepare(const Workload& workload);
