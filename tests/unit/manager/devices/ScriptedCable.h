#pragma once

#include <deque>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "manager/parts/Part.h"
#include "manager/scan/Cable.h"

/// A cable to one device that writes down what it is asked for and answers from a script. Lines of the log:
///
///     ISC_ENABLE           an instruction that was loaded
///     > 8:D0               a DR scan, its bits as hex
///     < 8                  a DR scan that reads
///     wait 16 0.001        cycles and seconds
class ScriptedCable : public Cable {
 public:
  explicit ScriptedCable(PartPointer part) : part_(std::move(part)) {}

  /// What reads of an instruction's register give, one after the other; the last one stays.
  std::map<std::string, std::deque<BitVector>> answers;
  /// What the instruction register captures from the load with that number on, counted from 0.
  std::map<int, BitVector> irAnswers = {{0, BitVector::fromNumber(1, 8)}};
  /// The DR scan with that number, counted from 0, fails with a lost link.
  int linkDropsAt = -1;
  bool records = false;

  std::vector<std::string> log;
  int irReads = 0;  ///< loads whose answer was asked for
  int drReads = 0;
  int loads = 0;

  Status irScan(const Scan& scan) override {
    if (scan.in != nullptr) {
      ++irReads;
      *scan.in = std::prev(irAnswers.upper_bound(loads))->second;
    }
    ++loads;
    for (const auto& [name, opcodes] : part_->opcodes)
      if (opcodes.front() == scan.out) instruction_ = name;
    log.push_back(instruction_);
    return {};
  }

  Status drScan(const Scan& scan) override {
    if (linkDropsAt >= 0 && drScans_++ >= linkDropsAt) return Failure{.text = "gone", .kind = Failure::Kind::link};
    if (scan.in == nullptr && scan.expected == nullptr) {
      log.push_back("> " + std::to_string(scan.out.size()) + ":" + scan.out.hex());
      return {};
    }
    ++drReads;
    log.push_back("< " + std::to_string(scan.out.size()) +
                  (scan.expected == nullptr ? "" : ":" + scan.expected->hex() + "*" + scan.mask->hex()));
    if (scan.in != nullptr) *scan.in = answer(scan.out.size());
    return {};
  }

  Status runTest(std::uint64_t cycles, double seconds, TapState /*state*/, TapState /*end*/) override {
    std::ostringstream text;
    text << "wait " << cycles << ' ' << seconds;
    log.push_back(text.str());
    return {};
  }

  Status goTo(TapState /*state*/) override { return {}; }
  Status flush() override { return {}; }
  Status limitTck(std::uint32_t /*hertz*/) override { return {}; }
  Status driveResets(bool /*trst*/, bool /*srst*/) override { return {}; }
  Status clock(const BitVector& /*tms*/, const BitVector& /*tdi*/, BitVector* /*tdo*/) override { return {}; }
  bool recordsOnly() const override { return records; }
  std::string description() const override { return "scripted"; }

 private:
  BitVector answer(std::size_t size) {
    std::deque<BitVector>& row = answers[instruction_];
    BitVector bits = row.empty() ? BitVector(size) : row.front();
    if (row.size() > 1) row.pop_front();
    bits.resize(size);
    return bits;
  }

  PartPointer part_;
  std::string instruction_;
  int drScans_ = 0;
};
