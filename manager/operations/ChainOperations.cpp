// Finding out what is on the chain, and testing it.

#include <vector>

#include "manager/cables/CableDiagnostics.h"
#include "manager/operations/Operation.h"
#include "manager/scan/ChainScan.h"

namespace {

constexpr std::size_t idcodeBits = 32;

std::string shownIdcode(const BitVector& idcode) {
  return idcode.size() < idcodeBits ? "no IDCODE" : "IDCODE 0x" + idcode.hex();
}

ChainDevice deviceFor(PartLibrary& parts, const BitVector& idcode, std::vector<std::string>& problems) {
  ChainDevice device;
  if (idcode.size() < idcodeBits) return device;
  device.idcode = idcode;
  device.part = parts.identify(idcode, &problems);
  if (device.part == nullptr) return device;
  device.name = device.part->name;
  device.irLength = device.part->irLength;
  return device;
}

/// What is left of the instruction bits for the unknown devices between known ones: measured when one device is
/// unknown, else split where captures begin, if that is possible in one way only.
void measureUnknown(std::vector<ChainDevice>& devices, const ChainScan::Found& found) {
  std::size_t known = 0;
  std::vector<std::size_t> unknown;
  for (std::size_t i = 0; i < devices.size(); ++i) {
    known += devices[i].irLength;
    if (devices[i].irLength == 0) unknown.push_back(i);
  }
  if (unknown.empty() || known >= found.totalIrLength) return;
  if (unknown.size() == 1) {
    devices[unknown.front()].irLength = found.totalIrLength - known;
    return;
  }
  // The captured bits of the device next to TDO come first; each device's two lowest are 01.
  std::vector<std::size_t> starts;
  for (std::size_t bit = 0; bit + 1 < found.irCapture.size(); ++bit)
    if (found.irCapture.number(bit, 2) == 1) starts.push_back(bit);
  if (starts.size() != devices.size()) return;
  starts.push_back(found.irCapture.size());
  for (const std::size_t i : unknown) {
    const std::size_t fromTdo = devices.size() - 1 - i;
    devices[i].irLength = starts[fromTdo + 1] - starts[fromTdo];
  }
}

/// A device that is where it was keeps its files and attributes.
void keepDescription(DeviceChain& before, std::vector<ChainDevice>& devices) {
  if (static_cast<std::size_t>(before.size()) != devices.size()) return;
  for (int i = 0; i < before.size(); ++i) {
    ChainDevice& now = devices[static_cast<std::size_t>(i)];
    ChainDevice& then = before.at(i);
    const bool same = now.part != nullptr ? now.part == then.part : then.part == nullptr && then.irLength != 0;
    if (!same) continue;
    then.idcode = now.idcode;
    now = std::move(then);
  }
}

Status identify(OperationContext& context, const UT_CMDARGS& /*args*/) {
  if (context.mode == tESSELNS::SPI)
    return Failure{"identify finds TAPs; in this mode name the SPI flash with addDevice -part."};
  if (context.cable.recordsOnly()) return Failure{"identify needs a cable that reads, this one only records."};
  reportStatus("Identifying chain contents...\n");
  const Result<ChainScan::Found> found = ChainScan::find(context.cable);
  if (!found) return found.failure();
  std::vector<std::string> problems;
  std::vector<ChainDevice> devices;
  for (const BitVector& idcode : found->idcodes) devices.push_back(deviceFor(context.parts, idcode, problems));
  for (const std::string& problem : problems) reportWarning("%s\n", problem);
  measureUnknown(devices, *found);
  keepDescription(context.chain, devices);
  context.chain.clear();
  for (std::size_t i = 0; i < devices.size(); ++i) {
    const std::string length = devices[i].irLength == 0 ? "unknown" : std::to_string(devices[i].irLength);
    reportStatus("'%d': Added device %s, %s, IR length %s\n", i + 1, devices[i].name, shownIdcode(found->idcodes[i]),
                 length);
    TESSEL_TRY(context.chain.insert(static_cast<int>(i), std::move(devices[i])));
  }
  reportStatus("Identified %d devices, %d instruction register bits\n", context.chain.size(), found->totalIrLength);
  return {};
}

/// Which of the devices found are MPM parts, with the PROM in front that belongs to each.
Status identifyMpm(OperationContext& context, const UT_CMDARGS& /*args*/) {
  for (int i = 0; i < context.chain.size(); ++i) {
    ChainDevice& device = context.chain.at(i);
    if (device.part == nullptr || device.part->kind != Part::Kind::mpm) continue;
    const bool pair = i > 0 && context.chain.at(i - 1).part != nullptr && context.chain.at(i - 1).name == "zp18v01";
    if (pair) context.chain.at(i - 1).texts[DeviceNS::MPM_PAIR] = "true";
    reportStatus("'%d': %s is an MPM device%s\n", i + 1, device.name, pair ? ", with the PROM in front of it" : "");
  }
  return {};
}

Status checkIntegrity(OperationContext& context, const UT_CMDARGS& /*args*/) {
  reportStatus("Checking chain integrity...\n");
  const auto tell = [](const std::string& line) { reportStatus("%s\n", line); };
  if (const auto report = CableDiagnostics::run(context.cable, tell); !report) return report.failure();
  if (context.chain.size() > 0) TESSEL_TRY(Operations::checkChain(context));
  reportStatus("The chain is sound\n");
  return {};
}

Result<BitVector> readIdcode(DeviceWork& work) {
  const Result<std::vector<BitVector>> idcodes = Operations::readIdcodes(work.context());
  if (!idcodes) return idcodes.failure();
  return (*idcodes)[work.index()];
}

Status readIdcodeWord(DeviceWork& work) {
  work.status("Reading IDCODE...");
  const Result<BitVector> idcode = readIdcode(work);
  if (!idcode) return idcode.failure();
  if (idcode->size() < idcodeBits) return Failure{Port::format("%s has no IDCODE.", work.device().name)};
  work.status("IDCODE is 0x%s", idcode->hex());
  return {};
}

Status checkIdcode(DeviceWork& work) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  work.status("Checking IDCODE...");
  const Result<BitVector> idcode = readIdcode(work);
  if (!idcode) return idcode.failure();
  if (!(*part)->matchesIdcode(*idcode))
    return Failure{Port::format("The device has %s, which is not that of %s.", shownIdcode(*idcode), (*part)->name)};
  work.status("IDCODE 0x%s is that of %s", idcode->hex(), (*part)->name);
  return {};
}

constexpr OperationRow rows[] = {
    {"identify", nullptr, false, identify, 2},
    {"identifyMPM", nullptr, false, identifyMpm},
    {"checkIntegrity", nullptr, false, checkIntegrity},
    {"readidcode", readIdcodeWord, false},
    {"checkidcode", checkIdcode, false},
};

}  // namespace

const std::span<const OperationRow> chainOperations = rows;
