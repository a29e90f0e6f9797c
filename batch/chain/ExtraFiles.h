#pragma once

#include <vector>

#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"

/// The files of all -core occurrences by core number; a later one replaces an earlier one. It ends before the
/// first file that is neither .bit nor .rbt (reported) or has no extension (silent).
DeviceManagerInterface::CoreFiles gatherCoreFiles(const UT_CMDARGS& args);

/// The software files (.elf, .mem) of all -elf and -file switches: one entry a switch, a blank and the text
/// for each of its arguments.
std::vector<StringBase> gatherSoftwareFiles(const UT_CMDARGS& args);
