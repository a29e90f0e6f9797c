#include "manager/devices/BpiFlashMemory.h"

#include <algorithm>

namespace {

Failure fail(const std::string& text) { return {.text = text, .kind = Failure::Kind::general}; }

std::string text(const BpiCommands::Id& id) {
  return DataCompare::hex(id.maker, 4).substr(2) + " " + DataCompare::hex(id.device, 4).substr(2);
}

bool has(const BpiFlashPart& part, const BpiCommands::Id& id, int width) {
  const std::uint16_t lines = width == 8 ? 0xFF : 0xFFFF;
  return id.maker == (part.maker & lines) && id.device == (part.device & lines);
}

}  // namespace

Result<std::unique_ptr<Memory>> makeBpiFlash(ScanChain& chain, std::size_t device, PartPointer part,
                                             const BpiFlashPart* flash, int width) {
  if (part->bridge.bpiInstruction.empty()) return fail(part->name + " has no bridge to a BPI flash");
  if (width != 8 && width != 16) return fail("a BPI flash has 8 or 16 data lines, not " + std::to_string(width));
  return std::unique_ptr<Memory>(std::make_unique<BpiFlashMemory>(chain, device, std::move(part), flash, width));
}

BpiFlashMemory::BpiFlashMemory(ScanChain& chain, std::size_t device, PartPointer part, const BpiFlashPart* flash,
                               int width)
    : FlashMemory(chain, device, std::move(part)),
      bus_(loader()),
      width_(width),
      cycleBytes_(static_cast<std::uint32_t>(width / 8)),
      flash_(flash) {}

Status BpiFlashMemory::open() {
  if (cable().recordsOnly()) return fail("a BPI flash needs a cable that gives answers");
  TESSEL_TRY(loader().checkIdcode());
  TESSEL_TRY(select());
  TESSEL_TRY(identify());
  const auto told = commands_->query();
  if (!told) return told.failure();
  // Parts of one id may have buffers of several sizes.
  bufferSize_ = flash_->bufferSize;
  if (told->bufferSize != 0)
    bufferSize_ = static_cast<std::uint32_t>(std::min<std::uint64_t>(bufferSize_, told->bufferSize));
  if (told->size == 0 || told->size == flash_->size) return {};
  return fail("the BPI flash says it has " + std::to_string(told->size) + " bytes, expected " +
              std::to_string(flash_->size) + " of " + flash_->name);
}

Status BpiFlashMemory::identify() {
  std::string seen;
  for (const BpiFlashPart::Commands kind : {BpiFlashPart::Commands::intel, BpiFlashPart::Commands::amd}) {
    if (flash_ != nullptr && flash_->commands != kind) continue;
    commands_ = BpiCommands::make(kind, bus_, cable(), width_);
    TESSEL_TRY(commands_->reset());
    const auto id = commands_->readId();
    if (!id) return id.failure();
    if (flash_ != nullptr) {
      if (has(*flash_, *id, width_)) return {};
      return fail("the BPI flash has the id " + text(*id) + ", expected " +
                  text({.maker = flash_->maker, .device = flash_->device}) + " of " + flash_->name);
    }
    for (const BpiFlashPart& part : FlashParts::bpi())
      if (part.commands == kind && has(part, *id, width_)) {
        flash_ = &part;
        return {};
      }
    seen += (seen.empty() ? "" : " or ") + text(*id);
  }
  return fail("there is no BPI flash that is known: its id reads as " + seen);
}

std::uint32_t BpiFlashMemory::blockSize() const {
  // Without a buffer any size will do.
  constexpr std::uint32_t unbuffered = 512;
  return bufferSize_ == 0 ? unbuffered : bufferSize_;
}

Status BpiFlashMemory::eraseAll() {
  for (std::uint64_t address = 0; address < size(); address += sectorSize()) {
    TESSEL_TRY(select());
    TESSEL_TRY(eraseSector(address));
  }
  return {};
}

Status BpiFlashMemory::eraseSector(std::uint64_t address) { return commands_->eraseSector(cycleOf(address)); }

Status BpiFlashMemory::programBlock(std::uint64_t address, std::span<const std::uint8_t> bytes) {
  // A byte beside the data stays as it is: ones change nothing.
  std::vector<std::uint16_t> data((address % cycleBytes_ + bytes.size() + cycleBytes_ - 1) / cycleBytes_, 0xFFFF);
  for (std::size_t i = 0; i < bytes.size(); ++i) {
    const std::uint64_t place = address % cycleBytes_ + i;
    const int shift = static_cast<int>(place % cycleBytes_) * 8;
    std::uint16_t& word = data[place / cycleBytes_];
    word = static_cast<std::uint16_t>((word & ~(0xFF << shift)) | bytes[i] << shift);
  }
  return commands_->program(cycleOf(address / sectorSize() * sectorSize()), cycleOf(address), data,
                            bufferSize_ / cycleBytes_);
}

Result<std::vector<std::uint8_t>> BpiFlashMemory::readBytes(std::uint64_t first, std::size_t count) {
  const std::size_t skipped = first % cycleBytes_;
  const auto words = bus_.read(cycleOf(first), (skipped + count + cycleBytes_ - 1) / cycleBytes_);
  if (!words) return words.failure();
  std::vector<std::uint8_t> bytes(count);
  for (std::size_t i = 0; i < count; ++i) {
    const std::size_t place = skipped + i;
    bytes[i] = static_cast<std::uint8_t>((*words)[place / cycleBytes_] >> place % cycleBytes_ * 8);
  }
  return bytes;
}
