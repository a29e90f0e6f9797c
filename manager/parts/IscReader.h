#pragma once

#include "manager/parts/BsdlEntity.h"
#include "manager/parts/Part.h"

/// Reads the attributes ISC_FLOW, ISC_PROCEDURE, ISC_ACTION and ISC_SECURITY of IEEE 1532 into a part's ISC program,
/// and checks that all instructions, flows and procedures that are named exist. `part` has its opcodes already.
/// Failures go to the source.
void readIscProgram(BsdlSource& source, const BsdlEntity& entity, Part& part);
