#pragma once

#include "batch/CmdParser.h"
#include "interfaces/portability/UT_CMDARGS.h"

/// The texts in which the commands that give a device a file differ.
struct AssignmentTexts {
  const char* onlyOne;       ///< the chain has one device and another one is meant
  const char* upTo;          ///< the chain has several; takes their number
  const char* fileRequired;  ///< no -file
};

struct Assignment {
  int position = 0;
  const char* path = nullptr;
};

/// Which file goes to which device. False after a message. Only the position's upper bound is looked at.
bool findAssignment(const CmdParser& session, const UT_CMDARGS& args, const AssignmentTexts& texts,
                    Assignment& assignment);
