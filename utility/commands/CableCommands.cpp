#include "utility/CommandTable.h"

namespace CommandTable {
namespace {

constexpr Switch cableSwitches[] = {
    text("-p", "port", "the port word (see below)"),
    text("-port", "port", "the same"),
    text("-b", "baud", "bits per second, or auto"),
    text("-baud", "baud", "the same"),
    text("-server", "host", "the host that has the cable"),
    text("-file", "path", "the file that a file cable (svf, csvf, stapl) writes"),
};
constexpr Switch speedSwitches[] = {number("-speed", "n", "the clock's speed")};
constexpr Switch optionSwitches[] = {
    text("-option", "name", "the option"),
    text("-value", "text", "its new value"),
};

constexpr Command rows[] = {
    {"setCable",
     0,
     "Opens a cable and takes its lock.",
     {},
     cableSwitches,
     "setCable -port usb1",
     Switches::listed,
     "Port words: com1.., ttyS0.., ttya, lpt1.., parport0.., usb1.., usb21.., auto, null, and svf, csvf or stapl\n"
     "with -file. Numbers after -p are ports here, not positions.\n"},
    {"setCableSpeed", 0, "Sets the speed of the cable's clock.", {}, speedSwitches, "setCableSpeed -speed 6000000"},
    {"setCableOption",
     0,
     "Sets an option of the cable.",
     {},
     optionSwitches,
     "setCableOption -option clean_cable_lock -value true"},
    {"runCableDiagnostics", 0, "Tests the cable.", {}, {}, "runCableDiagnostics"},
    {"lockcable", 0, "Takes the cable's lock.", {}, {}, "lockcable"},
    {"unlockcable", 0, "Gives the cable's lock back.", {}, {}, "unlockcable"},
    {"closeCable", 0, "Gives the lock back and closes the cable.", {}, {}, "closeCable"},
    {"cleanCableLock", 0, "Removes a lock that a session left behind when it died.", {}, {}, "cleanCableLock"},
};

}  // namespace

const std::span<const Command> cableCommands = rows;

}  // namespace CommandTable
