#include "manager/simulator/IscModel.h"

#include <algorithm>
#include <functional>

namespace {

using Visit = std::function<void(const Isc::Flow&, const Isc::Block&, const Isc::Step&)>;

void forEachStep(const Part& part, const std::string& instruction, const Visit& visit) {
  for (const Isc::Flow& flow : part.isc.flows)
    for (const Isc::Block& block : flow.blocks)
      for (const Isc::Item& item : block.items)
        for (const Isc::Step& step : item.steps)
          if (step.instruction == instruction) visit(flow, block, step);
}

std::size_t width(const std::vector<Isc::Field>& fields) {
  std::size_t bits = 0;
  for (const Isc::Field& field : fields) bits += field.length;
  return bits;
}

/// What the part's flows tell about the steps of one instruction.
struct Use {
  std::size_t updateBits = 0;
  std::size_t captureBits = 0;
  bool updates = false;
  std::optional<BitVector> key;  ///< the same constant in all updates
  std::uint64_t step = 0;        ///< of "$variable+step"
  double wait = 0;               ///< the shortest one there is, in seconds
};

std::optional<BitVector> constantOf(const std::vector<Isc::Field>& fields) {
  BitVector bits;
  for (const Isc::Field& field : fields) {
    if (field.value.kind != Isc::Value::Kind::bits) return std::nullopt;
    BitVector value = field.value.complement ? ~field.value.bits : field.value.bits;
    value.resize(field.length);
    bits.append(value);
  }
  return bits;
}

std::uint64_t stepOf(const std::vector<Isc::Field>& fields) {
  for (const Isc::Field& field : fields)
    if (field.value.kind == Isc::Value::Kind::add && field.value.bits.size() <= BitVector::wordBits)
      return field.value.bits.number();
  return 0;
}

Use useOf(const Part& part, const std::string& instruction) {
  Use use;
  bool first = true;
  forEachStep(part, instruction, [&](const Isc::Flow&, const Isc::Block&, const Isc::Step& step) {
    use.updateBits = std::max(use.updateBits, width(step.updates));
    use.captureBits = std::max(use.captureBits, width(step.captures));
    if (!step.updates.empty()) {
      const std::optional<BitVector> constant = constantOf(step.updates);
      use.key = use.updates && use.key != constant ? std::nullopt : constant;
      use.updates = true;
    }
    if (use.step == 0) use.step = stepOf(step.updates);
    use.wait = first ? step.least.seconds : std::min(use.wait, step.least.seconds);
    first = false;
  });
  return use;
}

/// How many pages the flow walks over that has the most steps of this instruction.
std::size_t countPages(const Part& part, const std::string& instruction) {
  std::map<const Isc::Flow*, std::uint64_t> pages;
  forEachStep(part, instruction, [&](const Isc::Flow& flow, const Isc::Block& block, const Isc::Step&) {
    pages[&flow] += block.kind == Isc::Block::Kind::repeat ? block.count : 1;
  });
  std::uint64_t most = 0;
  for (const auto& [flow, count] : pages) most = std::max(most, count);
  return static_cast<std::size_t>(std::min<std::uint64_t>(most, IscModels::mostBits));
}

/// The waits of the flows are those after which a maker promises the end.
double timeOf(const std::optional<double>& chosen, const Use& use, double standard) {
  if (chosen) return *chosen;
  return use.wait > 0 ? use.wait * 0.9 : standard;
}

Status findSize(const Part& part, const IscModelChoice& choice, IscModel& model) {
  model.programTakesData = useOf(part, model.program).updateBits > 0;
  const std::string& data = model.programTakesData ? model.program : model.data;
  if (part.opcode(data) == nullptr && !choice.pages) return {};
  model.bits = choice.bits.value_or(IscModels::registerLength(part, data));
  if (model.bits == 0) {
    if (!choice.pages) return {};
    return Failure{"the part \"" + part.name + "\" does not tell how many bits a page has: give \"bits\""};
  }
  model.pages =
      choice.pages.value_or(part.memoryBits > 0 ? part.memoryBits / model.bits : countPages(part, model.program));
  if (model.bits > IscModels::mostBits / std::max<std::size_t>(model.pages, 1))
    return Failure{"the memory of \"" + part.name + "\" is larger than 2^30 bits"};
  return {};
}

Status checkRoles(const Part& part, const IscModel& model) {
  for (const std::string* role : {&model.erase, &model.program, &model.read})
    if (part.opcode(*role) == nullptr) return Failure{"the part \"" + part.name + "\" has no instruction " + *role};
  if (!model.programTakesData && part.opcode(model.data) == nullptr)
    return Failure{"the part \"" + part.name + "\" has no instruction " + model.data};
  return {};
}

void findStatus(const Part& part, const IscModelChoice& choice, IscModel& model) {
  model.statusBits = IscModels::registerLength(part, model.status);
  if (!choice.statusMask) return;
  if (model.statusBits == 0) model.statusBits = choice.statusMask->size();
  model.statusMask = choice.statusMask;
  model.statusMask->resize(model.statusBits);
  model.statusBusy = choice.statusBusy.value_or(*choice.statusMask);
  model.statusBusy->resize(model.statusBits);
}

}  // namespace

std::size_t IscModels::registerLength(const Part& part, const std::string& instruction) {
  if (const auto access = part.access.find(instruction); access != part.access.end()) {
    const std::string& reg = access->second.reg;
    if (reg == "BYPASS") return 1;
    if (reg == "BOUNDARY") return part.boundary.size();
    if (reg == "DEVICE_ID") return 32;
    if (access->second.length > 0) return access->second.length;
  }
  for (const NamedRegister& reg : part.registers)
    if (reg.instruction == instruction || reg.writeInstruction == instruction) return reg.length;
  const Use use = useOf(part, instruction);
  return std::max(use.updateBits, use.captureBits);
}

KeyedInstruction IscModels::keyed(const Part& part, const std::string& instruction) {
  const Use use = useOf(part, instruction);
  return {.name = instruction, .bits = use.updates ? registerLength(part, instruction) : 0, .key = use.key};
}

Result<IscModel> IscModels::make(const Part& part, const IscModelChoice& choice) {
  IscModel model = choice.names;
  const Use address = useOf(part, model.address);
  model.eraseTime = timeOf(choice.eraseTime, useOf(part, model.erase), 0.01);
  model.programTime = timeOf(choice.programTime, useOf(part, model.program), 0.0005);
  model.addressBits = registerLength(part, model.address);
  model.addressStep = std::max<std::uint64_t>(choice.addressStep.value_or(address.step), 1);
  findStatus(part, choice, model);
  TESSEL_TRY(findSize(part, choice, model));
  if (choice.pages) TESSEL_TRY(checkRoles(part, model));
  return model;
}
