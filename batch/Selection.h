#pragma once

#include "batch/CmdParser.h"
#include "interfaces/portability/UT_CMDARGS.h"

/// Makes the collection that a switch names the current one; a null switch or one without a text selects
/// nothing. False after a message.
bool selectCollection(CmdParser& session, const UT_CMDSWINFO* collection);

/// Makes a design the current one. False after a message.
bool selectDesign(CmdParser& session, int version);

/// Whether a mode is one of the three that hold content.
bool isContentMode(tESSELNS::MODE_TYPE mode);
/// Whether the active mode is one of them.
bool isContentMode(const CmdParser& session);
