#include "manager/simulator/Boundary.h"

#include <algorithm>
#include <cctype>

namespace {

std::string lowered(std::string text) {
  std::transform(text.begin(), text.end(), text.begin(),
                 [](unsigned char letter) { return static_cast<char>(std::tolower(letter)); });
  return text;
}

}  // namespace

Boundary::Boundary(PartPointer part, std::size_t device, Nets& nets)
    : part_(std::move(part)),
      device_(device),
      nets_(nets),
      latch_(part_->boundary.size()),
      register_(
          part_->boundary.size(), [this] { return levels(); }, [this](const BitVector& bits) { update(bits); }) {
  for (const BoundaryCell& cell : part_->boundary) {
    latch_.set(cells_.size(), cell.safe == '1');
    cells_.push_back(makeCell(cell, device));
  }
}

Boundary::Cell Boundary::makeCell(const BoundaryCell& cell, std::size_t device) {
  Cell result;
  result.disabled = cell.disableValue == '1';
  const auto count = static_cast<int>(part_->boundary.size());
  if (cell.control >= 0 && cell.control < count) result.control = cell.control;
  const bool bidirectional = cell.function == "bidir";
  result.drives = bidirectional || cell.function.starts_with("output");
  if (cell.function.starts_with("control")) result.role = Role::control;
  if (cell.port.empty()) {
    result.drives = false;
    return result;
  }
  const bool sees = cell.function == "input" || cell.function == "clock" || cell.function == "observe_only";
  if (sees || bidirectional) result.role = Role::input;
  if (result.drives && !bidirectional) result.role = Role::output;
  if (sees || result.drives) result.net = nets_.netOf({device, lowered(cell.port)});
  return result;
}

void Boundary::define(TapDevice& tap, std::set<std::string>& taken) {
  if (cells_.empty()) return;
  tap.define(
      {.name = "EXTEST", .reg = &register_, .loaded = [this] { setDriving(true); }, .left = [this] { release(); }});
  tap.define({.name = "CLAMP", .loaded = [this] { setDriving(true); }, .left = [this] { release(); }});
  taken.insert({"EXTEST", "CLAMP", "SAMPLE", "PRELOAD", "INTEST"});
  for (const char* name : {"SAMPLE", "PRELOAD", "INTEST"}) tap.define({.name = name, .reg = &register_});
}

BitVector Boundary::levels() const {
  BitVector bits = latch_;
  for (std::size_t i = 0; i < cells_.size(); ++i)
    if (cells_[i].role == Role::input) bits.set(i, nets_.level(cells_[i].net));
  return bits;
}

void Boundary::update(const BitVector& bits) {
  latch_ = bits;
  if (driving_) drive();
}

void Boundary::setDriving(bool driving) {
  driving_ = driving;
  drive();
}

void Boundary::drive() {
  for (std::size_t i = 0; i < cells_.size(); ++i) {
    const Cell& cell = cells_[i];
    if (!cell.drives) continue;
    const bool off =
        !driving_ || (cell.control >= 0 && latch_.get(static_cast<std::size_t>(cell.control)) == cell.disabled);
    nets_.drive(cell.net, device_, off ? std::optional<bool>() : latch_.get(i));
  }
}
