#pragma once

#include "batch/CmdParser.h"

/// The line of a rename in the batch-command file; the name always stands in quotes.
inline constexpr const char* renamePromFileLine = "renamePromFile -file \"%s\"";
inline constexpr const char* renameMpmFileLine = "renameMpmFile -file \"%s\"";

/// Renames the output file of the configuration device and records it in the given form, so that the file
/// does not show the device manager's own line as well.
bool renameOutputFile(CmdParser& session, const char* line, const char* name);
