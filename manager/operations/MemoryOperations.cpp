// Words that erase, program, compare and read memories.

#include <algorithm>
#include <numeric>
#include <vector>

#include "manager/content/DataFile.h"
#include "manager/operations/MemoryWork.h"
#include "manager/operations/RegisterWork.h"

namespace {

std::uint64_t bytesOf(const DataImage& image) {
  std::uint64_t count = 0;
  for (const auto& [address, bytes] : image.runs()) count += bytes.size();
  return count;
}

/// What the codes that go with `program` say, known to be possible before anything is changed.
Result<std::vector<RegisterWork::Write>> codesOf(DeviceWork& work) {
  std::vector<RegisterWork::Write> writes;
  for (const char* name : {"-usercode", "-ues"}) {
    const char* value = work.text(name);
    if (value == nullptr) continue;
    const Result<RegisterWork::Write> write = RegisterWork::prepare(work, name, value);
    if (!write) return write.failure();
    writes.push_back(*write);
  }
  return writes;
}

Status programWith(DeviceWork& work, bool onlyFpga) {
  Result<std::unique_ptr<Memory>> memory = MemoryWork::memory(work);
  if (!memory) return memory.failure();
  const Result<MemoryWork::Source> source = MemoryWork::source(work, **memory);
  if (!source) return source.failure();
  if (work.has("-key")) return Failure{Port::format("%s takes no encryption key.", (*memory)->name())};
  TESSEL_TRY((*memory)->check(source->image));
  const Result<std::vector<RegisterWork::Write>> codes = codesOf(work);
  if (!codes) return codes.failure();
  const Memory::ProgramOptions options{.erase = work.has("-e") || onlyFpga,
                                       .verify = work.has("-v"),
                                       .onlyFpga = onlyFpga || work.has("-onlyFpga"),
                                       .key = {}};
  const Result<std::optional<MemoryWork::Region>> region = MemoryWork::revision(work, **memory);
  if (!region) return region.failure();
  work.status("Programming %s with %s...", (*memory)->name(), source->name);
  // Erasing takes all revisions: the others are written again.
  const bool keepsOthers = region->has_value() && options.erase;
  const Result<DataImage> image =
      keepsOthers ? MemoryWork::withOthers(work, **memory, **region, &source->image) : source->image;
  if (!image) return image.failure();
  TESSEL_TRY((*memory)->program(*image, options, work.progress()));
  work.status("Programmed %d bytes", bytesOf(source->image));
  if (options.verify) work.status("Verified %d bytes", bytesOf(source->image));
  for (const RegisterWork::Write& write : *codes) TESSEL_TRY(RegisterWork::write(work, write));
  return {};
}

Status program(DeviceWork& work) { return programWith(work, false); }

Status reconfigure(DeviceWork& work) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  if ((*part)->kind != Part::Kind::fpga)
    return Failure{Port::format("%s can't do reconfigureOTF: it is no FPGA.", (*part)->name)};
  return programWith(work, true);
}

Status verify(DeviceWork& work) {
  Result<std::unique_ptr<Memory>> memory = MemoryWork::memory(work);
  if (!memory) return memory.failure();
  const Result<MemoryWork::Source> source = MemoryWork::source(work, **memory);
  if (!source) return source.failure();
  TESSEL_TRY((*memory)->check(source->image));
  work.status("Verifying %s with %s...", (*memory)->name(), source->name);
  const Result<Comparison> result = (*memory)->compare(source->image, work.progress());
  if (!result) return result.failure();
  if (!result->equal())
    return Failure{Port::format("Verify of %s failed: %s.", (*memory)->name(), MemoryWork::shown(*result)),
                   Failure::Kind::mismatch};
  work.status("Verified %d bytes", result->compared);
  return {};
}

/// Erasing takes all revisions: the others are written again.
Status eraseRevision(DeviceWork& work, Memory& memory, const MemoryWork::Region& region) {
  work.status("Erasing a revision of %s...", memory.name());
  const Result<DataImage> others = MemoryWork::withOthers(work, memory, region, nullptr);
  if (!others) return others.failure();
  TESSEL_TRY(memory.program(*others, {.erase = true, .verify = true, .onlyFpga = false, .key = {}}, work.progress()));
  work.status("Erased %d bytes of %s", region.size, memory.name());
  return {};
}

Status erase(DeviceWork& work) {
  Result<std::unique_ptr<Memory>> memory = MemoryWork::memory(work);
  if (!memory) return memory.failure();
  const Result<std::optional<MemoryWork::Region>> revision = MemoryWork::revision(work, **memory);
  if (!revision) return revision.failure();
  if (*revision) return eraseRevision(work, **memory, **revision);
  std::optional<MemoryWork::Source> region;
  if (work.has("-file")) {
    Result<MemoryWork::Source> source = MemoryWork::source(work, **memory);
    if (!source) return source.failure();
    region = std::move(*source);
    TESSEL_TRY((*memory)->check(region->image));
  }
  work.status("Erasing %s...", (*memory)->name());
  TESSEL_TRY((*memory)->erase(region ? &region->image : nullptr, work.progress()));
  work.status("Erased %s", (*memory)->name());
  return {};
}

Result<Comparison> blankCheckOf(DeviceWork& work, Memory& memory, const MemoryWork::Region& region) {
  DataImage blank;
  blank.add(region.first, std::vector<std::uint8_t>(region.size, 0xFF));
  return memory.compare(blank, work.progress());
}

Status blankCheck(DeviceWork& work) {
  Result<std::unique_ptr<Memory>> memory = MemoryWork::memory(work);
  if (!memory) return memory.failure();
  const Result<std::optional<MemoryWork::Region>> revision = MemoryWork::revision(work, **memory);
  if (!revision) return revision.failure();
  work.status("Blank check of %s...", (*memory)->name());
  const Result<Comparison> result =
      *revision ? blankCheckOf(work, **memory, **revision) : (*memory)->blankCheck(work.progress());
  if (!result) return result.failure();
  if (!result->equal())
    return Failure{Port::format("%s is not blank: %s.", (*memory)->name(), MemoryWork::shown(*result)),
                   Failure::Kind::mismatch};
  work.status("%s is blank", (*memory)->name());
  return {};
}

Status checksum(DeviceWork& work) {
  Result<std::unique_ptr<Memory>> memory = MemoryWork::memory(work);
  if (!memory) return memory.failure();
  const Result<std::optional<MemoryWork::Region>> revision = MemoryWork::revision(work, **memory);
  if (!revision) return revision.failure();
  const MemoryWork::Region region = revision->value_or(MemoryWork::Region{0, (*memory)->size()});
  work.status("Calculating checksum of %s...", (*memory)->name());
  const auto bytes = (*memory)->read(region.first, region.size, work.progress());
  if (!bytes) return bytes.failure();
  work.status("Checksum is 0x%08X", std::accumulate(bytes->begin(), bytes->end(), std::uint32_t{0}));
  return {};
}

/// A number behind a switch, or the value that stands for its absence.
Result<std::uint64_t> number(DeviceWork& work, const char* name, std::uint64_t otherwise) {
  const UT_CMDSWINFO* given = work.args().getsw(name, 0);
  if (given == nullptr) return otherwise;
  const std::int32_t value = given->getargnum32(0);
  if (value < 0) return Failure{Port::format("%s %d is not what was expected: 0 or more.", name, value)};
  return static_cast<std::uint64_t>(value);
}

Result<DataFile::Format> outputFormat(DeviceWork& work, const std::string& file) {
  const char* name = work.text("-format");
  const auto format = name != nullptr ? DataFile::formatByName(name) : DataFile::formatOf(file);
  if (format && *format != DataFile::Format::ascii) return *format;
  return Failure{
      Port::format("The format of %s is not known, expected the extension mcs, exo, hex or bin, or -format "
                   "with one of them.",
                   file)};
}

Status readback(DeviceWork& work) {
  const char* file = work.text("-file");
  if (file == nullptr) return Failure{"readbacktofile needs -file."};
  if (const UT_CMDSWINFO* positions = work.args().getsw("-p", 0);
      positions != nullptr && positions->getnumargs() > 1 && !work.has("-target"))
    return Failure{"readbacktofile writes one file, so it takes one position."};
  const Result<DataFile::Format> format = outputFormat(work, file);
  if (!format) return format.failure();
  Result<std::unique_ptr<Memory>> memory = MemoryWork::memory(work);
  if (!memory) return memory.failure();
  const std::uint64_t size = (*memory)->size();
  const Result<std::uint64_t> start = number(work, "-start", 0);
  if (!start) return start.failure();
  const Result<std::uint64_t> count = number(work, "-size", size - std::min(*start, size));
  if (!count) return count.failure();
  if (*count == 0 || *start + *count > size)
    return Failure{
        Port::format("%d bytes from %d on are not in %s, which has %d.", *count, *start, (*memory)->name(), size)};
  work.status("Reading %s...", (*memory)->name());
  const auto bytes = (*memory)->read(*start, *count, work.progress());
  if (!bytes) return bytes.failure();
  DataImage image;
  // A binary file has no addresses: it begins with the first byte asked for.
  const bool addressed = *format == DataFile::Format::intelHex || *format == DataFile::Format::sRecord;
  image.add(addressed ? *start : 0, *bytes);
  TESSEL_TRY(DataFile::write(file, image, *format));
  work.status("Read %d bytes into %s", *count, file);
  return {};
}

constexpr OperationRow rows[] = {
    {"program", program},
    {"verify", verify},
    {"erase", erase},
    {"blankCheck", blankCheck},
    {"checksum", checksum},
    {"readbacktofile", readback},
    {"reconfigureOTF", reconfigure},
};

}  // namespace

const std::span<const OperationRow> memoryOperations = rows;
