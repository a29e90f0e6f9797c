#include <CLI/CLI.hpp>
#include <csignal>
#include <cstdio>
#include <string>

#include "batch/CmdParser.h"
#include "interfaces/utility/TesselCmdargs.h"

namespace {

enum ExitCode { succeeded = 0, failed = 1, wrongUsage = 2 };

void printWords() {
  for (const StringBase& word : TesselCmdargs::findAllCommands()) std::printf("%s\n", word.c_str());
}

/// `file` is null for the console.
int run(const char* file, bool log) {
  CmdParser session;
  session.setMsgWrite(log);
  const bool result = file == nullptr ? session.runCommandLine() : session.runCommandFile(file);
  return result ? succeeded : failed;
}

}  // namespace

int main(int argc, char** argv) {
#if defined(SIGPIPE)
  // Whoever reads the messages may go away; a running device operation must not be cut off for it.
  std::signal(SIGPIPE, SIG_IGN);
#endif
  CLI::App app("Batch command interpreter for JTAG chains of programmable-logic devices.", "tessel");
  app.footer("Type help at the prompt for the commands.");
  std::string file;
  bool noLog = false;
  bool words = false;
  const CLI::Option* fileOption = app.add_option(
      "FILE", file, "Command file to run, - for standard input; without it commands come from the prompt");
  app.add_flag("--no-log", noLog, "Keep no batch log (_tesselbatch.log)");
  app.add_flag("--words", words, "Print the command words and leave");
  app.set_version_flag("--version", "tessel " TESSEL_VERSION);
  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    return app.exit(error) == 0 ? succeeded : wrongUsage;
  }
  if (words) {
    printWords();
    return succeeded;
  }
  return run(fileOption->count() > 0 ? file.c_str() : nullptr, !noLog);
}
