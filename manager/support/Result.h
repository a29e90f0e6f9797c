#pragma once

#include <optional>
#include <string>
#include <utility>
#include <variant>

/// Why something failed, as the text that the user reads: it names the file and place, or the device, and what
/// was expected. No line end.
struct Failure {
  enum class Kind {
    general,
    link,      ///< the connection to the cable is gone; nothing more can be done on it
    mismatch,  ///< data read differ from those expected
  };

  std::string text;
  Kind kind = Kind::general;
};

/// A value, or the failure to get it.
template <class T>
class [[nodiscard]] Result {
 public:
  Result(T value) : outcome_(std::in_place_index<0>, std::move(value)) {}
  Result(Failure failure) : outcome_(std::in_place_index<1>, std::move(failure)) {}

  bool ok() const { return outcome_.index() == 0; }
  explicit operator bool() const { return ok(); }
  T& operator*() { return std::get<0>(outcome_); }
  const T& operator*() const { return std::get<0>(outcome_); }
  T* operator->() { return &std::get<0>(outcome_); }
  const T* operator->() const { return &std::get<0>(outcome_); }
  const Failure& failure() const { return std::get<1>(outcome_); }

 private:
  std::variant<T, Failure> outcome_;
};

/// Success, or a failure.
class [[nodiscard]] Status {
 public:
  Status() = default;
  Status(Failure failure) : failure_(std::move(failure)) {}

  bool ok() const { return !failure_.has_value(); }
  explicit operator bool() const { return ok(); }
  const Failure& failure() const { return *failure_; }

 private:
  std::optional<Failure> failure_;
};

/// The failure of `expression`, a Status, ends the function as its result.
#define TESSEL_TRY(expression) \
  if (Status tesselStatus = (expression); !tesselStatus.ok()) return tesselStatus.failure()
