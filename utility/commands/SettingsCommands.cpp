#include "utility/CommandTable.h"

namespace CommandTable {
namespace {

constexpr Switch targetSwitches[] = {
    position("-position", "the device's place on the chain, from 1"),
    position("-p", "the same"),
    flag("-attached", "the flash behind the device is meant"),
};
constexpr Switch preferenceSwitches[] = {text("-pref", "name:value", "the preference and its new value")};
constexpr Switch setEnvSwitches[] = {
    text("-env", "name", "the environment variable"),
    text("-value", "text", "its new value"),
};
constexpr Switch unsetEnvSwitches[] = {text("-env", "name", "the environment variable")};

constexpr Command rows[] = {
    {"setMode",
     0,
     "Chooses what kind of work follows.",
     {},
     {},
     "setMode -bscan",
     Switches::anyName,
     "Modes: -bs or -bscan (boundary scan), -ss or -sserial (slave serial), -sm or -smap (parallel configuration\n"
     "port), -bsfile (boundary-scan file), -hw520 or -dtconfig (desktop configuration), -spi (SPI flash), -cf,\n"
     "-compactflash or -obacf (SystemOBA CF), -mpm or -obampm (SystemOBA MPM), -pff or -promfile (PROM file\n"
     "formatter).\n"},
    {"setsubMode",
     0,
     "Chooses the layout inside the SystemOBA MPM or PROM file formatter mode.",
     {},
     {},
     "setsubMode -pffserial",
     Switches::anyName,
     "In MPM mode: -mpmss, -mpmsm. In PROM file formatter mode: -pffserial, -pffparallel, -pffversion, -pffspi,\n"
     "-pffbpi, -pffmbspi, -pffmbbpi.\n"},
    {"setTargetDevice",
     0,
     "Names the device that operations with -target work on.",
     {},
     targetSwitches,
     "setTargetDevice -position 1"},
    {"setPreference",
     0,
     "Sets a preference.",
     {},
     preferenceSwitches,
     "setPreference -pref lineWidth:100",
     Switches::listed,
     "Preferences: lineWidth (columns at which messages wrap, 0 for never), recordSteps (true or false: steps go\n"
     "into the batch-command file), cableLockTries (how often a busy cable is tried).\n"},
    {"setMbBpiDevice",
     0,
     "Names the BPI flash of a multiboot PROM file.",
     {},
     {},
     "setMbBpiDevice -device 28F256",
     Switches::anyNameWithWord,
     "The argument of its switch is the device; the switch's own name is free.\n"},
    {"setMbBpiType",
     0,
     "Sets the kind of a multiboot BPI layout.",
     {},
     {},
     "setMbBpiType -type up",
     Switches::anyNameWithWord,
     "The argument of its switch is the kind; the switch's own name is free.\n"},
    {"SetMbBpiChain",
     0,
     "Sets the chain of a multiboot BPI layout.",
     {},
     {},
     "SetMbBpiChain -serial",
     Switches::anyNameWithWord,
     "The name of its switch, without the -, is the chain.\n"},
    {"SetBpiWidth",
     0,
     "Sets the data width of BPI flash.",
     {},
     {},
     "SetBpiWidth -width 16",
     Switches::anyNameWithWord,
     "The argument of its switch is the width; the switch's own name is free.\n"},
    {"setEnv", 0, "Sets an environment variable.", {}, setEnvSwitches, "setEnv -env LAB_BENCH -value 7"},
    {"unsetEnv", 0, "Removes an environment variable.", {}, unsetEnvSwitches, "unsetEnv -env LAB_BENCH"},
};

}  // namespace

const std::span<const Command> settingsCommands = rows;

}  // namespace CommandTable
