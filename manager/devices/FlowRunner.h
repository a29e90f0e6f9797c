#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "manager/devices/FlowVariables.h"
#include "manager/devices/InstructionLoader.h"
#include "manager/devices/IscLayout.h"
#include "manager/support/Progress.h"

/// Carries out one ISC action of a part on a device. Data are the bits of the file, the lowest bit of the first byte
/// first, as long as the layout.
///
/// - Variables live as long as a run of a flow. A procedure takes the bits of an array from its beginning on, its
///   flows one after the other; a loop takes the same bits in each of its tries.
/// - A capture that must hold given bits and does not is a failure; one that is compared with data is not: what was
///   found is kept, and the flow goes on, unless it says exit_on_error.
/// - After a failure the procedures with "disable" in their names are still tried, as long as the cable answers.
/// - A cable that only records gets a loop once, with the waits of all tries before its captures.
class FlowRunner {
 public:
  struct Input {
    const BitVector* data = nullptr;     ///< for "?"; null when the action takes none
    const BitVector* covered = nullptr;  ///< bits of `data` that are compared; null for all
  };
  /// Vectors as long as the layout.
  struct Outcome {
    BitVector found;      ///< what captures of "?" and "!" held
    BitVector seen;       ///< which bits were compared or kept
    BitVector differing;  ///< which covered bits of "?" were not as the data say
    BitVector written;    ///< which bits of the data were shifted in
  };
  using Choice = std::function<bool(const Isc::Use& procedure)>;

  FlowRunner(InstructionLoader& loader, const IscLayout& layout) : loader_(loader), layout_(layout) {}

  Result<Outcome> run(const Isc::Action& action, const Choice& choice, const Input& input, const Progress& progress);

 private:
  /// What a step may see of the flow around it.
  struct Frame {
    const Isc::Flow* flow = nullptr;
    FlowVariables variables;
  };
  /// What a capture must hold. Bits whose mask is zero may be anything.
  struct Expectation {
    BitVector bits;
    BitVector mask;
    std::vector<std::size_t> places;  ///< of a field's data; npos for a field that has none
  };
  enum class Retry { none, more, last };

  Status runProcedure(const Isc::Use& use);
  Status runFlow(const Isc::Flow& flow);
  Status runItem(Frame& frame, const Isc::Item& item);
  Status runLoop(Frame& frame, const Isc::Item& item);
  Status recordLoop(Frame& frame, const Isc::Item& item);
  Status runStep(Frame& frame, const Isc::Step& step, Retry retry, bool& matched);
  Status update(Frame& frame, const Isc::Step& step);
  Status wait(const Frame& frame, const Isc::Step& step);
  Status capture(Frame& frame, const Isc::Step& step, Retry retry, bool& matched);
  Result<Expectation> expect(Frame& frame, const Isc::Step& step);
  Status judge(const Frame& frame, const Isc::Step& step, Retry retry, const Expectation& wanted,
               const BitVector& found, bool& matched);
  void keepData(const Isc::Field& field, std::size_t place, const BitVector& captured, const BitVector& mask,
                Retry retry, bool& matched);
  BitVector coveredMask(const Isc::Step& step, const Expectation& wanted) const;
  BitVector::Word covered(std::size_t place, std::size_t count) const;
  bool differsInCovered(std::size_t place, const BitVector& bits, const BitVector& mask) const;
  Result<std::size_t> takeData(const Frame& frame, std::size_t count);
  void disable(const Isc::Action& action, const Choice& choice, std::size_t failed);
  Status countBits(const Isc::Action& action, const Choice& choice);
  void report(std::size_t bits);
  Failure failureOf(const Frame& frame, const Isc::Step& step, const std::string& what) const;

  InstructionLoader& loader_;
  const IscLayout& layout_;
  Input input_;
  Progress progress_;
  Outcome outcome_;
  std::map<std::string, std::size_t> taken_;  ///< bits of each array that the procedure took
  std::uint64_t doneBits_ = 0;
  std::uint64_t totalBits_ = 0;
  std::uint64_t steps_ = 0;
  std::uint64_t tries_ = 1;       ///< of the loop that runs
  std::uint64_t waitFactor_ = 1;  ///< how often a recorded wait counts
  bool stopped_ = false;          ///< the procedure, by exit_on_error
};
