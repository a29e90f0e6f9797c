#pragma once

#include "batch/CmdParser.h"
#include "interfaces/portability/UT_CMDARGS.h"

// Devices that addDevice makes for a programming file: the part is named by a switch and added, then gets the
// file. `position` counts from 0 and is printed so; that asymmetry is deliberate.

bool addPromProgrammingFile(CmdParser& session, const UT_CMDARGS& args, const char* path, int position);
bool addSpiProgrammingFile(CmdParser& session, const UT_CMDARGS& args, const char* path, int position);
/// Adds a pair: a fixed PROM part at the position and the MPM part, which gets the file, behind it.
bool addMpmProgrammingFile(CmdParser& session, const UT_CMDARGS& args, const char* path, int position);
