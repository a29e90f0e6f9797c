// Flash memories that the simulated board does not have.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <memory>
#include <vector>

#include "manager/devices/Memory.h"
#include "manager/parts/Sfdp.h"
#include "tests/unit/manager/devices/RegisterCable.h"

namespace {

using Bytes = std::vector<std::uint8_t>;

std::shared_ptr<Part> bridgePart() {
  auto part = std::make_shared<Part>();
  part->name = "bridge1";
  part->irLength = 8;
  part->opcodes["USER1"] = {BitVector::fromNumber(0x64, 8)};
  part->opcodes["USER2"] = {BitVector::fromNumber(0x65, 8)};
  part->bridge = {.spiInstruction = "USER1", .bpiInstruction = "USER2"};
  return part;
}

std::string textOf(const Status& status) { return status ? "(no failure)" : status.failure().text; }

/// An SPI flash that answers to a command with the bytes behind its address, and to all else with ones.
class SpiFake {
 public:
  std::map<std::uint8_t, Bytes> answers;
  std::map<std::uint8_t, std::size_t> addressBytes;
  std::vector<std::uint64_t> spiBits;  ///< of each transfer

  /// The register as the bridge has it, on a chain of one device.
  BitVector scan(const BitVector& bits) {
    EXPECT_TRUE(bits.get(0)) << "the marker comes first";
    std::uint64_t count = 1;
    for (std::size_t i = 0; i < 32; ++i) count += static_cast<std::uint64_t>(bits.get(1 + i)) << (31 - i);
    spiBits.push_back(count);
    BitVector out(bits.size(), true);
    const std::uint8_t code = byteAt(bits, 33);
    const Bytes& answer = answers[code];
    for (std::size_t i = 0; i < answer.size() * 8; ++i) {
      const std::size_t place = 33 + 8 * (1 + addressBytes[code]) + i + 1;
      if (place < out.size()) out.set(place, (answer[i / 8] >> (7 - i % 8) & 1U) != 0);
    }
    return out;
  }

 private:
  static std::uint8_t byteAt(const BitVector& bits, std::size_t place) {
    unsigned byte = 0;
    for (std::size_t i = 0; i < 8; ++i) byte = byte << 1U | (bits.get(place + i) ? 1U : 0U);
    return static_cast<std::uint8_t>(byte);
  }
};

class UnknownSpiFlash : public testing::Test {
 protected:
  UnknownSpiFlash() {
    cable.scanned = [this](const BitVector& bits) { return fake.scan(bits); };
    fake.answers[0x05] = {0x00};
    fake.answers[0x9F] = {0xAB, 0xCD, 0xEF};
    fake.addressBytes[0x5A] = 4;
    memory = std::move(*makeSpiFlash(chain, 0, bridgePart(), nullptr));
  }

  RegisterCable cable;
  ScanChain chain{cable, {8}};
  SpiFake fake;
  std::unique_ptr<Memory> memory;
};

TEST_F(UnknownSpiFlash, DescribesItself) {
  const SpiFlashPart part = {"unheard", 0xABCDEF, 4U << 20, 256, 64 * 1024, 0xD8, false};
  fake.answers[0x5A] = Sfdp::build(part);
  ASSERT_EQ(textOf(memory->open()), "(no failure)");
  EXPECT_EQ(memory->size(), 4U << 20);
  EXPECT_EQ(memory->name(), "SPI flash with the JEDEC id ABCDEF");
  EXPECT_THAT(fake.spiBits, testing::Contains((5 + Sfdp::bytes) * 8));
}

TEST_F(UnknownSpiFlash, ThatDoesNotDescribeItselfIsAFailure) {
  EXPECT_EQ(textOf(memory->open()), "the SPI flash with the JEDEC id ABCDEF is not known and does not describe itself");
}

TEST_F(UnknownSpiFlash, ThatIsBusyFromBeforeIsWaitedFor) {
  fake.answers[0x05] = {0x01};
  EXPECT_THAT(textOf(memory->open()),
              testing::HasSubstr("the SPI flash is still busy with what was begun before after 4"));
  EXPECT_GE(cable.seconds, 4.0);
}

/// An AMD flash with eight data lines. Commands are told by the last cycles that were written.
class ByteFlash {
 public:
  static constexpr std::size_t size = 0x20000;
  static constexpr std::size_t sectorSize = 0x10000;

  Bytes memory = Bytes(size, 0xFF);

  BitVector scan(const BitVector& bits) {
    if (streams_) return stream(bits.size());
    const auto address = static_cast<std::uint32_t>(bits.number(0, 32));
    const BitVector out = BitVector::fromNumber(std::uint64_t{data_} << 32 | std::uint64_t{1} << 50, 64);
    if (bits.get(48)) write(address, static_cast<std::uint8_t>(bits.number(32, 8)));
    // Nobody drives the upper lines.
    if (bits.get(49)) data_ = static_cast<std::uint16_t>(0xA500U | read(address));
    streams_ = bits.get(51);
    first_ = address;
    return out;
  }

 private:
  struct Cycle {
    std::uint32_t address;
    std::uint8_t data;
    bool operator==(const Cycle&) const = default;
  };

  BitVector stream(std::size_t count) {
    BitVector out(count);
    for (std::size_t i = 0; i + 16 <= count; i += 16) out.setNumber(i, 16, 0xA500U | read(first_++));
    streams_ = false;
    return out;
  }

  std::uint8_t read(std::uint32_t address) const {
    static const std::map<std::uint32_t, std::uint8_t> ids = {{0, 0x01}, {2, 0x49}};
    static const std::map<std::uint32_t, std::uint8_t> table = {
        {0x20, 'Q'}, {0x22, 'R'}, {0x24, 'Y'}, {0x4E, 17}, {0x54, 5}};
    const auto& special = view_ == 'i' ? ids : table;
    if (view_ == 'a') return memory[address % size];
    const auto found = special.find(address);
    return found == special.end() ? std::uint8_t{0} : found->second;
  }

  bool endsWith(const std::vector<Cycle>& cycles) const {
    return cycles.size() <= cycles_.size() && std::equal(cycles.rbegin(), cycles.rend(), cycles_.rbegin());
  }

  void write(std::uint32_t address, std::uint8_t data) {
    cycles_.push_back({address, data});
    if (fillLeft_ > 0) {
      memory[address] &= data;
      --fillLeft_;
      return;
    }
    const Cycle first = {0xAAA, 0xAA};
    const Cycle second = {0x555, 0x55};
    if (endsWith({first, second, {0xAAA, 0x90}})) view_ = 'i';
    if (data == 0xF0) view_ = 'a';
    if (address == 0xAA && data == 0x98) view_ = 'q';
    if (endsWith({first, second, {0xAAA, 0x80}, first, second, {address, 0x30}}))
      std::fill_n(memory.begin() + static_cast<std::ptrdiff_t>(address), sectorSize, std::uint8_t{0xFF});
    if (cycles_.size() > 1 && endsWith({first, second, {address, 0x25}, {address, data}})) fillLeft_ = data + 1U;
  }

  std::vector<Cycle> cycles_;
  char view_ = 'a';
  unsigned fillLeft_ = 0;
  std::uint16_t data_ = 0;
  bool streams_ = false;
  std::uint32_t first_ = 0;
};

TEST(ByteWideBpiFlash, IsErasedProgrammedAndRead) {
  const BpiFlashPart part = {"tiny8",         BpiFlashPart::Commands::amd, 0x0001, 0x2249,
                             ByteFlash::size, ByteFlash::sectorSize,       32};
  ByteFlash flash;
  flash.memory[5] = 0;
  RegisterCable cable;
  cable.scanned = [&](const BitVector& bits) { return flash.scan(bits); };
  ScanChain chain(cable, {8});
  const auto memory = std::move(*makeBpiFlash(chain, 0, bridgePart(), &part, 8));
  ASSERT_EQ(textOf(memory->open()), "(no failure)");
  Bytes data(1001);
  for (std::size_t i = 0; i < data.size(); ++i) data[i] = static_cast<std::uint8_t>(i * 7);
  DataImage image;
  ASSERT_TRUE(image.add(0x1F, data));
  Memory::ProgramOptions options;
  options.erase = options.verify = true;
  ASSERT_EQ(textOf(memory->program(image, options, {})), "(no failure)");
  EXPECT_EQ(Bytes(flash.memory.begin() + 0x1F, flash.memory.begin() + 0x1F + 1001), data);
  EXPECT_EQ(flash.memory[5], 0xFF) << "the sector was erased";
  const auto read = memory->read(0x20, 10, {});
  ASSERT_TRUE(read);
  EXPECT_EQ(*read, Bytes(data.begin() + 1, data.begin() + 11));
}

}  // namespace
