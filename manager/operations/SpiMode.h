#pragma once

#include "manager/operations/Operation.h"

/// The mode whose chain is an SPI flash memory. A cable reaches it through the first device of its JTAG chain that
/// has a bridge to SPI flash.
namespace SpiMode {

/// Carries out a word on the flash at a position of the context's chain.
Status run(OperationContext& context, const UT_CMDARGS& args, const OperationRow& row, int position);

}  // namespace SpiMode
