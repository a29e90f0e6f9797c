#include "manager/simulator/Board.h"

#include <algorithm>
#include <filesystem>
#include <limits>

#include "manager/content/FileAccess.h"
#include "manager/simulator/StateFile.h"

Board::Board(const BoardDescription& description)
    : name_(description.name),
      statePath_(description.statePath),
      stuckTdo_(description.stuckTdo),
      tdoNoise_(description.tdoNoise),
      tdiNoise_(description.tdiNoise),
      dropAfter_(description.dropAfter),
      noisy_(stuckTdo_ || tdoNoise_.active() || tdiNoise_.active()),
      clock_({.period = 1 / description.tck}),
      chain_(clock_) {
  for (const auto& net : description.nets)
    for (const Nets::Pin& pin : net) nets_.join(pin, net.front());
  for (const DeviceDescription& device : description.devices) {
    devices_.push_back(std::make_unique<Device>(device, devices_.size(), clock_, nets_));
    chain_.add(devices_.back()->tap());
  }
  chain_.reset();
}

Board::~Board() { static_cast<void>(save()); }

void Board::clock(bool tms, const BitVector& tdi, BitVector* tdo) {
  used_ = true;
  if (!noisy_) return chain_.clock(tms, tdi, tdo);
  BitVector disturbed = tdi;
  tdiNoise_.apply(disturbed);
  const std::size_t first = tdo == nullptr ? 0 : tdo->size();
  chain_.clock(tms, disturbed, tdo);
  if (tdo == nullptr) return tdoNoise_.skip(tdi.size());
  disturb(*tdo, first);
}

std::uint64_t Board::clockLevels(std::uint64_t tms, std::uint64_t tdi, int count) {
  used_ = true;
  std::uint64_t levels = 0;
  for (int i = 0; i < count; ++i) levels |= std::uint64_t{clockOnce((tms >> i & 1U) != 0, (tdi >> i & 1U) != 0)} << i;
  return levels;
}

bool Board::clockOnce(bool tms, bool tdi) {
  if (!noisy_) return chain_.clockOnce(tms, tdi);
  const bool level = tdo();
  chain_.clockOnce(tms, tdi != tdiNoise_.flipsNext());
  tdiNoise_.skip(1);
  tdoNoise_.skip(1);
  return level;
}

void Board::idleClocks(bool tms, std::uint64_t count) {
  used_ = true;
  if (!noisy_) return chain_.idleClocks(tms, count);
  // Only the data of a shift suffer from noise on TDI.
  for (; count > 0 && (state() == TapState::drShift || state() == TapState::irShift); --count) clockOnce(tms, false);
  tdiNoise_.skip(count);
  tdoNoise_.skip(count);
  chain_.idleClocks(tms, count);
}

void Board::elapse(double seconds) {
  if (seconds > 0) clock_.elapsed += seconds;
}

void Board::driveResets(bool trst, bool srst) {
  used_ = true;
  if (trst || srst) chain_.reset();
  chain_.hold(trst || srst);
}

bool Board::tdo() const {
  const bool level = stuckTdo_.value_or(chain_.tdo());
  return level != tdoNoise_.flipsNext();
}

void Board::disturb(BitVector& levels, std::size_t first) {
  BitVector added = levels.slice(first, levels.size() - first);
  if (stuckTdo_) added.fill(*stuckTdo_);
  tdoNoise_.apply(added);
  levels.copy(first, added, 0, added.size());
}

std::uint64_t Board::linkBytesLeft() const {
  if (!dropAfter_) return std::numeric_limits<std::uint64_t>::max();
  return *dropAfter_ - std::min(*dropAfter_, linkBytes_);
}

Status Board::loadState() {
  std::error_code problem;
  if (statePath_.empty() || !std::filesystem::exists(statePath_, problem)) return {};
  Result<std::string> text = FileAccess::read(statePath_, StateFile::mostBytes);
  if (!text) return text.failure();
  Result<StateFile::Content> content = StateFile::parse(statePath_, *text);
  if (!content) return content.failure();
  StateFile::Loader loader(statePath_, *content);
  for (const auto& device : devices_) device->visit(loader);
  TESSEL_TRY(loader.finish());
  savedState_ = std::move(*text);
  return {};
}

Status Board::save() {
  if (statePath_.empty() || !used_) return {};
  std::string text = stateText();
  if (text == savedState_) return {};
  TESSEL_TRY(FileAccess::replace(statePath_, text));
  savedState_ = std::move(text);
  used_ = false;
  return {};
}

std::string Board::stateText() {
  StateFile::Saver saver;
  for (const auto& device : devices_) device->visit(saver);
  return saver.text();
}

std::string Board::lockName() const {
  const std::string& path = statePath_.empty() ? path_ : statePath_;
  if (path.empty()) return path;
  std::error_code problem;
  const std::filesystem::path whole =
      std::filesystem::weakly_canonical(std::filesystem::absolute(path, problem), problem);
  return problem ? path : whole.string();
}

std::vector<std::uint8_t> Board::spiMemory(std::size_t device) const {
  const SpiFlash* flash = devices_[device]->spi();
  return flash == nullptr ? std::vector<std::uint8_t>() : flash->memory();
}

std::vector<std::uint8_t> Board::bpiMemory(std::size_t device) const {
  const BpiFlash* flash = devices_[device]->bpi();
  return flash == nullptr ? std::vector<std::uint8_t>() : flash->memory();
}
