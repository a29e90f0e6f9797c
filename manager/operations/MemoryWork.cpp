#include "manager/operations/MemoryWork.h"

#include <algorithm>

#include "manager/content/DataFile.h"

namespace {

Result<std::unique_ptr<Memory>> spiMemory(DeviceWork& work, const PartPointer& part) {
  const ChainDevice& device = work.device();
  if (!device.spiFlash) return Failure{Port::format("No SPI flash is attached to %s. Use attachFlash.", device.name)};
  const SpiFlashPart* flash = FlashParts::findSpi(device.spiFlash->partName);
  return makeSpiFlash(work.scan(), work.index(), part, flash);
}

Result<std::unique_ptr<Memory>> bpiMemory(DeviceWork& work, const PartPointer& part) {
  const ChainDevice& device = work.device();
  if (!device.bpiFlash) return Failure{Port::format("No BPI flash is attached to %s. Use attachFlash.", device.name)};
  const auto width = device.bpiFlash->stored.values.find(DeviceNS::BPI_WIDTH);
  const bool own = width != device.bpiFlash->stored.values.end();
  const BpiFlashPart* flash = FlashParts::findBpi(device.bpiFlash->partName);
  return makeBpiFlash(work.scan(), work.index(), part, flash,
                      own ? std::stoi(width->second) : work.context().multibootBpiWidth);
}

const std::string& assignedFile(DeviceWork& work) {
  const ChainDevice& device = work.device();
  if (work.spiOnly() && device.spiFlash) return device.spiFlash->file;
  if (work.bpiOnly() && device.bpiFlash) return device.bpiFlash->file;
  return device.file;
}

Result<MemoryWork::Source> dataOfSwitch(const char* digits) {
  const std::string text = digits;
  if (text.empty() || text.size() % 2 != 0)
    return Failure{Port::format("-data %s is not what was expected: two hex digits a byte.", text)};
  const Result<DataImage> image = DataFile::parse("-data", text, DataFile::Format::hex);
  if (!image) return image.failure();
  return MemoryWork::Source{*image, "the data of -data"};
}

/// Moves an image to the place of the revision that a command names.
Status moveToRevision(DeviceWork& work, const Memory& memory, MemoryWork::Source& source) {
  const Result<std::optional<MemoryWork::Region>> region = MemoryWork::revision(work, memory);
  if (!region) return region.failure();
  if (!*region) return {};
  const auto [first, size] = **region;
  if (source.image.end() > size)
    return Failure{Port::format("%s has %d bytes, a revision of %s has room for %d.", source.name, source.image.end(),
                                memory.name(), size)};
  DataImage moved;
  for (const auto& [address, bytes] : source.image.runs()) moved.add(address + first, bytes);
  source.image = std::move(moved);
  return {};
}

}  // namespace

Result<std::unique_ptr<Memory>> MemoryWork::memory(DeviceWork& work) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  if (work.spiOnly() && work.bpiOnly()) return Failure{"-spionly and -bpionly exclude each other."};
  Result<std::unique_ptr<Memory>> memory = work.spiOnly()   ? spiMemory(work, *part)
                                           : work.bpiOnly() ? bpiMemory(work, *part)
                                                            : makeIscMemory(work.scan(), work.index(), *part);
  if (!memory) return memory;
  if (const Status opened = (*memory)->open(); !opened) return opened.failure();
  return memory;
}

Result<MemoryWork::Source> MemoryWork::source(DeviceWork& work, const Memory& memory) {
  const char* data = work.text("-data");
  const char* given = work.text("-file");
  if (data != nullptr && given != nullptr) return Failure{"-data and -file exclude each other."};
  const std::string file = given != nullptr ? given : assignedFile(work);
  if (data == nullptr && file.empty())
    return Failure{Port::format("%s needs a file, and none is assigned to %s.", work.args().getcmd(), memory.name())};
  Result<Source> source = Failure{};
  if (data != nullptr) {
    source = dataOfSwitch(data);
  } else {
    const Result<DataImage> image = DataFile::read(file, DataFile::formatOf(file).value_or(DataFile::Format::binary));
    if (!image) return image.failure();
    source = Source{*image, file};
  }
  if (!source) return source;
  if (source->image.empty()) return Failure{Port::format("%s holds no data.", source->name)};
  if (const Status moved = moveToRevision(work, memory, *source); !moved) return moved.failure();
  return source;
}

Result<std::optional<MemoryWork::Region>> MemoryWork::revision(DeviceWork& work, const Memory& memory) {
  const UT_CMDSWINFO* given = work.args().getsw("-revision", 0);
  if (given == nullptr) return std::optional<Region>();
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  const std::size_t revisions = work.spiOnly() || work.bpiOnly() ? 0 : (*part)->revisions;
  if (revisions == 0) return Failure{Port::format("%s keeps one revision only.", memory.name())};
  const std::int32_t number = given->getargnum32(0);
  if (number < 0 || static_cast<std::size_t>(number) >= revisions)
    return Failure{Port::format("%s has no revision %d, expected 0 to %d.", memory.name(), number, revisions - 1)};
  const std::uint64_t size = memory.size() / revisions;
  return std::optional(Region{size * static_cast<std::uint64_t>(number), size});
}

Result<DataImage> MemoryWork::withOthers(DeviceWork& work, Memory& memory, const Region& region,
                                         const DataImage* data) {
  Result<std::vector<std::uint8_t>> bytes = memory.read(0, memory.size(), work.progress());
  if (!bytes) return bytes.failure();
  const auto place = bytes->begin() + static_cast<std::ptrdiff_t>(region.first);
  std::fill_n(place, region.size, std::uint8_t{0xFF});
  if (data != nullptr) {
    const std::vector<std::uint8_t> own = data->flatten(region.first, region.size);
    std::ranges::copy(own, place);
  }
  DataImage image;
  image.add(0, *bytes);
  return image;
}

std::string MemoryWork::shown(const Comparison& comparison) {
  return Port::format("%d of %d bytes differ, the first at address 0x%08X: expected 0x%02X, found 0x%02X",
                      comparison.differences, comparison.compared, comparison.firstAddress, comparison.expected,
                      comparison.found);
}
