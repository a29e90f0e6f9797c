#pragma once

#include "interfaces/Export.h"
#include "interfaces/utility/Callback.h"

/// A progress callback alone: one pointer.
class TESSEL_EXPORT DFCallbackFunction {
 public:
  using Function = bool (*)(Callback&);

  DFCallbackFunction() = default;
  explicit DFCallbackFunction(Function newFunction) : function_(newFunction) {}
  DFCallbackFunction(const DFCallbackFunction&) = default;
  DFCallbackFunction& operator=(const DFCallbackFunction& other);
  ~DFCallbackFunction() = default;

  Function function() const { return function_; }

 private:
  Function function_ = nullptr;
};
