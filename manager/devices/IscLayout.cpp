#include "manager/devices/IscLayout.h"

#include <algorithm>

namespace {

using Amounts = std::vector<IscLayout::Amount>;

Failure tooLong(const Isc::Flow& flow) {
  return {.text = "flow \"" + flow.name + "\": a field or the data are too long, expected at most " +
                  std::to_string(IscLayout::mostBits) + " bits in all"};
}

IscLayout::Amount& amountOf(Amounts& amounts, const std::string& array) {
  const auto place =
      std::find_if(amounts.begin(), amounts.end(), [&](const IscLayout::Amount& row) { return row.array == array; });
  return place != amounts.end() ? *place : amounts.emplace_back(IscLayout::Amount{.array = array});
}

/// Adds the data bits of fields, `times` over. False when that is out of all proportion.
bool addFields(const std::vector<Isc::Field>& fields, std::uint64_t times, std::size_t& to) {
  std::size_t length = 0;
  for (const Isc::Field& field : fields) {
    length += std::min(field.length, IscLayout::mostFieldBits + 1);
    if (length > IscLayout::mostFieldBits) return false;
    const Isc::Value::Kind kind = field.value.kind;
    if (kind != Isc::Value::Kind::input && kind != Isc::Value::Kind::output) continue;
    if (times != 0 && field.length > IscLayout::mostBits / times) return false;
    to += field.length * times;
    if (to > IscLayout::mostBits) return false;
  }
  return true;
}

Status addFlow(const Isc::Flow& flow, Amounts& amounts) {
  IscLayout::Amount& amount = amountOf(amounts, flow.array);
  for (const Isc::Block& block : flow.blocks) {
    const std::uint64_t times = block.kind == Isc::Block::Kind::repeat ? block.count : 1;
    for (const Isc::Item& item : block.items)
      for (const Isc::Step& step : item.steps)
        if (!addFields(step.updates, times, amount.written) || !addFields(step.captures, times, amount.read))
          return tooLong(flow);
  }
  return {};
}

}  // namespace

Result<Amounts> IscLayout::amounts(const Isc::Program& program, const Isc::Use& procedure) {
  Amounts amounts;
  const Isc::Procedure* found = program.findProcedure(procedure.name, procedure.array);
  if (found == nullptr) return Failure{.text = "the part has no procedure \"" + procedure.name + "\""};
  for (const Isc::Use& use : found->flows) {
    const Isc::Flow* flow = program.findFlow(use.name, use.array);
    if (flow == nullptr)
      return Failure{.text = "procedure \"" + procedure.name + "\" needs a flow \"" + use.name + "\", there is none"};
    TESSEL_TRY(addFlow(*flow, amounts));
  }
  std::erase_if(amounts, [](const Amount& amount) { return amount.total() == 0; });
  return amounts;
}

Result<IscLayout> IscLayout::make(const Isc::Program& program, const std::vector<std::string>& actions) {
  Amounts most;
  for (const std::string& name : actions) {
    const Isc::Action* action = program.findAction(name);
    if (action == nullptr) continue;
    for (const Isc::Use& procedure : action->procedures) {
      const Result<Amounts> used = amounts(program, procedure);
      if (!used) return used.failure();
      for (const Amount& amount : *used) {
        Amount& row = amountOf(most, amount.array);
        row.written = std::max(row.written, amount.written);
        row.read = std::max(row.read, amount.read);
      }
    }
  }
  IscLayout layout;
  for (const Amount& row : most) {
    const std::size_t size = row.written != 0 ? row.written : row.read;
    layout.arrays_.push_back({.name = row.array, .first = layout.bits_, .size = size});
    layout.bits_ += size;
    if (layout.bits_ > mostBits)
      return Failure{.text = "the part's actions take more than " + std::to_string(mostBits) + " bits of data"};
  }
  return layout;
}

const IscLayout::Array* IscLayout::find(const std::string& name) const {
  const auto place = std::find_if(arrays_.begin(), arrays_.end(), [&](const Array& row) { return row.name == name; });
  return place == arrays_.end() ? nullptr : &*place;
}
