#include "manager/operations/Operations.h"

#include <array>
#include <functional>
#include <vector>

#include "interfaces/portability/UT_STR.h"
#include "interfaces/utility/Callback.h"
#include "manager/operations/SpiMode.h"
#include "manager/scan/ChainScan.h"

namespace {

bool isWord(const OperationRow& row, const std::string& word) {
  if (row.shortest > 0 && word.size() >= row.shortest && word.size() < std::string_view(row.word).size())
    return UT_STR::INCompare(row.word, word.c_str(), static_cast<int>(word.size())) == 0;
  return UT_STR::ICompare(row.word, word.c_str()) == 0;
}

const OperationRow* findRow(const char* word) {
  const std::array families{chainOperations, registerOperations, memoryOperations, boundaryOperations};
  for (const std::span<const OperationRow>& family : families)
    for (const OperationRow& row : family)
      if (isWord(row, word)) return &row;
  return nullptr;
}

/// The positions that a command means. With -target the words of the target are the last ones.
std::vector<int> positionsOf(const UT_CMDARGS& args) {
  const UT_CMDSWINFO* found = args.getsw("-p", 0);
  if (args.findsw("-target"))
    for (int i = 1; args.getsw("-p", i) != nullptr; ++i) found = args.getsw("-p", i);
  if (found == nullptr) found = args.getsw("-position", 0);
  std::vector<int> positions;
  for (int i = 0; found != nullptr && i < found->getnumargs(); ++i) positions.push_back(found->getargnum(i));
  return positions;
}

bool report(int position, const Failure& failure) {
  if (failure.text.starts_with('\'')) return reportError("%s\n", failure.text);
  return reportError("'%d': %s\n", position + 1, failure.text);
}

/// The positions of a command, all of them on the chain; empty after a message.
std::vector<int> checkedPositions(OperationContext& context, const UT_CMDARGS& args, const OperationRow& row) {
  std::vector<int> positions = positionsOf(args);
  if (positions.empty()) reportError("%s needs a position.\n", row.word);
  for (const int position : positions)
    if (const Result<ChainDevice*> device = context.chain.find(position); !device) {
      reportError("%s: %s\n", row.word, device.failure().text);
      return {};
    }
  return positions;
}

/// Runs a handler at each position, to the last one unless the link is lost.
bool forEach(const std::vector<int>& positions, bool& linkLost, const std::function<Status(int)>& handler) {
  bool all = true;
  for (const int position : positions) {
    const Status outcome = handler(position);
    if (outcome) continue;
    all = report(position, outcome.failure());
    linkLost = outcome.failure().kind == Failure::Kind::link;
    if (linkLost) break;
  }
  return all;
}

/// The device-by-device run of a word.
bool runOnDevices(OperationContext& context, const UT_CMDARGS& args, const OperationRow& row, bool& linkLost) {
  const std::vector<int> positions = checkedPositions(context, args, row);
  if (positions.empty()) return false;
  if (context.mode == tESSELNS::SPI)
    return forEach(positions, linkLost, [&](int position) { return SpiMode::run(context, args, row, position); });
  const Result<std::vector<std::size_t>> lengths =
      row.checksChain ? context.chain.irLengths()
                      : std::vector<std::size_t>(static_cast<std::size_t>(context.chain.size()));
  if (!lengths) return reportError("%s\n", lengths.failure().text);
  if (row.checksChain)
    if (const Status chain = Operations::checkChain(context); !chain) {
      linkLost = chain.failure().kind == Failure::Kind::link;
      return reportError("%s\n", chain.failure().text);
    }
  ScanChain scan(context.cable, *lengths);
  return forEach(positions, linkLost, [&](int position) {
    DeviceWork work(context, args, scan, position);
    const Status outcome = row.device(work);
    return outcome ? context.cable.flush() : outcome;
  });
}

bool runOnChain(OperationContext& context, const UT_CMDARGS& args, const OperationRow& row, bool& linkLost) {
  const Status outcome = row.chain(context, args);
  if (outcome) return true;
  linkLost = outcome.failure().kind == Failure::Kind::link;
  return reportError("%s\n", outcome.failure().text);
}

}  // namespace

Result<PartPointer> DeviceWork::part() {
  if (device().part != nullptr) return device().part;
  return Failure{Port::format("%s needs a device whose part is known, this one is %s.", args_.getcmd(), device().name)};
}

const char* DeviceWork::text(const char* name) const {
  const UT_CMDSWINFO* found = args_.getsw(name, 0);
  return found == nullptr ? nullptr : found->getargtxt(0);
}

Progress DeviceWork::progress() {
  if (context_.progressCallback == nullptr) return [](std::uint64_t, std::uint64_t) {};
  return [callback = context_.progressCallback, last = -1](std::uint64_t done, std::uint64_t total) mutable {
    constexpr int whole = 100;
    const int percent = total == 0 ? whole : static_cast<int>(done * whole / total);
    if (percent == last) return;
    last = percent;
    Callback event(Callback::update, percent, whole);
    callback(event);
  };
}

Result<std::vector<BitVector>> Operations::readIdcodes(OperationContext& context) {
  Result<std::vector<BitVector>> idcodes = ChainScan::findIdcodes(context.cable);
  if (!idcodes || idcodes->size() == static_cast<std::size_t>(context.chain.size())) return idcodes;
  return Failure{Port::format("The chain has %d devices, not the %d that were described. Try identify.",
                              idcodes->size(), context.chain.size())};
}

Status Operations::checkChain(OperationContext& context) {
  if (context.cable.recordsOnly()) return {};
  const Result<std::vector<BitVector>> idcodes = readIdcodes(context);
  if (!idcodes) return idcodes.failure();
  for (int i = 0; i < context.chain.size(); ++i) {
    const ChainDevice& device = context.chain.at(i);
    const BitVector& idcode = (*idcodes)[static_cast<std::size_t>(i)];
    if (device.part == nullptr || device.part->idcodes.empty() || device.part->matchesIdcode(idcode)) continue;
    if (idcode.size() < 32)
      return Failure{Port::format("'%d': The device has no IDCODE, so it is not %s.", i + 1, device.part->name)};
    return Failure{
        Port::format("'%d': IDCODE is 0x%s, which is not that of %s.", i + 1, idcode.hex(), device.part->name)};
  }
  return {};
}

bool Operations::isBuilt(const char* word) { return findRow(word) != nullptr; }

bool Operations::run(OperationContext& context, const UT_CMDARGS& args, bool& linkLost) {
  linkLost = false;
  const OperationRow* row = findRow(args.getcmd());
  if (context.mode == tESSELNS::SLAVE_SERIAL || context.mode == tESSELNS::PARALLEL_PORT)
    return reportError("%s in this mode needs a cable with pins for it; the cables here have those of a TAP only.\n",
                       args.getcmd());
  const auto tell = [&context](Callback::ProgressStatus status) {
    if (context.progressCallback == nullptr) return;
    Callback event(status, 0, 0);
    context.progressCallback(event);
  };
  tell(Callback::start);
  const bool result =
      row->chain != nullptr ? runOnChain(context, args, *row, linkLost) : runOnDevices(context, args, *row, linkLost);
  tell(Callback::end);
  return result;
}
