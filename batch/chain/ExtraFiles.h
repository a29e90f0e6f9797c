#pragma once

#include <vector>

#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"

/// Puts the file of every -core occurrence under its core number; a later one replaces an earlier one. False
/// at the first file that is neither .bit nor .rbt (reported) or has no extension (silent); what was gathered
/// before stays.
bool gatherCoreFiles(const UT_CMDARGS& args, DeviceManagerInterface::CoreFiles& files);

/// The software files (.elf, .mem) of all -elf and -file switches: one entry a switch, a blank and the text
/// for each of its arguments.
std::vector<StringBase> gatherSoftwareFiles(const UT_CMDARGS& args);
