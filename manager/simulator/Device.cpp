#include "manager/simulator/Device.h"

#include <algorithm>

namespace {

constexpr std::size_t codeBits = 32;
constexpr double configurationClearTime = 0.5e-3;  // seconds

/// Bits that may be anything are zeros.
std::uint32_t idcodeOf(const Part& part) {
  return part.idcodes.empty() ? 0 : static_cast<std::uint32_t>(part.idcodes.front().value.number(0, codeBits));
}

/// Content beyond the end is left out; what it does not reach stays as it is.
void fill(BitVector& bits, const std::vector<std::uint8_t>& content) {
  const BitVector from = BitVector::fromBytes(content);
  bits.copy(0, from, 0, std::min(bits.size(), from.size()));
}

void fill(std::vector<std::uint8_t>& bytes, const std::vector<std::uint8_t>& content) {
  std::copy_n(content.begin(), std::min(bytes.size(), content.size()), bytes.begin());
}

/// A number of its own for each device.
BitVector serialNumber(std::size_t position, std::size_t length) {
  std::uint64_t number = (position + 1) * 0x9E3779B97F4A7C15U;
  number ^= number >> 29;
  BitVector bits = BitVector::fromNumber(number, BitVector::wordBits);
  bits.resize(length);
  return bits;
}

}  // namespace

Device::Device(const DeviceDescription& description, std::size_t position, BoardClock& clock, Nets& nets)
    : part_(description.part),
      prefix_(std::to_string(position) + " " + part_->name + " "),
      idcode_(description.idcode.value_or(idcodeOf(*part_))),
      status_(clock, description.endlessBusy),
      tap_(part_, [this] { status_.enabled = false; }),
      idcodeRegister_(codeBits, [this] { return BitVector::fromNumber(idcode_, codeBits); }),
      usercodeRegister_(codeBits, [this] { return usercode(); }),
      usercode_(part_->blankUsercode.value_or(BitVector(codeBits, true))),
      boundary_(part_, position, nets) {
  makeFlash(description, clock);
  makeMemories(description);
  registers_ = std::make_unique<RegisterFile>(part_, status_);
  if (BitVector* dna = registers_->find("dna")) *dna = serialNumber(position, dna->size());
  if (BitVector* code = registers_->find("mfg_code")) *code = serialNumber(position + 1000, code->size());
  makeRegisters(description);
  defineStandard();
  defineIsc(description.isc);
  registers_->define(tap_, taken_);
  defineOthers();
}

void Device::makeFlash(const DeviceDescription& description, BoardClock& clock) {
  if (description.spi) {
    spi_ = std::make_unique<SpiFlash>(*description.spi->part, description.spi->times, clock, description.endlessBusy);
    fill(spi_->memory(), description.spi->content);
  }
  if (description.bpi) {
    bpi_ = BpiFlash::make(*description.bpi->part, description.bpi->times, clock, description.endlessBusy);
    fill(bpi_->memory(), description.bpi->content);
  }
  const Bridge& bridge = part_->bridge;
  if (!bridge.spiInstruction.empty()) {
    spiBridge_ = std::make_unique<SpiBridge>(spi_.get(), clock);
    define({.name = bridge.spiInstruction, .reg = spiBridge_.get()});
  }
  if (!bridge.bpiInstruction.empty()) {
    bpiBridge_ = std::make_unique<BpiBridge>(bpi_.get(), clock);
    define({.name = bridge.bpiInstruction, .reg = bpiBridge_.get()});
  }
}

void Device::makeMemories(const DeviceDescription& description) {
  if (description.isc.pages > 0) {
    pages_ = std::make_unique<PagedMemory>(description.isc, status_);
    fill(pages_->array(), description.content);
  }
  if (part_->memoryBits == 0 || part_->opcode("CFG_IN") == nullptr) return;
  configuration_ =
      std::make_unique<Configuration>(part_, idcodeOf(*part_), status_, pages_ == nullptr ? nullptr : &pages_->array());
  if (description.content.empty()) return;
  if (pages_ == nullptr) {
    fill(configuration_->memory(), description.content);
    configuration_->startUp();
  } else {
    configuration_->loadFromFlash();
  }
}

void Device::makeRegisters(const DeviceDescription& description) {
  if (configuration_ != nullptr) registers_->compute("usercode", [this] { return usercode(); });
  for (const auto& [name, value] : description.registers)
    if (BitVector* bits = registers_->find(name)) bits->copy(0, value, 0, std::min(bits->size(), value.size()));
  if (const auto code = description.registers.find("usercode"); code != description.registers.end())
    usercode_ = code->second;
  for (const auto& [field, quantity] : description.monitors) registers_->setMonitor(field, quantity);
}

void Device::define(Instruction instruction) {
  if (taken_.insert(instruction.name).second) tap_.define(std::move(instruction));
}

void Device::defineStandard() {
  taken_.insert("BYPASS");
  if (!part_->idcodes.empty()) define({.name = "IDCODE", .reg = &idcodeRegister_});
  define({.name = "USERCODE", .reg = &usercodeRegister_});
  boundary_.define(tap_, taken_);
}

void Device::defineIsc(const IscModel& model) {
  control_ = std::make_unique<IscControl>(*part_, model, status_);
  control_->define(tap_);
  taken_.insert({model.enable, model.disable, model.status});
  auto erasure = std::make_unique<EraseInstruction>(IscModels::keyed(*part_, model.erase), model.eraseTime, status_);
  erasure->add([this] { registers_->erase(); });
  if (pages_ != nullptr) {
    erasure->add([this] { pages_->erase(); });
    pages_->define(tap_);
    taken_.insert({model.address, model.data, model.program, model.read});
  }
  erasure->define(tap_);
  taken_.insert(model.erase);
  if (configuration_ != nullptr) {
    // A part that has flash inside as well clears its configuration by an instruction of its own.
    const bool own = part_->opcode("CFG_CLEAR") != nullptr;
    if (own) {
      erasures_.push_back(
          std::make_unique<EraseInstruction>(IscModels::keyed(*part_, "CFG_CLEAR"), configurationClearTime, status_));
      erasures_.back()->define(tap_);
    }
    (own ? *erasures_.back() : *erasure).add([this] { configuration_->erase(); });
    configuration_->define(tap_);
    taken_.insert({"CFG_CLEAR", "CFG_IN", "CFG_OUT", "CFG_START", "CFG_LOAD"});
  }
  erasures_.push_back(std::move(erasure));
}

void Device::defineOthers() {
  for (const auto& [name, codes] : part_->opcodes) {
    const std::size_t length = IscModels::registerLength(*part_, name);
    if (length <= 1 || length > IscModels::mostBits || taken_.count(name) != 0) continue;
    others_.emplace_back(length);
    define({.name = name, .reg = &others_.back()});
  }
}

BitVector Device::usercode() {
  if (configuration_ != nullptr) return BitVector::fromNumber(configuration_->usercode(), codeBits);
  if (const BitVector* stored = registers_->find("usercode")) return *stored;
  return usercode_;
}

std::vector<std::uint8_t> Device::memory() const {
  if (pages_ != nullptr) return pages_->array().bytes();
  return configuration_ == nullptr ? std::vector<std::uint8_t>() : configuration_->memory().bytes();
}

void Device::visit(StateVisitor& visitor) {
  if (pages_ != nullptr) visitor.visit(prefix_ + "pages", pages_->array());
  registers_->visit(prefix_, visitor);
  if (configuration_ != nullptr) configuration_->visit(prefix_, visitor);
  if (spi_ != nullptr) spi_->visit(prefix_, visitor);
  if (bpi_ != nullptr) bpi_->visit(prefix_, visitor);
}
