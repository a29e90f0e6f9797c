#include "utility/CommandTable.h"

namespace CommandTable {
namespace {

constexpr Switch repeatSwitches[] = {text("-loop", "count", "how often the commands up to repeatEnd run")};

constexpr Switch helpSwitches[] = {
    flag("-all", "list every command"),
    text("-m", "command", "tell how to use this command"),
    text("-c", "text", "list the commands whose word holds the text"),
    number("-head", "n", "list the first n commands"),
    number("-tail", "n", "list the last n commands"),
};

constexpr Command rows[] = {
    {"repeatStart",
     0,
     "Collects the commands up to repeatEnd and then runs them again and again.",
     {},
     repeatSwitches,
     "repeatStart -loop 3"},
    {"repeatEnd", 0, "Ends the commands of a repeat loop and runs it.", {}, {}, "repeatEnd"},
    {"quit", 0, "Ends the session.", {}, {}, "quit"},
    {"exit", 2, "Ends the session.", {}, {}, "exit"},
    {"help", 0, "Lists the commands, or tells how to use one.", {}, helpSwitches, "help -m setCable"},
    {"clearCmd", 0, "Empties the transcript of the commands read so far.", {}, {}, "clearCmd"},
    {"info", 2, "Reports the cable and the devices on the chain.", {}, {}, "info"},
};

}  // namespace

const std::span<const Command> sessionCommands = rows;

}  // namespace CommandTable
