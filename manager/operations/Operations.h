#pragma once

#include "interfaces/portability/UT_CMDARGS.h"
#include "manager/operations/Operation.h"

namespace Operations {

/// Whether there is a handler for a command word.
bool isBuilt(const char* word);
/// Carries out a command that is built, its words parsed, positions from 0. Failures are reported. True when every
/// position succeeded. `linkLost`, set by it, tells that the cable is of no more use.
bool run(OperationContext& context, const UT_CMDARGS& args, bool& linkLost);

}  // namespace Operations
