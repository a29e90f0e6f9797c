#pragma once

#include "interfaces/portability/UT_CMDARGS.h"

/// The first occurrence of the first of the given names that the command has; null when it has none. The
/// order of the two spellings of a switch differs between commands, and which one wins is part of their
/// behaviour.
template <class... Names>
const UT_CMDSWINFO* findSwitch(const UT_CMDARGS& args, Names... names) {
  const UT_CMDSWINFO* found = nullptr;
  ((found = found != nullptr ? found : args.getsw(names, 0)), ...);
  return found;
}
