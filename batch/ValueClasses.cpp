#include "interfaces/devicemanager/CallbackFunction.h"
#include "interfaces/devicemanager/DFCallbackFunction.h"
#include "interfaces/devicemanager/DebugTrace.h"

// Hosts link against these three operators of the interpreter's library, so none of them is inline.

DebugTrace& DebugTrace::operator=(const DebugTrace& other) {
  on_ = other.on_;
  return *this;
}

CallbackFunction& CallbackFunction::operator=(const CallbackFunction& other) {
  function_ = other.function_;
  context_ = other.context_;
  return *this;
}

DFCallbackFunction& DFCallbackFunction::operator=(const DFCallbackFunction& other) {
  function_ = other.function_;
  return *this;
}
