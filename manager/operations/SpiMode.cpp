#include "manager/operations/SpiMode.h"

#include <algorithm>

#include "manager/scan/ChainScan.h"

namespace {

/// The chain that the cable finds, of known parts.
Result<DeviceChain> physicalChain(OperationContext& context) {
  const Result<std::vector<BitVector>> idcodes = ChainScan::findIdcodes(context.cable);
  if (!idcodes) return idcodes.failure();
  DeviceChain chain;
  for (const BitVector& idcode : *idcodes) {
    ChainDevice device;
    device.part = idcode.size() < 32 ? nullptr : context.parts.identify(idcode);
    if (device.part == nullptr)
      return Failure{Port::format("Device %d of the JTAG chain is not known, so the SPI flash can't be reached.",
                                  chain.size() + 1)};
    device.name = device.part->name;
    device.irLength = device.part->irLength;
    if (const Status added = chain.insert(chain.size(), std::move(device)); !added) return added.failure();
  }
  return chain;
}

Result<int> findBridge(const DeviceChain& chain) {
  for (int i = 0; i < chain.size(); ++i)
    if (!chain.at(i).part->bridge.spiInstruction.empty()) return i;
  return Failure{"No device of the JTAG chain has a bridge to SPI flash."};
}

}  // namespace

Status SpiMode::run(OperationContext& context, const UT_CMDARGS& args, const OperationRow& row, int position) {
  const bool memoryWord =
      std::ranges::any_of(memoryOperations, [&row](const OperationRow& each) { return each.device == row.device; });
  if (!memoryWord) return Failure{Port::format("SPI flash can't do %s.", args.getcmd())};
  Result<DeviceChain> chain = physicalChain(context);
  if (!chain) return chain.failure();
  const Result<int> bridge = findBridge(*chain);
  if (!bridge) return bridge.failure();
  const ChainDevice& flash = context.chain.at(position);
  AttachedFlash& attached = chain->at(*bridge).spiFlash.emplace();
  attached.partName = flash.name;
  attached.file = flash.file;
  const Result<std::vector<std::size_t>> lengths = chain->irLengths();
  if (!lengths) return lengths.failure();
  ScanChain scan(context.cable, *lengths);
  OperationContext physical{.chain = *chain,
                            .cable = context.cable,
                            .parts = context.parts,
                            .mode = context.mode,
                            .progressCallback = context.progressCallback,
                            .multibootBpiWidth = context.multibootBpiWidth};
  DeviceWork work(physical, args, scan, *bridge);
  work.setSpiOnly(position);
  return row.device(work);
}
