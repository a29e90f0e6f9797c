#include "manager/devices/FlowRunner.h"

#include <algorithm>
#include <string_view>

namespace {

using Kind = Isc::Value::Kind;

// What a damaged file asks for beyond these would never end.
constexpr std::uint64_t mostSteps = std::uint64_t{1} << 28;
constexpr std::uint64_t mostCycles = std::uint64_t{1} << 32;
constexpr double mostSeconds = 3600;

void mark(BitVector& bits, std::size_t first, std::size_t count) { bits.copy(first, BitVector(count, true), 0, count); }

bool disables(const Isc::Use& procedure) { return procedure.name.find("disable") != std::string::npos; }

std::size_t lengthOf(const std::vector<Isc::Field>& fields) {
  std::size_t length = 0;
  for (const Isc::Field& field : fields) length += field.length;
  return length;
}

bool onlyCaptures(const Isc::Item& item) {
  return std::all_of(item.steps.begin(), item.steps.end(),
                     [](const Isc::Step& step) { return step.updates.empty() && !step.captures.empty(); });
}

}  // namespace

Result<FlowRunner::Outcome> FlowRunner::run(const Isc::Action& action, const Choice& choice, const Input& input,
                                            const Progress& progress) {
  input_ = input;
  progress_ = progress;
  const BitVector none(layout_.bits());
  outcome_ = {.found = none, .seen = none, .differing = none, .written = none};
  steps_ = doneBits_ = totalBits_ = 0;
  bool stopped = false;
  TESSEL_TRY(countBits(action, choice));
  report(0);
  for (std::size_t i = 0; i < action.procedures.size(); ++i) {
    const Isc::Use& use = action.procedures[i];
    if (!choice(use) || (stopped && !disables(use))) continue;
    const Status status = runProcedure(use);
    stopped = stopped || stopped_;
    if (status) continue;
    if (status.failure().kind != Failure::Kind::link) disable(action, choice, i);
    return status.failure();
  }
  TESSEL_TRY(loader_.chain().cable().flush());
  return std::move(outcome_);
}

/// Leaves the device's configuration mode as well as it can be done; `failed` is the procedure that ended the action.
void FlowRunner::disable(const Isc::Action& action, const Choice& choice, std::size_t failed) {
  for (std::size_t i = failed + 1; i < action.procedures.size(); ++i)
    if (const Isc::Use& use = action.procedures[i]; disables(use) && choice(use))
      if (!runProcedure(use)) return;
}

Status FlowRunner::countBits(const Isc::Action& action, const Choice& choice) {
  for (const Isc::Use& use : action.procedures) {
    if (!choice(use)) continue;
    const auto amounts = IscLayout::amounts(loader_.part().isc, use);
    if (!amounts) return amounts.failure();
    for (const IscLayout::Amount& amount : *amounts) totalBits_ += amount.total();
  }
  return {};
}

void FlowRunner::report(std::size_t bits) {
  doneBits_ += bits;
  if (progress_) progress_(std::min((doneBits_ + 7) / 8, (totalBits_ + 7) / 8), (totalBits_ + 7) / 8);
}

Status FlowRunner::runProcedure(const Isc::Use& use) {
  const Isc::Program& program = loader_.part().isc;
  const Isc::Procedure* procedure = program.findProcedure(use.name, use.array);
  if (procedure == nullptr) return Failure{.text = "the part has no procedure \"" + use.name + "\""};
  taken_.clear();
  stopped_ = false;
  for (const Isc::Use& part : procedure->flows) {
    if (stopped_) return {};
    const Isc::Flow* flow = program.findFlow(part.name, part.array);
    if (flow == nullptr) return Failure{.text = "the part has no flow \"" + part.name + "\""};
    TESSEL_TRY(runFlow(*flow));
  }
  return {};
}

Status FlowRunner::runFlow(const Isc::Flow& flow) {
  Frame frame{.flow = &flow, .variables = {}};
  loader_.checkNext();
  for (const Isc::Block& block : flow.blocks) {
    const std::uint64_t times = block.kind == Isc::Block::Kind::repeat ? block.count : 1;
    if (block.items.empty()) continue;
    for (std::uint64_t i = 0; i < times; ++i)
      for (const Isc::Item& item : block.items) {
        if (stopped_) return {};
        TESSEL_TRY(runItem(frame, item));
      }
  }
  return {};
}

Status FlowRunner::runItem(Frame& frame, const Isc::Item& item) {
  if (item.loop) return loader_.chain().cable().recordsOnly() ? recordLoop(frame, item) : runLoop(frame, item);
  tries_ = 1;
  for (const Isc::Step& step : item.steps) {
    bool matched = true;
    TESSEL_TRY(runStep(frame, step, Retry::none, matched));
    stopped_ = stopped_ || (!matched && frame.flow->exitOnError);
    if (stopped_) return {};
  }
  return {};
}

Status FlowRunner::runLoop(Frame& frame, const Isc::Item& item) {
  const std::uint64_t most = std::max<std::uint64_t>({1, item.loopLeast, item.loopMost});
  const auto taken = taken_;
  const std::uint64_t done = doneBits_;
  for (std::uint64_t pass = 1; pass <= most; ++pass) {
    taken_ = taken;
    doneBits_ = done;
    tries_ = pass;
    bool matched = true;
    for (const Isc::Step& step : item.steps)
      TESSEL_TRY(runStep(frame, step, pass == most ? Retry::last : Retry::more, matched));
    if (matched && pass >= item.loopLeast) return {};
    if (pass == most && !matched) stopped_ = frame.flow->exitOnError;
  }
  return {};
}

Status FlowRunner::recordLoop(Frame& frame, const Isc::Item& item) {
  const std::uint64_t most = std::max<std::uint64_t>({1, item.loopLeast, item.loopMost});
  const bool once = onlyCaptures(item);
  const auto taken = taken_;
  waitFactor_ = once ? most : 1;
  for (std::uint64_t pass = once ? most : 1; pass <= most; ++pass) {
    taken_ = taken;
    bool matched = true;
    for (const Isc::Step& step : item.steps)
      TESSEL_TRY(runStep(frame, step, pass == most ? Retry::last : Retry::more, matched));
  }
  waitFactor_ = 1;
  return {};
}

Status FlowRunner::runStep(Frame& frame, const Isc::Step& step, Retry retry, bool& matched) {
  using Check = InstructionLoader::Check;
  if (++steps_ > mostSteps) return failureOf(frame, step, "the action has too many steps");
  const Status loaded = loader_.load(step.instruction, step.captures.empty() ? Check::sometimes : Check::always);
  if (!loaded) {
    Failure failure = loaded.failure();
    failure.text = "flow \"" + frame.flow->name + "\": " + failure.text;
    return failure;
  }
  if (!step.updates.empty()) TESSEL_TRY(update(frame, step));
  TESSEL_TRY(wait(frame, step));
  if (step.captures.empty()) return {};
  return capture(frame, step, retry, matched);
}

Status FlowRunner::update(Frame& frame, const Isc::Step& step) {
  BitVector out;
  out.reserve(lengthOf(step.updates));
  std::size_t dataBits = 0;
  for (const Isc::Field& field : step.updates) {
    if (field.value.kind == Kind::output) return failureOf(frame, step, "an update can't be kept");
    if (field.value.kind != Kind::input) {
      out.append(frame.variables.evaluate(field));
      continue;
    }
    const Result<std::size_t> place = takeData(frame, field.length);
    if (!place) return failureOf(frame, step, place.failure().text);
    if (input_.data == nullptr) return failureOf(frame, step, "there are no data to shift in");
    out.append(field.value.complement ? ~input_.data->slice(*place, field.length)
                                      : input_.data->slice(*place, field.length));
    mark(outcome_.written, *place, field.length);
    dataBits += field.length;
  }
  TESSEL_TRY(loader_.chain().scanData(loader_.device(), {.out = out}));
  if (dataBits != 0) report(dataBits);
  return {};
}

Status FlowRunner::wait(const Frame& frame, const Isc::Step& step) {
  if (step.least.cycles > mostCycles || step.least.seconds > mostSeconds)
    return failureOf(frame, step, "the wait is longer than an hour or " + std::to_string(mostCycles) + " cycles");
  if (step.least.cycles == 0 && step.least.seconds <= 0) return {};
  return loader_.chain().cable().runTest(step.least.cycles * waitFactor_,
                                         step.least.seconds * static_cast<double>(waitFactor_));
}

Status FlowRunner::capture(Frame& frame, const Isc::Step& step, Retry retry, bool& matched) {
  const Result<Expectation> wanted = expect(frame, step);
  if (!wanted) return wanted.failure();
  const BitVector out(wanted->bits.size());
  if (loader_.chain().cable().recordsOnly()) {
    const bool compares = retry != Retry::more;
    const BitVector mask = coveredMask(step, *wanted);
    TESSEL_TRY(loader_.chain().scanData(
        loader_.device(),
        {.out = out, .expected = compares ? &wanted->bits : nullptr, .mask = compares ? &mask : nullptr}));
    return judge(frame, step, retry, *wanted, wanted->bits, matched);
  }
  BitVector found;
  TESSEL_TRY(loader_.chain().scanData(loader_.device(), {.out = out, .in = &found}));
  if (found.size() != out.size()) return failureOf(frame, step, "the cable gave an answer of another length");
  return judge(frame, step, retry, *wanted, found, matched);
}

Result<FlowRunner::Expectation> FlowRunner::expect(Frame& frame, const Isc::Step& step) {
  Expectation wanted;
  for (const Isc::Field& field : step.captures) {
    BitVector mask = field.mask ? *field.mask : BitVector(field.length, true);
    mask.resize(field.length);
    const Kind kind = field.value.kind;
    if (kind != Kind::input && kind != Kind::output) {
      wanted.places.push_back(BitVector::npos);
      wanted.bits.append(frame.variables.evaluate(field));
      wanted.mask.append(mask);
      continue;
    }
    const Result<std::size_t> place = takeData(frame, field.length);
    if (!place) return failureOf(frame, step, place.failure().text);
    if (kind == Kind::input && input_.data == nullptr)
      return failureOf(frame, step, "there are no data to compare with");
    wanted.places.push_back(*place);
    const BitVector data = kind == Kind::input ? input_.data->slice(*place, field.length) : BitVector(field.length);
    wanted.bits.append(field.value.complement ? ~data : data);
    wanted.mask.append(kind == Kind::input ? mask : BitVector(field.length));
  }
  return wanted;
}

Status FlowRunner::judge(const Frame& frame, const Isc::Step& step, Retry retry, const Expectation& wanted,
                         const BitVector& found, bool& matched) {
  std::size_t first = 0;
  for (std::size_t i = 0; i < step.captures.size(); first += step.captures[i].length, ++i) {
    const Isc::Field& field = step.captures[i];
    const BitVector bits = found.slice(first, field.length);
    const BitVector mask = wanted.mask.slice(first, field.length);
    if (wanted.places[i] != BitVector::npos) {
      keepData(field, wanted.places[i], bits, mask, retry, matched);
      continue;
    }
    const BitVector expected = wanted.bits.slice(first, field.length);
    if (firstDifference(expected, bits, &mask) == BitVector::npos) continue;
    matched = false;
    if (retry == Retry::more) continue;
    Failure failure =
        failureOf(frame, step,
                  "expected " + expected.hex() + (field.mask ? " (mask " + mask.hex() + ")" : "") + ", found " +
                      bits.hex() + (retry == Retry::last ? " after " + std::to_string(tries_) + " tries" : ""));
    failure.kind = Failure::Kind::mismatch;
    return failure;
  }
  return {};
}

void FlowRunner::keepData(const Isc::Field& field, std::size_t place, const BitVector& captured, const BitVector& mask,
                          Retry retry, bool& matched) {
  const BitVector bits = field.value.complement ? ~captured : captured;
  report(field.length);
  if (field.value.kind == Kind::output) {
    outcome_.found.copy(place, bits, 0, field.length);
    mark(outcome_.seen, place, field.length);
    return;
  }
  const bool differs = differsInCovered(place, bits, mask);
  matched = matched && !differs;
  if (retry == Retry::more && differs) return;
  for (std::size_t done = 0; done < field.length; done += BitVector::wordBits) {
    const std::size_t count = std::min(BitVector::wordBits, field.length - done);
    const std::size_t at = place + done;
    const BitVector::Word care = mask.number(done, count);
    const BitVector::Word known = outcome_.differing.number(at, count);
    const BitVector::Word now = (bits.number(done, count) ^ input_.data->number(at, count)) & care & covered(at, count);
    const BitVector::Word old = outcome_.found.number(at, count);
    // A difference stays one, whatever a later comparison of the same bits finds.
    outcome_.found.setNumber(at, count, (old & known) | (bits.number(done, count) & ~known));
    outcome_.differing.setNumber(at, count, known | now);
  }
  // Bits that the flow's own mask leaves out are no concern of the part's.
  mark(outcome_.seen, place, field.length);
}

/// The bits that are compared when the cable does it.
BitVector FlowRunner::coveredMask(const Isc::Step& step, const Expectation& wanted) const {
  BitVector mask = wanted.mask;
  std::size_t first = 0;
  for (std::size_t i = 0; i < step.captures.size(); first += step.captures[i].length, ++i) {
    if (wanted.places[i] == BitVector::npos) continue;
    for (std::size_t done = 0; done < step.captures[i].length; done += BitVector::wordBits) {
      const std::size_t count = std::min(BitVector::wordBits, step.captures[i].length - done);
      mask.setNumber(first + done, count, mask.number(first + done, count) & covered(wanted.places[i] + done, count));
    }
  }
  return mask;
}

BitVector::Word FlowRunner::covered(std::size_t place, std::size_t count) const {
  return input_.covered == nullptr ? ~BitVector::Word{0} : input_.covered->number(place, count);
}

bool FlowRunner::differsInCovered(std::size_t place, const BitVector& bits, const BitVector& mask) const {
  for (std::size_t done = 0; done < bits.size(); done += BitVector::wordBits) {
    const std::size_t count = std::min(BitVector::wordBits, bits.size() - done);
    const BitVector::Word differing = bits.number(done, count) ^ input_.data->number(place + done, count);
    if ((differing & mask.number(done, count) & covered(place + done, count)) != 0) return true;
  }
  return false;
}

/// Where the next bits of the flow's array stand in the data.
Result<std::size_t> FlowRunner::takeData(const Frame& frame, std::size_t count) {
  const std::string& name = frame.flow->array;
  const IscLayout::Array* array = layout_.find(name);
  std::size_t& taken = taken_[name];
  if (array == nullptr || count > array->size - std::min(taken, array->size))
    return Failure{.text = "the flow takes more data than the part has room for"};
  const std::size_t place = array->first + taken;
  taken += count;
  return place;
}

Failure FlowRunner::failureOf(const Frame& frame, const Isc::Step& step, const std::string& what) const {
  return {.text = "flow \"" + frame.flow->name + "\", instruction " + step.instruction + ": " + what,
          .kind = Failure::Kind::general};
}
