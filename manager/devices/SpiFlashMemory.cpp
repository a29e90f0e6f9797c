#include "manager/devices/SpiFlashMemory.h"

#include <algorithm>
#include <array>

#include "manager/parts/Sfdp.h"

namespace {

namespace Command {
constexpr std::uint8_t writeEnable = 0x06;
constexpr std::uint8_t readStatus = 0x05;
constexpr std::uint8_t read = 0x03;
constexpr std::uint8_t programPage = 0x02;
constexpr std::uint8_t eraseChip = 0xC7;
constexpr std::uint8_t readId = 0x9F;
constexpr std::uint8_t readSfdp = 0x5A;
constexpr std::uint8_t wake = 0xAB;
}  // namespace Command

/// The same commands with addresses of three and of four bytes.
struct WideCommand {
  std::uint8_t three;
  std::uint8_t four;
};
constexpr std::array<WideCommand, 5> wideCommands = {
    {{Command::read, 0x13}, {Command::programPage, 0x12}, {0x20, 0x21}, {0x52, 0x5C}, {0xD8, 0xDC}}};

constexpr std::uint8_t busyBit = 1;
constexpr std::uint8_t enabledBit = 2;
constexpr std::uint8_t protectedBits = 0x1C;

constexpr double wakeSeconds = 50e-6;
constexpr double eraseSecondsPerKiB = 1.5e-3;
constexpr double mostEraseSecondsPerKiB = 0.06;

Failure fail(const std::string& text) { return {.text = text, .kind = Failure::Kind::general}; }

}  // namespace

Result<std::unique_ptr<Memory>> makeSpiFlash(ScanChain& chain, std::size_t device, PartPointer part,
                                             const SpiFlashPart* flash) {
  if (part->bridge.spiInstruction.empty()) return fail(part->name + " has no bridge to an SPI flash");
  return std::unique_ptr<Memory>(std::make_unique<SpiFlashMemory>(chain, device, std::move(part), flash));
}

SpiFlashMemory::SpiFlashMemory(ScanChain& chain, std::size_t device, PartPointer part, const SpiFlashPart* flash)
    : FlashMemory(chain, device, std::move(part)), bus_(loader()), wanted_(flash) {
  if (flash != nullptr) flash_ = geometryOf(*flash);
}

SpiFlashMemory::Geometry SpiFlashMemory::geometryOf(const SpiFlashPart& part) {
  return {.name = part.name,
          .size = part.size,
          .pageSize = part.pageSize,
          .sectorSize = part.sectorSize,
          .eraseCommand = part.eraseCommand,
          .fourByteAddress = part.fourByteAddress};
}

Status SpiFlashMemory::open() {
  if (cable().recordsOnly()) return fail("an SPI flash needs a cable that gives answers");
  TESSEL_TRY(loader().checkIdcode());
  TESSEL_TRY(select());
  TESSEL_TRY(bus_.send(std::array{Command::wake}));
  TESSEL_TRY(cable().runTest(0, wakeSeconds));
  TESSEL_TRY(waitForOthers());
  const Result<std::uint32_t> id = readId();
  if (!id) return id.failure();
  const std::string digits = DataCompare::hex(*id, 6).substr(2);
  if (*id == 0 || *id == 0xFFFFFF) return fail("there is no SPI flash: its JEDEC id reads as " + digits);
  if (wanted_ != nullptr && *id != wanted_->jedecId)
    return fail("the SPI flash has the JEDEC id " + digits + ", expected " +
                DataCompare::hex(wanted_->jedecId, 6).substr(2) + " of " + wanted_->name);
  if (wanted_ == nullptr) {
    const Result<Geometry> found = discover(*id);
    if (!found) return found.failure();
    flash_ = *found;
  }
  return {};
}

/// The memory may still be at work on what another session asked for, and would not tell its id then.
Status SpiFlashMemory::waitForOthers() {
  constexpr std::uint8_t nobodyDrives = 0xFF;
  const Result<std::uint8_t> status = readStatus();
  if (!status) return status.failure();
  if (*status == nobodyDrives) return {};
  return waitReady({.typical = 0, .most = 4}, "what was begun before");
}

Result<SpiFlashMemory::Geometry> SpiFlashMemory::discover(std::uint32_t id) {
  if (const SpiFlashPart* part = FlashParts::findSpiById(id)) return geometryOf(*part);
  const std::string digits = DataCompare::hex(id, 6).substr(2);
  const auto table = bus_.ask(std::array<std::uint8_t, 5>{Command::readSfdp, 0, 0, 0, 0}, Sfdp::bytes);
  if (!table) return table.failure();
  const auto parameters = Sfdp::decode(*table);
  if (!parameters)
    return fail("the SPI flash with the JEDEC id " + digits + " is not known and does not describe itself");
  return Geometry{.name = "with the JEDEC id " + digits,
                  .size = parameters->size,
                  .pageSize = parameters->pageSize,
                  .sectorSize = parameters->sectorSize,
                  .eraseCommand = parameters->eraseCommand,
                  .fourByteAddress = parameters->fourByteAddress};
}

Result<std::uint32_t> SpiFlashMemory::readId() {
  const auto answer = bus_.ask(std::array{Command::readId}, 3);
  if (!answer) return answer.failure();
  return static_cast<std::uint32_t>((*answer)[0]) << 16 | static_cast<std::uint32_t>((*answer)[1]) << 8 | (*answer)[2];
}

Result<std::uint8_t> SpiFlashMemory::readStatus() {
  const auto answer = bus_.ask(std::array{Command::readStatus}, 1);
  if (!answer) return answer.failure();
  return answer->front();
}

Status SpiFlashMemory::writeEnable() {
  TESSEL_TRY(bus_.send(std::array{Command::writeEnable}));
  const Result<std::uint8_t> status = readStatus();
  if (!status) return status.failure();
  if ((*status & enabledBit) != 0 && (*status & busyBit) == 0) return {};
  return fail("the SPI flash did not accept the write enable, its status is " + DataCompare::hex(*status, 2));
}

/// Waits as long as it takes as a rule, then asks until the memory is ready.
Status SpiFlashMemory::waitReady(const Time& time, const char* what) {
  constexpr double shortestPause = 20e-6;
  const double pause = std::max({shortestPause, time.typical / 4, time.most / 1000});
  if (time.typical > 0) TESSEL_TRY(cable().runTest(0, time.typical));
  for (double waited = time.typical;; waited += pause) {
    const Result<std::uint8_t> status = readStatus();
    if (!status) return status.failure();
    if ((*status & busyBit) == 0) return {};
    if (waited >= time.most)
      return fail("the SPI flash is still busy with " + std::string(what) + " after " +
                  std::to_string(static_cast<int>(waited * 1000)) + " ms, its status is " +
                  DataCompare::hex(*status, 2));
    TESSEL_TRY(cable().runTest(0, pause));
  }
}

Status SpiFlashMemory::refuseProtected() {
  const Result<std::uint8_t> status = readStatus();
  if (!status) return status.failure();
  if ((*status & protectedBits) == 0) return {};
  return fail("the SPI flash is write-protected, its status is " + DataCompare::hex(*status, 2));
}

std::vector<std::uint8_t> SpiFlashMemory::command(std::uint8_t code, std::uint64_t address) const {
  std::vector<std::uint8_t> bytes = {code};
  if (flash_.fourByteAddress) {
    for (const WideCommand& row : wideCommands)
      if (row.three == code) bytes[0] = row.four;
    bytes.push_back(static_cast<std::uint8_t>(address >> 24));
  }
  for (const int shift : {16, 8, 0}) bytes.push_back(static_cast<std::uint8_t>(address >> shift));
  return bytes;
}

Status SpiFlashMemory::eraseAll() {
  const double kiB = static_cast<double>(size()) / 1024;
  return change({Command::eraseChip}, {.typical = eraseSecondsPerKiB * kiB / 8, .most = mostEraseSecondsPerKiB * kiB},
                "the chip erase");
}

Status SpiFlashMemory::eraseSector(std::uint64_t address) {
  const double kiB = static_cast<double>(flash_.sectorSize) / 1024;
  return change(command(flash_.eraseCommand, address),
                {.typical = eraseSecondsPerKiB * kiB, .most = mostEraseSecondsPerKiB * kiB}, "the sector erase");
}

Status SpiFlashMemory::programBlock(std::uint64_t address, std::span<const std::uint8_t> bytes) {
  std::vector<std::uint8_t> sent = command(Command::programPage, address);
  sent.insert(sent.end(), bytes.begin(), bytes.end());
  return change(sent, {.typical = 0.4e-3, .most = 0.1}, "programming a page");
}

/// Carries out a command that changes the memory, and waits for its end.
Status SpiFlashMemory::change(const std::vector<std::uint8_t>& bytes, const Time& time, const char* what) {
  TESSEL_TRY(writeEnable());
  TESSEL_TRY(bus_.send(bytes));
  return waitReady(time, what);
}

Result<std::vector<std::uint8_t>> SpiFlashMemory::readBytes(std::uint64_t first, std::size_t count) {
  return bus_.ask(command(Command::read, first), count);
}
