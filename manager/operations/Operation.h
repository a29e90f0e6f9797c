#pragma once

#include <cstdint>
#include <span>
#include <string>

#include "interfaces/devicemanager/tESSELNS.h"
#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "manager/chain/DeviceChain.h"
#include "manager/parts/PartLibrary.h"
#include "manager/scan/ScanChain.h"
#include "manager/support/Progress.h"
#include "manager/support/Report.h"
#include "manager/support/Result.h"

class Callback;

/// What operations work with. The chain is the active mode's.
struct OperationContext {
  DeviceChain& chain;
  Cable& cable;
  PartLibrary& parts;
  tESSELNS::MODE_TYPE mode = tESSELNS::BOUNDARY_SCAN;
  bool (*progressCallback)(Callback&) = nullptr;
  int multibootBpiWidth = 16;
  bool attachedTarget = false;  ///< the flash attached to the target is meant
};

/// One operation on one device.
class DeviceWork {
 public:
  DeviceWork(OperationContext& context, const UT_CMDARGS& args, ScanChain& scan, int position)
      : context_(context), args_(args), scan_(scan), position_(position), shownPosition_(position) {}

  OperationContext& context() { return context_; }
  const UT_CMDARGS& args() const { return args_; }
  ScanChain& scan() { return scan_; }
  Cable& cable() { return context_.cable; }
  int position() const { return position_; }
  std::size_t index() const { return static_cast<std::size_t>(position_); }
  ChainDevice& device() { return context_.chain.at(position_); }

  /// The device's part, or a failure for a device that is not known.
  Result<PartPointer> part();
  bool has(const char* name) const { return args_.findsw(name); }
  /// The flash behind the device is meant, because the command or the mode says so.
  bool spiOnly() { return spiOnly_ || has("-spionly") || (context_.attachedTarget && device().spiFlash.has_value()); }
  bool bpiOnly() { return has("-bpionly") || (context_.attachedTarget && !device().spiFlash.has_value()); }
  /// For the mode of SPI flash; messages name the flash's position.
  void setSpiOnly(int shownPosition) {
    spiOnly_ = true;
    shownPosition_ = shownPosition;
  }
  /// The argument of a switch; null when there is none.
  const char* text(const char* name) const;

  /// A status line with the position in front.
  template <class... Arguments>
  void status(const char* format, const Arguments&... arguments) {
    reportStatus("'%d': %s\n", shownPosition_ + 1, Port::format(format, arguments...));
  }
  /// Passes on to the callback of the session when the percentage changes.
  Progress progress();

 private:
  OperationContext& context_;
  const UT_CMDARGS& args_;
  ScanChain& scan_;
  int position_;
  int shownPosition_;
  bool spiOnly_ = false;
};

/// A word and what it does: on each device, or on the chain as a whole.
struct OperationRow {
  const char* word;
  Status (*device)(DeviceWork& work);
  bool checksChain = true;  ///< the chain must be as described before the handler runs, with all IR lengths known
  Status (*chain)(OperationContext& context, const UT_CMDARGS& args) = nullptr;
  std::size_t shortest = 0;  ///< the length of the word's shortest abbreviation; 0 for none
};

// The families.
extern const std::span<const OperationRow> chainOperations;
extern const std::span<const OperationRow> registerOperations;
extern const std::span<const OperationRow> memoryOperations;
extern const std::span<const OperationRow> boundaryOperations;

namespace Operations {

/// The IDCODEs on the chain, which has as many devices as were described. Resets the TAPs.
Result<std::vector<BitVector>> readIdcodes(OperationContext& context);
/// Compares the chain that was described with the one that is there: as many devices, with the IDCODEs of their
/// parts. A cable that only records is not asked.
Status checkChain(OperationContext& context);

}  // namespace Operations
