#include "utility/CommandTable.h"

namespace CommandTable {
namespace {

/// Every operation takes these.
constexpr Switch commonSwitches[] = {
    positions("-p", "the devices' places on the chain, from 1"),
    positions("-position", "the same"),
    flag("-target", "the device named by setTargetDevice instead"),
    flag("-showprogress", "show how far the operation is"),
};

constexpr Switch programSwitches[] = {
    flag("-e", "erase first"),
    flag("-v", "verify afterwards"),
    flag("-onlyFpga", "the FPGA alone, not the flash behind it"),
    flag("-spionly", "the SPI flash behind the device alone"),
    flag("-bpionly", "the BPI flash behind the device alone"),
    flag("-parallel", "all devices at once"),
    text("-usercode", "code", "the user code to write"),
    text("-ues", "text", "the user electronic signature to write"),
    text("-key", "key", "the encryption key"),
    text("-data", "data", "the data to write"),
    text("-file", "path", "the file, in place of the assigned one"),
    number("-revision", "n", "the revision"),
};
constexpr Switch checkSwitches[] = {
    flag("-spionly", "the SPI flash behind the device alone"),
    flag("-bpionly", "the BPI flash behind the device alone"),
    text("-file", "path", "the file, in place of the assigned one"),
    number("-revision", "n", "the revision"),
};
constexpr Switch readbackSwitches[] = {
    text("-file", "path", "where the data goes"),
    number("-start", "n", "the first byte"),
    number("-size", "n", "how many bytes"),
    text("-format", "format", "the file's format"),
    flag("-spionly", "the SPI flash behind the device alone"),
    flag("-bpionly", "the BPI flash behind the device alone"),
};
constexpr Switch vectorSwitches[] = {
    text("-file", "path", "the vector file"),
    text("-action", "name", "the action of the file to run"),
};
constexpr Switch usercodeSwitches[] = {text("-usercode", "code", "the user code to write")};
constexpr Switch uesSwitches[] = {text("-ues", "text", "the user electronic signature to write")};
constexpr Switch dataSwitches[] = {text("-data", "data", "the data to write")};
constexpr Switch revisionSwitches[] = {number("-revision", "n", "the revision")};
constexpr Switch efuseSwitches[] = {
    text("-key", "key", "the key to blow into the device"),
    text("-control", "bits", "the control bits"),
};
constexpr Switch fileSwitches[] = {text("-file", "path", "the file")};
constexpr Switch preloadSwitches[] = {
    text("-data", "data", "the bits to load"),
    text("-file", "path", "the file that holds them"),
};
constexpr Switch debugSwitches[] = {
    flag("-start", "begin"),
    flag("-stop", "end"),
    flag("-reset", "reset the TAPs"),
    text("-tms", "bits", "the TMS levels"),
    text("-tdi", "bits", "the TDI levels"),
    number("-tck", "n", "how many clocks"),
    number("-loop", "n", "how often"),
};

constexpr Command plain(const char* word, const char* meaning, const char* example) {
  return {word, 0, meaning, commonSwitches, {}, example};
}
constexpr Command with(const char* word, const char* meaning, std::span<const Switch> own, const char* example,
                       const char* note = "") {
  return {word, 0, meaning, commonSwitches, own, example, Switches::listed, note};
}

constexpr Command rows[] = {
    with("blankCheck", "Checks that devices are blank.", checkSwitches, "blankCheck -p 1"),
    plain("bypass", "Puts devices into bypass.", "bypass -p 1"),
    with("bsdebug", "Drives the TAP by hand.", debugSwitches, "bsdebug -reset"),
    with("checksum", "Reports the checksum of devices.", checkSwitches, "checksum -p 1"),
    plain("clamp", "Clamps the outputs of devices.", "clamp -p 1"),
    plain("checkidcode", "Checks that devices have the IDCODE of their part.", "checkidcode -p 1"),
    plain("checkIntegrity", "Tests the chain.", "checkIntegrity"),
    with("doPreload", "Preloads the boundary register.", preloadSwitches, "doPreload -p 1 -data 0F"),
    with("erase", "Erases devices.", checkSwitches, "erase -p 1"),
    with("expresssvf", "Writes or plays an SVF file without a chain.", vectorSwitches,
         "expresssvf -p 1 -file board.svf"),
    with("expresscsvf", "Writes or plays a CSVF file without a chain.", vectorSwitches,
         "expresscsvf -p 1 -file board.csvf"),
    with("expressstapl", "Writes or plays a STAPL file without a chain.", vectorSwitches,
         "expressstapl -p 1 -file board.stapl -action PROGRAM"),
    with("functionTest", "Runs a device's test vectors.", vectorSwitches, "functionTest -p 1 -file test.svf"),
    plain("highz", "Puts the outputs of devices into high impedance.", "highz -p 1"),
    {"identify", 2, "Finds out which devices are on the chain.", commonSwitches, {}, "identify"},
    plain("identifyMPM", "Looks for MPM devices behind those found.", "identifyMPM"),
    with("loadConfigurationRevision", "Makes a device load a revision.", revisionSwitches,
         "loadConfigurationRevision -p 1 -revision 1"),
    with("play", "Plays a vector file.", vectorSwitches, "play -file board.svf"),
    with("program", "Programs devices.", programSwitches, "program -p 1 -e -v -showprogress"),
    with("programues", "Writes the user electronic signature.", uesSwitches, "programues -p 1 -ues LOT-7"),
    with("programSecurityRegister", "Writes the security register.", dataSwitches,
         "programSecurityRegister -p 1 -data 0F"),
    with("programUsercode", "Writes the user code.", usercodeSwitches, "programUsercode -p 1 -usercode 0000CAFE"),
    with("programCustomercode", "Writes the customer code.", dataSwitches, "programCustomercode -p 1 -data 0F"),
    {"programEFuse", 0, "Blows the eFuse key and control bits. This cannot be undone.", commonSwitches, efuseSwitches,
     "programEFuse -p 1 -control 0F", Switches::listed,
     "The key goes to the device and into no message, log or file of the tool; only the transcript of saveCmd\n"
     "holds the line as it was typed.\n",
     true},
    plain("readidcode", "Reads the IDCODE.", "readidcode -p 1"),
    plain("readusercode", "Reads the user code.", "readusercode -p 1"),
    plain("readdna", "Reads the device DNA.", "readdna -p 1"),
    plain("readStatusRegister", "Reads the status register.", "readStatusRegister -p 1"),
    plain("readmfgcode", "Reads the manufacturer's code.", "readmfgcode -p 1"),
    plain("readues", "Reads the user electronic signature.", "readues -p 1"),
    with("readbacktofile", "Reads a device's memory into a file.", readbackSwitches,
         "readbacktofile -p 1 -file dump.mcs -start 0 -size 65536"),
    with("reconfigureOTF", "Reconfigures a device on the fly.", fileSwitches, "reconfigureOTF -p 1 -file new.bit"),
    plain("readEFuse", "Reads the eFuses.", "readEFuse -p 1"),
    plain("readEFuseControlReg", "Reads the eFuse control register.", "readEFuseControlReg -p 1"),
    plain("readPromOptions", "Reads the option bits of a PROM.", "readPromOptions -p 1"),
    plain("readTemperatureAndVoltage", "Reads the monitors of a device.", "readTemperatureAndVoltage -p 1"),
    plain("readCustomerCode", "Reads the customer code.", "readCustomerCode -p 1"),
    plain("readSecurityRegister", "Reads the security register.", "readSecurityRegister -p 1"),
    with("setActiveRevision", "Chooses the revision that a PROM gives at start-up.", revisionSwitches,
         "setActiveRevision -p 1 -revision 1"),
    with("setEFuseControlReg", "Writes the eFuse control register.", dataSwitches, "setEFuseControlReg -p 1 -data 0F"),
    with("verify", "Compares devices with their files.", checkSwitches, "verify -p 1"),
};

}  // namespace

const std::span<const Command> operationCommands = rows;

}  // namespace CommandTable
