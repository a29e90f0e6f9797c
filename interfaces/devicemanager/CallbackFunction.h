#pragma once

#include "interfaces/Export.h"
#include "interfaces/utility/Callback.h"

/// A progress callback with the context it is meant for: two pointers, both borrowed.
class TESSEL_EXPORT CallbackFunction {
 public:
  using Function = bool (*)(Callback&);

  CallbackFunction() = default;
  CallbackFunction(Function newFunction, void* newContext) : function_(newFunction), context_(newContext) {}
  CallbackFunction(const CallbackFunction&) = default;
  CallbackFunction& operator=(const CallbackFunction& other);
  ~CallbackFunction() = default;

  Function function() const { return function_; }
  void* context() const { return context_; }

 private:
  Function function_ = nullptr;
  void* context_ = nullptr;
};
