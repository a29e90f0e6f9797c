#!/usr/bin/env bash
# The interpreter's library shows the session's five members and three operators, and nothing else.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

: "${TESSEL_BATCH_LIBRARY:?names the library under test}"

nm --dynamic --demangle --defined-only "$TESSEL_BATCH_LIBRARY" | sed 's/^[^ ]* . //' | sort >exported
# A constructor and a destructor are two symbols each: of a whole object and of the base of another.
check 'the exported symbols' is exported \
  'CallbackFunction::operator=(CallbackFunction const&)' \
  'CmdParser::CmdParser()' \
  'CmdParser::CmdParser()' \
  'CmdParser::runCommandFile(char const*)' \
  'CmdParser::runCommandLine()' \
  'CmdParser::setMsgWrite(bool)' \
  'CmdParser::~CmdParser()' \
  'CmdParser::~CmdParser()' \
  'DFCallbackFunction::operator=(DFCallbackFunction const&)' \
  'DebugTrace::operator=(DebugTrace const&)'
