#include <algorithm>
#include <functional>
#include <optional>

#include "manager/devices/BpiFlashMemory.h"

namespace {

using Time = FlashMemory::Time;
using Commands = BpiFlashPart::Commands;

constexpr Time eraseTime{.typical = 64e-3, .most = 5};
constexpr Time bufferTime{.typical = 128e-6, .most = 0.05};
constexpr Time wordTime{.typical = 16e-6, .most = 0.01};

Failure fail(const std::string& text) { return {.text = text, .kind = Failure::Kind::general}; }

/// Waits as long as it takes as a rule, then reads at `address` until `ready` says so.
Status waitUntil(BpiBus& bus, Cable& cable, std::uint32_t address, const Time& time, const std::string& what,
                 const std::function<bool(std::uint16_t)>& ready) {
  const double pause = std::max(time.typical / 4, time.most / 1000);
  TESSEL_TRY(cable.runTest(0, time.typical));
  for (double waited = time.typical;; waited += pause) {
    const Result<std::uint16_t> found = bus.read(address);
    if (!found) return found.failure();
    if (ready(*found)) return {};
    if (waited >= time.most)
      return fail("the BPI flash is still busy with " + what + " after " +
                  std::to_string(static_cast<int>(waited * 1000)) + " ms, it reads as " + DataCompare::hex(*found, 4));
    TESSEL_TRY(cable.runTest(0, pause));
  }
}

/// Every command begins with two unlock cycles. While the memory is busy, a bit of what it reads as toggles.
class AmdCommands : public BpiCommands {
 public:
  using BpiCommands::BpiCommands;

  Status reset() override {
    // With the unlock cycles it also leaves a write buffer that was broken off.
    TESSEL_TRY(unlock());
    return bus_.write(first(), 0xF0);
  }

  Result<Id> readId() override {
    TESSEL_TRY(unlock());
    TESSEL_TRY(bus_.write(first(), 0x90));
    const Result<std::uint16_t> maker = bus_.read(spread(0));
    if (!maker) return maker.failure();
    const Result<std::uint16_t> device = bus_.read(spread(1));
    if (!device) return device.failure();
    TESSEL_TRY(reset());
    return Id{.maker = lines(*maker), .device = lines(*device)};
  }

  Status eraseSector(std::uint32_t sector) override {
    TESSEL_TRY(unlock());
    TESSEL_TRY(bus_.write(first(), 0x80));
    TESSEL_TRY(unlock());
    TESSEL_TRY(bus_.write(sector, 0x30));
    return finish(sector, eraseTime, "the sector erase");
  }

  Status program(std::uint32_t sector, std::uint32_t address, std::span<const std::uint16_t> data,
                 std::uint32_t bufferCycles) override {
    if (bufferCycles == 0) return programWords(address, data);
    TESSEL_TRY(unlock());
    TESSEL_TRY(bus_.write(sector, 0x25));
    TESSEL_TRY(bus_.write(sector, static_cast<std::uint16_t>(data.size() - 1)));
    for (std::size_t i = 0; i < data.size(); ++i)
      TESSEL_TRY(bus_.write(address + static_cast<std::uint32_t>(i), data[i]));
    TESSEL_TRY(bus_.write(sector, 0x29));
    return finish(address + static_cast<std::uint32_t>(data.size()) - 1, bufferTime, "programming a buffer");
  }

 private:
  std::uint32_t first() const { return width_ == 8 ? 0xAAA : 0x555; }
  std::uint32_t second() const { return width_ == 8 ? 0x555 : 0x2AA; }

  Status unlock() {
    TESSEL_TRY(bus_.write(first(), 0xAA));
    return bus_.write(second(), 0x55);
  }

  Status programWords(std::uint32_t address, std::span<const std::uint16_t> data) {
    for (const std::uint16_t word : data) {
      TESSEL_TRY(unlock());
      TESSEL_TRY(bus_.write(first(), 0xA0));
      TESSEL_TRY(bus_.write(address, word));
      TESSEL_TRY(finish(address++, wordTime, "programming a word"));
    }
    return {};
  }

  Status finish(std::uint32_t address, const Time& time, const char* what) {
    std::optional<std::uint16_t> last;
    Status status = waitUntil(bus_, cable_, address, time, what, [&](std::uint16_t found) {
      const bool same = last == found;
      last = found;
      return same;
    });
    if (!status) (void)reset().ok();
    return status;
  }
};

/// Commands stand alone; a status register tells how it goes.
class IntelCommands : public BpiCommands {
 public:
  using BpiCommands::BpiCommands;

  Status reset() override { return bus_.write(0, 0xFF); }

  Result<Id> readId() override {
    TESSEL_TRY(bus_.write(0, 0x90));
    const Result<std::uint16_t> maker = bus_.read(spread(0));
    if (!maker) return maker.failure();
    const Result<std::uint16_t> device = bus_.read(spread(1));
    if (!device) return device.failure();
    TESSEL_TRY(reset());
    return Id{.maker = lines(*maker), .device = lines(*device)};
  }

  Status eraseSector(std::uint32_t sector) override {
    TESSEL_TRY(unlock(sector));
    TESSEL_TRY(bus_.write(sector, 0x20));
    TESSEL_TRY(bus_.write(sector, 0xD0));
    return finish(sector, eraseTime, "the sector erase");
  }

  Status program(std::uint32_t sector, std::uint32_t address, std::span<const std::uint16_t> data,
                 std::uint32_t bufferCycles) override {
    TESSEL_TRY(unlock(sector));
    if (bufferCycles == 0) return programWords(address, data);
    TESSEL_TRY(bus_.write(sector, 0xE8));
    TESSEL_TRY(waitReady(sector, {.typical = 0, .most = bufferTime.most}, "giving a buffer"));
    TESSEL_TRY(bus_.write(sector, static_cast<std::uint16_t>(data.size() - 1)));
    for (std::size_t i = 0; i < data.size(); ++i)
      TESSEL_TRY(bus_.write(address + static_cast<std::uint32_t>(i), data[i]));
    TESSEL_TRY(bus_.write(sector, 0xD0));
    return finish(sector, bufferTime, "programming a buffer");
  }

 private:
  static constexpr std::uint16_t readyBit = 0x80;
  /// Erase, program, voltage, lock.
  static constexpr std::uint16_t problemBits = 0x3A;

  /// Sectors are locked from power-up on.
  Status unlock(std::uint32_t sector) {
    TESSEL_TRY(bus_.write(sector, 0x50));
    TESSEL_TRY(bus_.write(sector, 0x60));
    return bus_.write(sector, 0xD0);
  }

  Status programWords(std::uint32_t address, std::span<const std::uint16_t> data) {
    for (const std::uint16_t word : data) {
      TESSEL_TRY(bus_.write(address, 0x40));
      TESSEL_TRY(bus_.write(address, word));
      TESSEL_TRY(finish(address++, wordTime, "programming a word"));
    }
    return {};
  }

  Status waitReady(std::uint32_t address, const Time& time, const char* what) {
    return waitUntil(bus_, cable_, address, time, what, [](std::uint16_t status) { return (status & readyBit) != 0; });
  }

  Status finish(std::uint32_t address, const Time& time, const char* what) {
    const Status waited = waitReady(address, time, what);
    if (!waited) {
      (void)reset().ok();
      return waited;
    }
    const Result<std::uint16_t> status = bus_.read(address);
    if (!status) return status.failure();
    TESSEL_TRY(reset());
    if ((*status & problemBits) == 0) return {};
    return fail("the BPI flash reports a problem with " + std::string(what) + ", its status is " +
                DataCompare::hex(*status & 0xFFU, 2));
  }
};

}  // namespace

std::unique_ptr<BpiCommands> BpiCommands::make(Commands kind, BpiBus& bus, Cable& cable, int width) {
  if (kind == Commands::amd) return std::make_unique<AmdCommands>(bus, cable, width);
  return std::make_unique<IntelCommands>(bus, cable, width);
}

Result<BpiCommands::Query> BpiCommands::query() {
  constexpr std::uint32_t first = 0x10;
  constexpr std::size_t sizePlace = 0x27 - first;
  constexpr std::size_t bufferPlace = 0x2A - first;
  constexpr std::uint16_t largest = 40;
  TESSEL_TRY(bus_.write(spread(0x55), 0x98));
  std::vector<std::uint16_t> table;
  for (std::uint32_t i = 0; i <= bufferPlace; ++i) {
    const Result<std::uint16_t> value = bus_.read(spread(first + i));
    if (!value) return value.failure();
    table.push_back(*value & 0xFFU);
  }
  TESSEL_TRY(reset());
  if (table[0] != 'Q' || table[1] != 'R' || table[2] != 'Y') return Query{};
  const auto power = [&](std::size_t place) {
    return table[place] == 0 || table[place] > largest ? 0 : std::uint64_t{1} << table[place];
  };
  return Query{.size = power(sizePlace), .bufferSize = power(bufferPlace)};
}
