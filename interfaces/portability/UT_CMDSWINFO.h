#pragma once

#include <cstdint>
#include <span>

#include "interfaces/portability/UT_CMDARGINFO.h"

/// One switch of a command with its arguments. It belongs to the `UT_CMDARGS` it comes from.
class UT_CMDSWINFO {
 public:
  UT_CMDSWINFO(const char* name, std::span<const UT_CMDARGINFO> arguments) : name_(name), arguments_(arguments) {}

  /// The switch as typed, with its `-`.
  const char* getswname() const { return name_; }
  int getnumargs() const { return static_cast<int>(arguments_.size()); }

  /// Argument `index`, from 0. Past the last one: null, a null text, or the number -1.
  const UT_CMDARGINFO* getarg(int index) const { return holds(index) ? &arguments_[asSize(index)] : nullptr; }
  const char* getargtxt(int index) const { return holds(index) ? arguments_[asSize(index)].getargtxt() : nullptr; }
  std::int16_t getargnum(int index) const {
    return holds(index) ? arguments_[asSize(index)].getargnum() : std::int16_t{-1};
  }
  std::int32_t getargnum32(int index) const { return holds(index) ? arguments_[asSize(index)].getargnum32() : -1; }

 private:
  static std::size_t asSize(int index) { return static_cast<std::size_t>(index); }
  bool holds(int index) const { return index >= 0 && asSize(index) < arguments_.size(); }

  const char* name_;
  std::span<const UT_CMDARGINFO> arguments_;
};
