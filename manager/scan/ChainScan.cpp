#include "manager/scan/ChainScan.h"

#include <algorithm>
#include <string>

#include "manager/scan/ScanChain.h"

namespace {

constexpr std::size_t idcodeLength = 32;
/// A device's instruction register has two bits at least; longer ones than this are not known.
constexpr std::size_t longestIr = 64;

/// Bits that are sent ahead to see when they come out again. No IDCODE begins so: there is no maker 0x7F.
constexpr BitVector::Word marker = 0x9D3AC55A6B1E0FFF;
constexpr std::size_t markerLength = 64;

/// The marker, then ones: in instruction registers they are BYPASS.
BitVector markerAndOnes(std::size_t ones) {
  BitVector result = BitVector::fromNumber(marker, markerLength);
  result.appendFill(ones, true);
  return result;
}

bool markerAt(const BitVector& bits, std::size_t place) {
  return place + markerLength <= bits.size() && bits.number(place, markerLength) == marker;
}

std::size_t findMarker(const BitVector& bits) {
  for (std::size_t place = 0; place + markerLength <= bits.size(); ++place)
    if (markerAt(bits, place)) return place;
  return BitVector::npos;
}

/// Why the marker did not come out of a register, as `what` says.
Failure lost(const BitVector& bits, const std::string& what) {
  const std::size_t ones = bits.count();
  if (ones == 0)
    return {.text = "TDO is stuck at 0: " + std::to_string(bits.size()) +
                    " bits read are all 0. Is the board powered, and is the cable connected?"};
  if (ones == bits.size())
    return {.text = "TDO is stuck at 1: " + std::to_string(bits.size()) +
                    " bits read are all 1. Is the board powered, and is the cable connected?"};
  return {.text = "the chain is broken: what was shifted in at TDI did not come out of the " + what + " within " +
                  std::to_string(bits.size() - markerLength) + " bits"};
}

Status checkAnswers(const Cable& cable) {
  if (!cable.recordsOnly()) return {};
  return Failure{.text = "a chain cannot be examined through the " + cable.description() + ", which only records"};
}

}  // namespace

namespace ChainScan {

Result<std::vector<BitVector>> findIdcodes(Cable& cable) {
  TESSEL_TRY(checkAnswers(cable));
  TESSEL_TRY(cable.goTo(TapState::reset));
  BitVector in;
  TESSEL_TRY(cable.drScan({.out = markerAndOnes(ScanChain::most * idcodeLength), .in = &in}));

  std::vector<BitVector> result;
  std::size_t place = 0;
  while (!markerAt(in, place)) {
    const std::size_t length = in.get(place) ? idcodeLength : 1;
    if (result.size() == ScanChain::most || place + length + markerLength > in.size())
      return lost(in, "data registers after reset, of " + std::to_string(ScanChain::most) + " devices at most,");
    result.push_back(in.slice(place, length));
    place += length;
  }
  if (result.empty()) return Failure{.text = "there is no device on the chain: TDI comes out at TDO at once"};
  std::reverse(result.begin(), result.end());
  return result;
}

Result<BitVector> captureInstructions(Cable& cable, std::size_t devices) {
  TESSEL_TRY(checkAnswers(cable));
  BitVector in;
  TESSEL_TRY(cable.irScan({.out = markerAndOnes(devices * longestIr), .in = &in}));
  const std::size_t length = findMarker(in);
  if (length == BitVector::npos) return lost(in, "instruction registers");
  if (length < 2 * devices)
    return Failure{.text = "the instruction registers of " + std::to_string(devices) + " devices have " +
                           std::to_string(length) + " bits together, expected 2 a device at least"};
  return in.slice(0, length);
}

Result<std::size_t> measureData(Cable& cable, std::size_t most) {
  TESSEL_TRY(checkAnswers(cable));
  BitVector in;
  TESSEL_TRY(cable.drScan({.out = markerAndOnes(most), .in = &in}));
  const std::size_t length = findMarker(in);
  if (length == BitVector::npos) return lost(in, "data registers");
  return length;
}

Result<Found> find(Cable& cable) {
  Result<std::vector<BitVector>> idcodes = findIdcodes(cable);
  if (!idcodes) return idcodes.failure();
  Result<BitVector> captured = captureInstructions(cable, idcodes->size());
  if (!captured) return captured.failure();
  TESSEL_TRY(cable.goTo(TapState::reset));
  const std::size_t length = captured->size();
  return Found{.idcodes = std::move(*idcodes), .totalIrLength = length, .irCapture = std::move(*captured)};
}

}  // namespace ChainScan
