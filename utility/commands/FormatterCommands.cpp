#include "utility/CommandTable.h"

namespace CommandTable {
namespace {

constexpr Switch nameSwitch[] = {text("-name", "name", "the collection, or the output file")};
constexpr Switch renameSwitch[] = {{"-name", Kind::text, 2, 2, "old new", "the collection's name and its new one"}};
constexpr Switch currentCollectionSwitch[] = {optionalText("-collection", "name", "the collection")};
constexpr Switch addDesignSwitches[] = {
    number("-version", "n", "the design's number"),
    number("-v", "n", "the same"),
    text("-name", "text", "its name, or its start address in PROM file formatter mode"),
    text("-designname", "text", "the same"),
    text("-startaddress", "text", "the same"),
    optionalText("-data", "text", "it holds data"),
    text("-rs", "text", "the value of the RS pins"),
    flag("-d", "its addresses count down (PROM file formatter mode)"),
    flag("-down", "the same"),
    optionalText("-c", "name", "the collection to add it to"),
    optionalText("-collection", "name", "the same"),
};
constexpr Switch deleteDesignSwitches[] = {
    number("-version", "n", "the design's number"),
    optionalText("-c", "name", "its collection"),
    optionalText("-collection", "name", "the same"),
};
constexpr Switch versionSwitch[] = {number("-version", "n", "the design's number")};
constexpr Switch addChainSwitches[] = {
    optionalText("-c", "name", "the collection"), optionalText("-collection", "name", "the same"),
    number("-d", "n", "the design's number"),     number("-design", "n", "the same"),
    number("-index", "n", "the chain's index"),   number("-cspin", "n", "the same"),
};
constexpr Switch deleteChainSwitches[] = {
    number("-index", "n", "the chain's index"),
    number("-version", "n", "its design's number"),
    optionalText("-collection", "name", "its collection"),
};
constexpr Switch indexSwitch[] = {number("-index", "n", "the chain's index")};
constexpr Switch configDeviceSwitches[] = {
    text("-mode", "keyword", "the mode it is for, in place of the current one"),
    number("-size", "n", "its size; not in PROM file formatter mode"),
    text("-path", "path", "the directory of its files"),
    text("-name", "name", "its name"),
};
constexpr Switch promPosition[] = {
    position("-p", "the PROM's place, from 1"),
    position("-position", "the same"),
};
constexpr Switch promSwitches[] = {
    number("-size", "n", "its size in kilobytes (parallel layouts)"),
    text("-name", "part", "its part name (serial layouts)"),
};
constexpr Switch generateSwitches[] = {
    text("-active", "name", "the active collection; the current one when left out (SystemOBA CF mode)"),
    text("-output", "path", "the output file"),
    text("-path", "path", "the output directory"),
    flag("-compressed", "compress the data (SystemOBA MPM mode)"),
    text("-format", "format", "the output file's format"),
    text("-fillvalue", "byte", "what unused bytes hold"),
    text("-swap", "onoff", "reverse the bits of each byte"),
    text("-file", "path", "the file to write"),
    flag("-image", "write the whole image"),
    flag("-report", "write a report beside it"),
};
constexpr Switch pdrSwitches[] = {text("-file", "path", "the PDR file")};

constexpr Command rows[] = {
    {"addCollection", 0, "Adds a collection, or names the output file.", {}, nameSwitch, "addCollection -name out1"},
    {"deleteCollection", 0, "Deletes a collection.", {}, nameSwitch, "deleteCollection -name out1"},
    {"renameCollection",
     0,
     "Renames a collection (SystemOBA CF mode).",
     {},
     renameSwitch,
     "renameCollection -name old new"},
    {"setCurrentCollection",
     0,
     "Selects a collection.",
     {},
     currentCollectionSwitch,
     "setCurrentCollection -collection out1"},
    {"addDesign", 0, "Adds a design.", {}, addDesignSwitches, "addDesign -version 0 -name rev0"},
    {"deleteDesign", 0, "Deletes a design.", {}, deleteDesignSwitches, "deleteDesign -version 0"},
    {"setCurrentDesign", 0, "Selects a design.", {}, versionSwitch, "setCurrentDesign -version 0"},
    {"addDeviceChain", 0, "Adds a device chain to a design.", {}, addChainSwitches, "addDeviceChain -index 0"},
    {"deleteDeviceChain", 0, "Deletes a device chain.", {}, deleteChainSwitches, "deleteDeviceChain -index 0"},
    {"setCurrentDeviceChain", 0, "Selects a device chain.", {}, indexSwitch, "setCurrentDeviceChain -index 0"},
    {"addConfigDevice",
     0,
     "Adds the device that the output is for.",
     {},
     configDeviceSwitches,
     "addConfigDevice -size 128 -name card"},
    {"deleteConfigDevice", 0, "Removes the device that the output is for.", {}, {}, "deleteConfigDevice"},
    {"addPromDevice", 0, "Adds a PROM to the PROM chain (PROM file formatter mode).", promPosition, promSwitches,
     "addPromDevice -p 1 -name zp18v01"},
    {"deletePromDevice", 0, "Removes a PROM from the PROM chain.", promPosition, {}, "deletePromDevice -p 1"},
    {"generate", 0, "Writes the output files.", {}, generateSwitches, "generate -format mcs -output out.mcs"},
    {"loadPdr", 0, "Rebuilds PROM file formatter content from a PDR file.", {}, pdrSwitches, "loadPdr -file board.pdr"},
};

}  // namespace

const std::span<const Command> formatterCommands = rows;

}  // namespace CommandTable
