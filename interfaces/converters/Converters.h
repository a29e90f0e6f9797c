#pragma once

#include "interfaces/Export.h"

/// Entry points of the external conversion utilities. Each takes a whole command line as its words, the
/// command word first, and has issued its own error when it fails.

/// svf2Oba, qinterlv, qmpm2svf, qmselmap, qmcslink and q_compex; true for success.
TESSEL_EXPORT bool ObaInterface(int count, const char* const* words);
/// playCsvf; non-zero for success.
TESSEL_EXPORT int playCsvfInterface(int count, const char* const* words);
/// svf2csvf; non-zero for success.
TESSEL_EXPORT int svf2CsvfInterface(int count, const char* const* words);
