#pragma once

#include <cstdint>

#include "interfaces/Export.h"

/// One argument of a switch. Its text belongs to the `UT_CMDARGS` it comes from.
class TESSEL_EXPORT UT_CMDARGINFO {
 public:
  explicit UT_CMDARGINFO(const char* text) : text_(text) {}

  const char* getargtxt() const { return text_; }
  /// The leading decimal number of the text: 0 when there is none, clamped to 32 bits.
  std::int32_t getargnum32() const;
  /// The low 16 bits of `getargnum32`, signed.
  std::int16_t getargnum() const { return static_cast<std::int16_t>(getargnum32()); }

 private:
  const char* text_;
};
