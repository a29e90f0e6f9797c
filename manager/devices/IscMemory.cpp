#include "manager/devices/IscMemory.h"

#include <algorithm>
#include <string_view>

#include "manager/content/Bitstream.h"

namespace {

bool names(const Isc::Use& procedure, std::string_view what) { return procedure.name.find(what) != std::string::npos; }

/// Which procedures run: those that always do; those that are recommended, but none that erases unless it is wanted;
/// of the optional ones those that erase or verify when it is wanted.
bool chosen(const Isc::Use& procedure, bool erase, bool verify) {
  if (procedure.choice == Isc::Use::Choice::always) return true;
  if (names(procedure, "erase")) return erase;
  if (procedure.choice == Isc::Use::Choice::recommended) return true;
  return verify && names(procedure, "verify");
}

FlowRunner::Choice choose(bool erase, bool verify) {
  return [=](const Isc::Use& procedure) { return chosen(procedure, erase, verify); };
}

bool runs(const Isc::Action& action, std::string_view what, const FlowRunner::Choice& choice) {
  return std::any_of(action.procedures.begin(), action.procedures.end(),
                     [&](const Isc::Use& use) { return names(use, what) && choice(use); });
}

Failure lacks(const Part& part, const std::string& action) {
  return {.text = part.name + " has no ISC action \"" + action + "\"", .kind = Failure::Kind::general};
}

std::uint8_t byteAt(const BitVector& bits, std::size_t byte) {
  return static_cast<std::uint8_t>(bits.number(byte * 8, std::min<std::size_t>(8, bits.size() - byte * 8)));
}

/// How many bytes have a bit in `wanted` but none in `there`.
std::uint64_t missingBytes(const BitVector& wanted, const BitVector& there) {
  const std::vector<std::uint8_t> left = wanted.bytes();
  const std::vector<std::uint8_t> right = there.bytes();
  std::uint64_t missing = 0;
  for (std::size_t i = 0; i < left.size(); ++i) missing += left[i] != 0 && (left[i] & right[i]) == 0 ? 1U : 0U;
  return missing;
}

}  // namespace

const IscMemory::Actions IscMemory::memoryActions = {"program", "verify", "read", "erase"};
const IscMemory::Actions IscMemory::configurationActions = {"configure", "configure_verify", "configure_read",
                                                            "configure_erase"};

Result<std::unique_ptr<Memory>> makeIscMemory(ScanChain& chain, std::size_t device, PartPointer part) {
  return IscMemory::make(chain, device, std::move(part));
}

Result<std::unique_ptr<Memory>> IscMemory::make(ScanChain& chain, std::size_t device, PartPointer part) {
  if (part->isc.empty()) return Failure{.text = part->name + " has no ISC actions, so it can't be programmed"};
  auto memory = std::unique_ptr<IscMemory>(new IscMemory(chain, device, std::move(part)));
  Result<Region> own = region(*memory->part_, memoryActions);
  if (!own) return own.failure();
  memory->memory_ = *own;
  memory->configuration_ = *own;
  if (memory->part_->isc.findAction(configurationActions.program) != nullptr) {
    Result<Region> other = region(*memory->part_, configurationActions);
    if (!other) return other.failure();
    memory->configuration_ = *other;
  }
  return std::unique_ptr<Memory>(std::move(memory));
}

Result<IscMemory::Region> IscMemory::region(const Part& part, const Actions& actions) {
  Result<IscLayout> layout = IscLayout::make(part.isc, {actions.program, actions.verify, actions.read});
  if (!layout) return Failure{.text = part.name + ": " + layout.failure().text};
  if (layout->bits() == 0)
    return Failure{.text = part.name + ": none of its ISC actions to program, verify or read takes data"};
  if (part.memoryBits != 0 && layout->bits() > part.memoryBits)
    return Failure{.text = part.name + ": its ISC actions take " + std::to_string(layout->bits()) +
                           " bits, its memory has " + std::to_string(part.memoryBits)};
  const std::size_t bits = part.memoryBits != 0 ? part.memoryBits : layout->bits();
  return Region{.actions = actions, .layout = *layout, .bits = bits};
}

Status IscMemory::open() { return loader_.checkIdcode(); }

Status IscMemory::check(const DataImage& data) { return checkFor(memory_, data); }

Status IscMemory::checkFor(const Region& region, const DataImage& data) const {
  TESSEL_TRY(DataCompare::fits(data, sizeOf(region)));
  if (data.end() * 8 > region.layout.bits() + 7)
    return Failure{.text = "the ISC actions of " + part_->name + " reach " + std::to_string(region.layout.bits() / 8) +
                           " bytes only, the data have " + std::to_string(data.end())};
  TESSEL_TRY(checkLastByte(region, data));
  return part_->kind == Part::Kind::fpga ? checkBitstream(region, data) : Status();
}

/// A memory may end inside a byte. What the data have beyond must be filling.
Status IscMemory::checkLastByte(const Region& region, const DataImage& data) {
  const std::size_t used = region.layout.bits() % 8;
  const std::uint64_t last = region.layout.bits() / 8;
  if (used == 0 || data.end() <= last) return {};
  const auto beyond = static_cast<std::uint8_t>(data.flatten(last, 1)[0] >> used);
  if (beyond == 0 || beyond == 0xFF >> used) return {};
  return Failure{.text = "the memory has only the lowest " + std::to_string(used) + " bits of the byte at address " +
                         DataCompare::hex(last) + ", expected the others to be zeros or ones"};
}

/// The device would refuse such data, but only after its memory was erased.
Status IscMemory::checkBitstream(const Region& region, const DataImage& data) const {
  const std::vector<std::uint8_t> bytes = data.flatten(0, sizeOf(region));
  const auto header = Bitstream::header(bytes);
  if (!header)
    return Failure{.text = "the data are no bitstream for " + part_->name +
                           ": they do not begin with a bitstream header (\"TSLB\")"};
  const BitVector idcode = BitVector::fromNumber(header->idcode, 32);
  const bool fits = part_->idcodes.empty() ||
                    std::any_of(part_->idcodes.begin(), part_->idcodes.end(), [&](const BitPattern& pattern) {
                      BitPattern unversioned = pattern;
                      unversioned.care.setNumber(28, 4, 0);
                      return unversioned.matches(idcode);
                    });
  if (!fits)
    return Failure{.text = "the bitstream is for a part with IDCODE " + idcode.hex() + ", not for " + part_->name};
  if (header->length != bytes.size())
    return Failure{.text = "the bitstream says it has " + std::to_string(header->length) + " bytes, expected " +
                           std::to_string(bytes.size()) + " for " + part_->name};
  const char* why = nullptr;
  if (Bitstream::isValid(bytes, header->idcode, bytes.size(), &why)) return {};
  return Failure{.text = "the data are no bitstream for " + part_->name + ": " + why};
}

Result<FlowRunner::Outcome> IscMemory::run(const Region& region, const char* action, const FlowRunner::Choice& choice,
                                           const DataBits* bits, const Progress& progress) {
  const Isc::Action* found = part_->isc.findAction(action);
  if (found == nullptr) return lacks(*part_, action);
  FlowRunner runner(loader_, region.layout);
  FlowRunner::Input input;
  if (bits != nullptr) input = {.data = &bits->data, .covered = &bits->covered};
  return runner.run(*found, choice, input, progress);
}

Status IscMemory::erase(const DataImage* /*data*/, const Progress& progress) {
  TESSEL_TRY(runErase(memory_, progress));
  return refuseErrors();
}

Status IscMemory::runErase(const Region& region, const Progress& progress) {
  const auto outcome = run(region, region.actions.erase, choose(true, true), nullptr, progress);
  return outcome ? Status() : outcome.failure();
}

Status IscMemory::program(const DataImage& data, const ProgramOptions& options, const Progress& progress) {
  if (!options.key.empty()) return Failure{.text = part_->name + " takes no encryption key with its data"};
  const Region& region = options.onlyFpga ? configuration_ : memory_;
  const Isc::Action* action = part_->isc.findAction(region.actions.program);
  if (action == nullptr) return lacks(*part_, region.actions.program);
  TESSEL_TRY(checkFor(region, data));
  TESSEL_TRY(checkProtection(options));

  const FlowRunner::Choice choice = choose(options.erase, options.verify);
  if (options.erase && !runs(*action, "erase", choice)) TESSEL_TRY(runErase(region, progress));
  const DataBits bits = DataBits::of(data, region.layout.bits());
  const auto outcome = run(region, region.actions.program, choice, &bits, progress);
  if (!outcome) return outcome.failure();
  const bool verified = runs(*action, "verify", choice);
  if (options.verify) TESSEL_TRY(refuseReadProtected());
  TESSEL_TRY(judge(region, bits, *outcome, verified));
  TESSEL_TRY(refuseErrors());
  if (!options.verify) return {};
  if (!verified) {
    const Result<Comparison> comparison = compareBits(region, bits, progress);
    if (!comparison) return comparison.failure();
    if (!comparison->equal()) return DataCompare::failure(*comparison);
  }
  return loader_.checkIdcode();
}

/// Whether everything went in and, if it was looked at, is found right.
Status IscMemory::judge(const Region& region, const DataBits& bits, const FlowRunner::Outcome& outcome,
                        bool verified) const {
  if (const std::uint64_t missing = missingBytes(bits.covered, outcome.written); missing != 0)
    return Failure{.text = "the action \"" + std::string(region.actions.program) + "\" of " + part_->name +
                           " did not program " + std::to_string(missing) + " bytes of the data"};
  if (!verified && outcome.differing.count() == 0) return {};
  const Result<Comparison> comparison = comparisonOf(bits, outcome);
  if (!comparison) return comparison.failure();
  return comparison->equal() ? Status() : DataCompare::failure(*comparison);
}

/// Fails when nothing differs although not every byte was looked at.
Result<Comparison> IscMemory::comparisonOf(const DataBits& bits, const FlowRunner::Outcome& outcome) const {
  Comparison comparison;
  const std::vector<std::uint8_t> covered = bits.covered.bytes();
  const std::vector<std::uint8_t> seen = outcome.seen.bytes();
  const std::vector<std::uint8_t> differing = outcome.differing.bytes();
  for (std::size_t i = 0; i < covered.size(); ++i) {
    if ((covered[i] & seen[i]) != 0) ++comparison.compared;
    if (differing[i] == 0 || comparison.differences++ != 0) continue;
    comparison.firstAddress = i;
    comparison.expected = byteAt(bits.data, i);
    comparison.found = byteAt(outcome.found, i);
  }
  if (comparison.differences == 0)
    if (const std::uint64_t missing = missingBytes(bits.covered, outcome.seen); missing != 0)
      return Failure{.text = "the ISC actions of " + part_->name + " left " + std::to_string(missing) +
                             " bytes of the data uncompared"};
  return comparison;
}

Result<Comparison> IscMemory::compareBits(const Region& region, const DataBits& bits, const Progress& progress) {
  TESSEL_TRY(refuseReadProtected());
  const bool verifies = part_->isc.findAction(region.actions.verify) != nullptr;
  // What is only read can't be compared by a cable that gives no answers.
  if (!verifies && loader_.chain().cable().recordsOnly()) return lacks(*part_, region.actions.verify);
  const char* action = verifies ? region.actions.verify : region.actions.read;
  auto outcome = run(region, action, choose(false, true), &bits, progress);
  if (!outcome) return outcome.failure();
  if (!verifies) outcome->differing = bits.difference(outcome->found, outcome->seen);
  return comparisonOf(bits, *outcome);
}

Result<Comparison> IscMemory::compare(const DataImage& data, const Progress& progress) {
  TESSEL_TRY(DataCompare::fits(data, sizeOf(memory_)));
  if (data.end() * 8 > memory_.layout.bits() + 7)
    return Failure{.text = "the ISC actions of " + part_->name + " do not reach all of the data"};
  TESSEL_TRY(checkLastByte(memory_, data));
  return compareBits(memory_, DataBits::of(data, memory_.layout.bits()), progress);
}

Result<Comparison> IscMemory::blankCheck(const Progress& progress) {
  return compareBits(memory_, DataBits::blank(memory_.layout.bits()), progress);
}

Result<std::vector<std::uint8_t>> IscMemory::read(std::uint64_t first, std::uint64_t count, const Progress& progress) {
  TESSEL_TRY(DataCompare::inside(first, count, size()));
  TESSEL_TRY(refuseReadProtected());
  const auto outcome = run(memory_, memory_.actions.read, choose(false, false), nullptr, progress);
  if (!outcome) return outcome.failure();
  BitVector wanted(size() * 8);
  wanted.copy(first * 8, BitVector(count * 8, true), 0, count * 8);
  BitVector seen = outcome->seen;
  seen.resize(wanted.size());
  if (const std::uint64_t missing = missingBytes(wanted, seen); missing != 0)
    return Failure{.text = "the action \"" + std::string(memory_.actions.read) + "\" of " + part_->name +
                           " leaves out " + std::to_string(missing) + " of the bytes"};
  const std::vector<std::uint8_t> bytes = outcome->found.bytes();
  const auto from = bytes.begin() + static_cast<std::ptrdiff_t>(first);
  return std::vector<std::uint8_t>(from, from + static_cast<std::ptrdiff_t>(count));
}

/// What the device's status says against the work that is about to begin. Erasing takes protection away.
Status IscMemory::checkProtection(const ProgramOptions& options) {
  if (options.erase) return {};
  const Result<std::uint64_t> writeProtected = loader_.field("status", "write-protected");
  if (!writeProtected) return writeProtected.failure();
  if (*writeProtected != 0) return Failure{.text = part_->name + " is write-protected: erase it first"};
  return options.verify ? refuseReadProtected() : Status();
}

Status IscMemory::refuseReadProtected() {
  const Result<std::uint64_t> readProtected = loader_.field("status", "read-protected");
  if (!readProtected) return readProtected.failure();
  if (*readProtected == 0) return {};
  return Failure{.text = part_->name + " is read-protected: what it holds can't be read or verified"};
}

Status IscMemory::refuseErrors() {
  const Result<std::uint64_t> error = loader_.field("status", "error");
  if (!error) return error.failure();
  if (*error == 0) return {};
  return Failure{.text = part_->name + " reports an error in its status register"};
}
