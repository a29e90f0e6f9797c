#include "manager/cables/CableDiagnostics.h"

#include <bit>

#include "manager/scan/ChainScan.h"
#include "manager/scan/ScanChain.h"

namespace {

constexpr std::size_t patternLength = std::size_t{1} << 20;

/// A pseudo-random row of bits, the same each time (xorshift).
BitVector pattern() {
  BitVector result(patternLength);
  BitVector::Word state = 0x2545F4914F6CDD1D;
  for (BitVector::Word& word : result.words()) {
    state ^= state << 13;
    state ^= state >> 7;
    state ^= state << 17;
    word = state;
  }
  return result;
}

std::size_t countDifferences(const BitVector& left, const BitVector& right) {
  std::size_t result = 0;
  for (std::size_t i = 0; i < left.words().size(); ++i)
    result += static_cast<std::size_t>(std::popcount(left.words()[i] ^ right.words()[i]));
  return result;
}

std::string counted(std::size_t number, const std::string& thing) {
  return std::to_string(number) + ' ' + thing + (number == 1 ? "" : "s");
}

/// The steps of the test, in their order.
class Test {
 public:
  Test(Cable& cable, const CableDiagnostics::Listener& listener) : cable_(cable), listener_(listener) {}

  Result<CableDiagnostics::Report> run() {
    TESSEL_TRY(identify());
    TESSEL_TRY(measureInstructions());
    TESSEL_TRY(measureBypass());
    TESSEL_TRY(sendPattern());
    TESSEL_TRY(cable_.goTo(TapState::reset));
    TESSEL_TRY(cable_.flush());
    return std::move(report_);
  }

 private:
  void say(const std::string& line) {
    report_.lines.push_back(line);
    if (listener_) listener_(line);
  }

  Status identify() {
    Result<std::vector<BitVector>> idcodes = ChainScan::findIdcodes(cable_);
    if (!idcodes) return idcodes.failure();
    report_.idcodes = std::move(*idcodes);
    say("TDO works, " + counted(report_.idcodes.size(), "device") + " on the chain, the first behind TDI:");
    for (std::size_t i = 0; i < report_.idcodes.size(); ++i) {
      const BitVector& idcode = report_.idcodes[i];
      say("  device " + std::to_string(i + 1) + ": " + (idcode.size() > 1 ? "IDCODE 0x" + idcode.hex() : "no IDCODE"));
    }
    return {};
  }

  Status measureInstructions() {
    const Result<BitVector> captured = ChainScan::captureInstructions(cable_, report_.idcodes.size());
    if (!captured) return captured.failure();
    report_.totalIrLength = captured->size();
    say("Instruction registers: " + counted(captured->size(), "bit") + ", captured " + captured->binary());
    return {};
  }

  /// All devices are in BYPASS since the instruction registers were measured.
  Status measureBypass() {
    const Result<std::size_t> length = ChainScan::measureData(cable_, ScanChain::most);
    if (!length) return length.failure();
    report_.bypassLength = *length;
    if (*length != report_.idcodes.size())
      return Failure{.text = "the chain contradicts itself: " + counted(report_.idcodes.size(), "device") +
                             " answered after reset, but " + counted(*length, "bypass bit") + " follow BYPASS"};
    say("Bypass registers: " + counted(*length, "bit"));
    return {};
  }

  Status sendPattern() {
    const BitVector sent = pattern();
    BitVector out = sent;
    out.appendFill(report_.bypassLength, false);
    BitVector in;
    TESSEL_TRY(cable_.drScan({.out = out, .in = &in}));
    const BitVector found = in.slice(report_.bypassLength, patternLength);
    report_.patternBits = patternLength;
    report_.patternErrors = countDifferences(found, sent);
    if (report_.patternErrors == 0) {
      say("Test pattern: " + counted(patternLength, "bit") + ", no errors");
      return {};
    }
    return Failure{.text = "the test pattern came out with " + counted(report_.patternErrors, "error") + " in " +
                           counted(patternLength, "bit") + ", the first at bit " +
                           std::to_string(firstDifference(found, sent)) + ": a lower TCK may help"};
  }

  Cable& cable_;
  const CableDiagnostics::Listener& listener_;
  CableDiagnostics::Report report_;
};

}  // namespace

namespace CableDiagnostics {

Result<Report> run(Cable& cable, const Listener& listener) { return Test(cable, listener).run(); }

}  // namespace CableDiagnostics
