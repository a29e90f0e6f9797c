#include "manager/scan/ScanChain.h"

#include <utility>

#include "manager/scan/ScanData.h"

ScanChain::ScanChain(Cable& cable, std::vector<std::size_t> irLengths)
    : cable_(cable), irLengths_(std::move(irLengths)) {}

Status ScanChain::loadInstruction(std::size_t device, const BitVector& opcode, BitVector* captured, TapState end) {
  TESSEL_TRY(checkOpcode(device, opcode));
  BitVector out;
  std::size_t place = 0;
  for (std::size_t i = size(); i-- > 0;) {
    if (i == device) {
      place = out.size();
      out.append(opcode);
    } else {
      out.appendFill(irLengths_[i], true);
    }
  }
  BitVector in;
  TESSEL_TRY(cable_.irScan({.out = out, .in = captured == nullptr ? nullptr : &in, .end = end}));
  if (captured == nullptr) return {};
  *captured = cable_.recordsOnly() ? BitVector(opcode.size()) : in.slice(place, opcode.size());
  return {};
}

Status ScanChain::loadInstructions(const std::vector<BitVector>& opcodes, TapState end) {
  if (opcodes.size() != size())
    return Failure{.text = std::to_string(opcodes.size()) + " instructions for a chain of " + std::to_string(size()) +
                           " devices"};
  BitVector out;
  for (std::size_t i = size(); i-- > 0;) {
    TESSEL_TRY(checkOpcode(i, opcodes[i]));
    out.append(opcodes[i]);
  }
  return cable_.irScan({.out = out, .end = end});
}

Status ScanChain::scanData(std::size_t device, const Scan& scan) {
  if (device >= size()) return noDevice(device);
  if (size() == 1) return cable_.drScan(scan);
  const BitVector out = padded(device, scan.out);
  if (cable_.recordsOnly()) return recordData(device, scan, out);

  BitVector in;
  const bool reads = scan.in != nullptr || scan.expected != nullptr;
  TESSEL_TRY(cable_.drScan({.out = out, .in = reads ? &in : nullptr, .end = scan.end}));
  if (!reads) return {};
  const BitVector found = in.slice(bitsBehind(device), scan.out.size());
  if (scan.in != nullptr) *scan.in = found;
  return scan.expected == nullptr ? Status() : ScanData::compare(found, *scan.expected, scan.mask);
}

Status ScanChain::recordData(std::size_t device, const Scan& scan, const BitVector& out) {
  BitVector in;
  BitVector expected;
  BitVector mask;
  if (scan.expected != nullptr) {
    expected = padded(device, *scan.expected);
    mask = padded(device, scan.mask != nullptr ? *scan.mask : BitVector(scan.out.size(), true));
  }
  if (scan.in != nullptr) *scan.in = BitVector(scan.out.size());
  const bool compares = scan.expected != nullptr;
  return cable_.drScan({.out = out,
                        .in = scan.in == nullptr ? nullptr : &in,
                        .expected = compares ? &expected : nullptr,
                        .mask = compares ? &mask : nullptr,
                        .end = scan.end});
}

BitVector ScanChain::padded(std::size_t device, const BitVector& bits) const {
  BitVector result;
  result.reserve(bits.size() + size() - 1);
  result.appendFill(bitsBehind(device), false);
  result.append(bits);
  result.appendFill(bitsBefore(device), false);
  return result;
}

Status ScanChain::checkOpcode(std::size_t device, const BitVector& opcode) const {
  if (device >= size()) return noDevice(device);
  if (opcode.size() == irLengths_[device]) return {};
  return Failure{.text = "an instruction of " + std::to_string(opcode.size()) + " bits does not fit the device " +
                         std::to_string(device) + " of the chain, whose instruction register has " +
                         std::to_string(irLengths_[device])};
}

Failure ScanChain::noDevice(std::size_t device) const {
  return {.text = "there is no device " + std::to_string(device) + " on a chain of " + std::to_string(size()) +
                  " (the first is 0)"};
}
