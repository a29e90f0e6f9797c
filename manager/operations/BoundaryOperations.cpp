// Words that work on the boundary register, the bypass register and the pins.

#include <algorithm>

#include "manager/content/DataFile.h"
#include "manager/devices/Registers.h"
#include "manager/operations/Operation.h"
#include "manager/operations/RegisterWork.h"

namespace {

constexpr std::size_t patternBits = 64;
constexpr std::uint64_t pattern = 0xA5C3'0FF0'5A3C'9669;

/// Shifts a pattern through the device's selected register, of `length` bits, and sees that it comes out again.
Status testRegister(DeviceWork& work, std::size_t length) {
  // Every other device of the chain delays it by one bit more.
  const std::size_t delay = length + work.scan().size() - 1;
  BitVector out = BitVector::fromNumber(pattern, patternBits);
  out.appendFill(delay, false);
  BitVector expected(delay);
  expected.append(out, 0, patternBits);
  BitVector mask(delay);
  mask.appendFill(patternBits, true);
  return work.scan().scanData(work.index(), {.out = out, .expected = &expected, .mask = &mask});
}

/// Loads BYPASS everywhere and sees that a pattern comes through.
Status bypass(DeviceWork& work) {
  work.status("Putting device into BYPASS...");
  TESSEL_TRY(work.scan().loadInstruction(work.index(), BitVector(work.device().irLength, true)));
  TESSEL_TRY(testRegister(work, 1));
  work.status("Device is in BYPASS");
  return {};
}

/// Loads an instruction that acts on the pins as long as it stays.
Status loadAndStay(DeviceWork& work, const char* instruction) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  work.status("Loading %s...", instruction);
  TESSEL_TRY(Registers::load(work.scan(), work.index(), **part, instruction));
  work.status("%s is loaded", instruction);
  return {};
}

Status highz(DeviceWork& work) { return loadAndStay(work, "HIGHZ"); }
Status clamp(DeviceWork& work) { return loadAndStay(work, "CLAMP"); }

/// The values that the part's file calls safe; 0 where any will do.
BitVector safeValues(const Part& part) {
  BitVector bits(part.boundary.size());
  for (std::size_t i = 0; i < part.boundary.size(); ++i) bits.set(i, part.boundary[i].safe == '1');
  return bits;
}

/// The bits of -data or -file; the safe values without either.
Result<BitVector> preloadBits(DeviceWork& work, const Part& part) {
  const std::size_t length = part.boundary.size();
  if (const char* data = work.text("-data"))
    return RegisterWork::bitsOfHex(data, length, Port::format("-data %s", data));
  const char* file = work.text("-file");
  if (file == nullptr) return safeValues(part);
  const Result<DataImage> image = DataFile::read(file, DataFile::formatOf(file).value_or(DataFile::Format::binary));
  if (!image) return image.failure();
  if (image->end() > (length + 7) / 8)
    return Failure{Port::format("%s has %d bytes, the boundary register of %s has %d bits.", file, image->end(),
                                part.name, length)};
  BitVector bits = BitVector::fromBytes(image->flatten(0, (length + 7) / 8, 0));
  bits.resize(length);
  return bits;
}

Status doPreload(DeviceWork& work) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  if ((*part)->boundary.empty())
    return Failure{Port::format("%s can't do doPreload: it has no boundary register.", (*part)->name)};
  const Result<BitVector> bits = preloadBits(work, **part);
  if (!bits) return bits.failure();
  const char* instruction = (*part)->opcode("PRELOAD") != nullptr ? "PRELOAD" : "SAMPLE";
  work.status("Preloading boundary register...");
  TESSEL_TRY(Registers::load(work.scan(), work.index(), **part, instruction));
  BitVector captured;
  TESSEL_TRY(work.scan().scanData(work.index(), {.out = *bits, .in = &captured}));
  work.status("Preloaded %d bits", bits->size());
  work.status("Boundary register captured 0x%s", captured.hex());
  return {};
}

/// The registers that every device has, tested with a pattern; the pins stay as they are.
Status functionTest(DeviceWork& work) {
  if (work.has("-file"))
    return Failure{"functionTest with a file needs a player of vector files, which is not built yet."};
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  work.status("Testing registers...");
  TESSEL_TRY(Registers::load(work.scan(), work.index(), **part, "BYPASS"));
  TESSEL_TRY(testRegister(work, 1));
  work.status("Bypass register of 1 bit passed");
  const char* instruction = (*part)->opcode("SAMPLE") != nullptr ? "SAMPLE" : "PRELOAD";
  if (!(*part)->boundary.empty() && (*part)->opcode(instruction) != nullptr) {
    TESSEL_TRY(Registers::load(work.scan(), work.index(), **part, instruction));
    TESSEL_TRY(testRegister(work, (*part)->boundary.size()));
    work.status("Boundary register of %d bits passed", (*part)->boundary.size());
  }
  return {};
}

/// The levels that bsdebug drives: those of a switch, its last one held up to `count`.
Result<BitVector> levelsOf(const UT_CMDARGS& args, const char* name, std::size_t count) {
  const UT_CMDSWINFO* given = args.getsw(name, 0);
  if (given == nullptr) return BitVector(count);
  std::string digits = given->getargtxt(0);
  // Written in the order of the clocks: the first one is bit 0.
  std::ranges::reverse(digits);
  const std::optional<BitVector> bits = BitVector::fromBinary(digits);
  if (!bits || bits->empty() || bits->size() > count)
    return Failure{
        Port::format("%s %s is not what was expected: up to %d levels, 0 or 1.", name, given->getargtxt(0), count)};
  BitVector levels = *bits;
  levels.appendFill(count - levels.size(), levels.get(levels.size() - 1));
  return levels;
}

constexpr std::int32_t mostClocks = 1 << 20;

/// A count behind a switch, from 1 to `mostClocks`; `otherwise` without the switch.
Result<std::int32_t> countOf(const UT_CMDARGS& args, const char* name, std::int32_t otherwise) {
  const UT_CMDSWINFO* given = args.getsw(name, 0);
  if (given == nullptr) return otherwise;
  const std::int32_t count = given->getargnum32(0);
  if (count >= 1 && count <= mostClocks) return count;
  return Failure{Port::format("%s %d is not what was expected: 1 to %d.", name, count, mostClocks)};
}

/// As many clocks as the longer one of the switches has levels.
std::int32_t levelsGiven(const UT_CMDARGS& args) {
  std::size_t most = 0;
  for (const char* name : {"-tms", "-tdi"})
    if (const UT_CMDSWINFO* given = args.getsw(name, 0))
      most = std::max(most, std::string_view(given->getargtxt(0)).size());
  return static_cast<std::int32_t>(most);
}

Status resetTaps(OperationContext& context) {
  TESSEL_TRY(context.cable.goTo(TapState::reset));
  reportStatus("TAPs are in Test-Logic-Reset\n");
  return {};
}

Status clockByHand(OperationContext& context, const UT_CMDARGS& args, std::size_t count, std::int32_t times) {
  const Result<BitVector> tms = levelsOf(args, "-tms", count);
  if (!tms) return tms.failure();
  const Result<BitVector> tdi = levelsOf(args, "-tdi", count);
  if (!tdi) return tdi.failure();
  for (std::int32_t i = 0; i < times; ++i) {
    BitVector tdo;
    TESSEL_TRY(context.cable.clock(*tms, *tdi, &tdo));
    std::string levels = tdo.binary();
    std::ranges::reverse(levels);
    reportStatus("TDO is %s\n", levels);
  }
  return {};
}

Status bsdebug(OperationContext& context, const UT_CMDARGS& args) {
  const Result<std::int32_t> count = countOf(args, "-tck", levelsGiven(args));
  if (!count) return count.failure();
  const Result<std::int32_t> times = countOf(args, "-loop", 1);
  if (!times) return times.failure();
  const bool before = args.findsw("-start") || args.findsw("-reset");
  const bool after = args.findsw("-stop");
  if (*count == 0 && !before && !after) return Failure{"bsdebug needs -start, -reset, -stop, -tms, -tdi or -tck."};
  if (std::int64_t{*count} * *times > mostClocks)
    return Failure{Port::format("bsdebug clocks at most %d times, not %d times %d.", mostClocks, *times, *count)};
  if (before) TESSEL_TRY(resetTaps(context));
  if (*count > 0) TESSEL_TRY(clockByHand(context, args, static_cast<std::size_t>(*count), *times));
  if (after) TESSEL_TRY(resetTaps(context));
  return context.cable.flush();
}

constexpr OperationRow rows[] = {
    {"bypass", bypass},
    {"highz", highz},
    {"clamp", clamp},
    {"doPreload", doPreload},
    {"functionTest", functionTest},
    {"bsdebug", nullptr, false, bsdebug},
};

}  // namespace

const std::span<const OperationRow> boundaryOperations = rows;
