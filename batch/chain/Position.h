#pragma once

#include <functional>

#include "batch/CmdParser.h"
#include "interfaces/portability/UT_CMDARGS.h"

/// The position (from 0) at which a device is to be added: at any place of the chain or behind its last
/// device. False after a message.
bool positionToAdd(const CmdParser& session, const UT_CMDARGS& args, int& position);

/// Hands the positions of the switch to `remove`, in the order typed, until it gives false. A position behind
/// the chain's end is reported with `missingText` and ends the walk with the result of the step before it:
/// false at the first argument, true when earlier ones were removed. False without arguments.
bool removeEach(const UT_CMDSWINFO& positions, int chainCount, const char* missingText,
                const std::function<bool(int position)>& remove);
