#include "utility/CommandTable.h"

namespace CommandTable {
namespace {

constexpr Switch onePosition[] = {
    position("-p", "the device's place on the chain, from 1"),
    position("-position", "the same"),
};
constexpr Switch manyPositions[] = {
    positions("-p", "the devices' places on the chain, from 1"),
    positions("-position", "the same"),
};

/// A core number and its file; what is missing is the handler's affair.
constexpr Switch coreFile = {
    "-core", Kind::numberThenText, 0, 2, "number path", "a processor core and its .bit or .rbt file; may be repeated"};

constexpr Switch addDeviceSwitches[] = {
    text("-part", "part", "the device's part name"),
    text("-file", "path", "a BSDL, configuration-data or programming file"),
    text("-cs", "pin", "the CS pin; needed in parallel configuration-port mode"),
    text("-bmm", "path", "the block-memory map that goes with the file"),
    coreFile,
    texts("-elf", 0, "path", "software files for the block-memory map; may be repeated"),
    optionalText("-sprom", "part", "the PROM that an .mcs or .exo file is for"),
    optionalText("-spi", "part", "the SPI flash that an .mcs or .exo file is for"),
    optionalText("-fpga", "part", "the FPGA with flash inside that an .mcs or .exo file is for"),
    optionalText("-mpm", "part", "the MPM device that an .mpm file is for"),
};
constexpr Switch fileSwitches[] = {text("-file", "path", "the file")};
constexpr Switch attachSwitches[] = {
    text("-spi", "part", "an SPI flash of that part"),
    text("-bpi", "part", "a BPI flash of that part"),
    text("-file", "path", "the flash's file"),
};
constexpr Switch extraFileSwitches[] = {
    texts("-elf", 0, "path", "software files; may be repeated"),
    text("-file", "path", "a software file"),
    coreFile,
};
constexpr Switch clearFileSwitches[] = {
    {"-core", Kind::number, 0, anyNumber, "number", "only the files of these processor cores"},
};
constexpr Switch defineSwitches[] = {
    text("-ireg", "length", "the length of its instruction register, in bits"),
    text("-name", "name", "what to call it"),
};
constexpr Switch deleteSwitches[] = {
    flag("-all", "every device of the chain"),
    optionalText("-collection", "name", "the collection (CF, MPM and PROM file formatter modes)"),
    number("-version", "n", "the design (those modes)"),
    number("-index", "n", "the device chain; needed in those modes"),
};
constexpr Switch attributeSwitches[] = {
    text("-attr", "name", "the attribute"),
    text("-value", "text", "its new value"),
    flag("-attached", "the flash behind the device is meant"),
    flag("-configdevice", "of the output configuration device"),
    flag("-collection", "of the current collection"),
    flag("-design", "of the current design"),
};

constexpr Command rows[] = {
    {"addDevice", 0, "Adds a device to the chain, by part or by file.", onePosition, addDeviceSwitches,
     "addDevice -p 1 -file top.bit"},
    {"assignFile", 0, "Gives a device a file.", onePosition, fileSwitches, "assignFile -p 1 -file top.bit"},
    {"attachFlash", 0, "Puts a flash behind a device (boundary-scan mode).", onePosition, attachSwitches,
     "attachFlash -p 1 -spi W25Q128"},
    {"assignFileToAttachedFlash", 0, "Gives the flash behind a device a file.", onePosition, fileSwitches,
     "assignFileToAttachedFlash -p 1 -file flash.mcs"},
    {"deleteAttachedFlash", 0, "Takes the flash behind devices away.", manyPositions, {}, "deleteAttachedFlash -p 1 2"},
    {"addAdditionalConfigFile", 0, "Gives a device software or processor-core files.", onePosition, extraFileSwitches,
     "addAdditionalConfigFile -p 1 -elf boot.elf"},
    {"clearAdditionalConfigFiles", 0, "Takes a device's software and processor-core files away.", onePosition,
     clearFileSwitches, "clearAdditionalConfigFiles -p 1"},
    {"defineDevice", 0, "Describes a device that could not be identified.", onePosition, defineSwitches,
     "defineDevice -p 1 -ireg 8 -name probe"},
    {"deleteDevice", 0, "Takes devices off the chain.", manyPositions, deleteSwitches, "deleteDevice -p 1"},
    {"setAttribute", 0, "Sets an attribute of a device, the configuration device, a collection or a design.",
     onePosition, attributeSwitches, "setAttribute -position 1 -attr configFileName -value top.bit", Switches::listed,
     "Device attributes: name, state, csPin, configFileName, irLength, key, mpmPair, spiPart, spiFile, bpiPart,\n"
     "bpiFile. Configuration device: fileName, fileFormat, swapBit, fillValue, dir. Collection: name. Design: name,\n"
     "startAddress.\n"},
};

}  // namespace

const std::span<const Command> chainCommands = rows;

}  // namespace CommandTable
