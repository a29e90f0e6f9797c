#pragma once

#include <string>

#include "manager/scan/BitVector.h"
#include "manager/support/Result.h"

/// What cables and chains share about the bits of a scan.
namespace ScanData {

/// A failure of kind `mismatch` when a bit that `mask` has set (null: any bit) differs; it names the first one, such
/// as "expected 1A2B, found 1A2A at bit 0 of 16". Of a long scan the bits around that one are shown. A failure of
/// kind `general` when the sizes differ.
Status compare(const BitVector& found, const BitVector& expected, const BitVector* mask = nullptr);

}  // namespace ScanData
