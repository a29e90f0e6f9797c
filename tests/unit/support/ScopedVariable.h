#pragma once

#include <cstdlib>
#include <optional>
#include <string>

namespace testsupport {

/// An environment variable with another value (null for none) while the object lives.
class ScopedVariable {
 public:
  ScopedVariable(std::string name, const char* value) : name_(std::move(name)) {
    if (const char* former = std::getenv(name_.c_str())) former_ = former;
    set(value);
  }
  ~ScopedVariable() { set(former_ ? former_->c_str() : nullptr); }
  ScopedVariable(const ScopedVariable&) = delete;
  ScopedVariable& operator=(const ScopedVariable&) = delete;

 private:
  void set(const char* value) {
    if (value == nullptr)
      ::unsetenv(name_.c_str());
    else
      ::setenv(name_.c_str(), value, 1);
  }

  std::string name_;
  std::optional<std::string> former_;
};

}  // namespace testsupport
