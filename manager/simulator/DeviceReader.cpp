#include "manager/simulator/DeviceReader.h"

#include <algorithm>
#include <filesystem>

#include "manager/content/DataFile.h"

namespace {

constexpr double longestTime = 3600;  // seconds

/// The keys of "times" in an attached flash or a model.
template <class Times>
struct TimeKey {
  const char* key;
  double Times::*time;
};

template <class Times, std::size_t Count>
void readTimes(JsonObject& object, Times& times, const TimeKey<Times> (&keys)[Count]) {
  std::optional<JsonObject> given = object.object("times");
  if (!given) return;
  for (const TimeKey<Times>& row : keys)
    times.*row.time = given->number(row.key, 0, longestTime).value_or(times.*row.time);
  given->finish();
}

constexpr TimeKey<SpiFlash::Times> spiTimes[] = {
    {"program", &SpiFlash::Times::program},     {"erase4k", &SpiFlash::Times::erase4k},
    {"erase32k", &SpiFlash::Times::erase32k},   {"erase64k", &SpiFlash::Times::erase64k},
    {"eraseChip", &SpiFlash::Times::eraseChip}, {"status", &SpiFlash::Times::status},
};

constexpr TimeKey<BpiFlash::Times> bpiTimes[] = {
    {"program", &BpiFlash::Times::program},
    {"buffer", &BpiFlash::Times::buffer},
    {"eraseSector", &BpiFlash::Times::eraseSector},
    {"eraseChip", &BpiFlash::Times::eraseChip},
};

struct RoleKey {
  const char* key;
  std::string IscModel::*instruction;
};

const RoleKey roles[] = {
    {"enable", &IscModel::enable},   {"disable", &IscModel::disable}, {"erase", &IscModel::erase},
    {"address", &IscModel::address}, {"data", &IscModel::data},       {"program", &IscModel::program},
    {"read", &IscModel::read},       {"status", &IscModel::status},
};

template <class Table>
std::string namesOf(const Table& table) {
  std::string names;
  for (const auto& part : table) names += (names.empty() ? "" : ", ") + std::string(part.name);
  return names;
}

std::string upper(std::string text) {
  std::transform(text.begin(), text.end(), text.begin(),
                 [](unsigned char letter) { return static_cast<char>(std::toupper(letter)); });
  return text;
}

}  // namespace

std::string DeviceReader::pathOf(const std::string& path) const {
  return (std::filesystem::path(directory_) / path).string();
}

DeviceDescription DeviceReader::read(JsonObject& entry) {
  DeviceDescription device;
  device.part = readPart(entry);
  if (device.part == nullptr) return device;
  device.content = readContent(entry, "memory");
  readSpi(entry, device);
  readBpi(entry, device);
  readRegisters(entry, device);
  readMonitors(entry, device);
  readModel(entry, device);
  readFaults(entry, device);
  entry.finish();
  return device;
}

PartPointer DeviceReader::readPart(JsonObject& entry) {
  const std::optional<std::string> part = entry.text("part");
  const std::optional<std::string> bsdl = entry.text("bsdl");
  if (part.has_value() == bsdl.has_value()) {
    entry.report("part", "expected either \"part\" or \"bsdl\"");
    return nullptr;
  }
  Result<PartPointer> found = part ? parts_.find(*part) : parts_.read(pathOf(*bsdl));
  if (!found) {
    entry.report(part ? "part" : "bsdl", found.failure().text);
    return nullptr;
  }
  if ((*found)->irLength < 2 || (*found)->irLength > IscModels::mostBits) {
    entry.report(part ? "part" : "bsdl", "an instruction register has at least 2 bits");
    return nullptr;
  }
  return *found;
}

std::vector<std::uint8_t> DeviceReader::readContent(JsonObject& entry, const std::string& key) {
  const std::optional<std::string> path = entry.text(key);
  if (!path) return {};
  const auto format = DataFile::formatOf(*path);
  if (!format) {
    entry.report(key, "the extension of " + *path + " tells no format; known are .bin, .bit, .mcs, .exo, .hex, .rbt");
    return {};
  }
  Result<DataImage> image = DataFile::read(pathOf(*path), *format);
  if (!image) {
    entry.report(key, image.failure().text);
    return {};
  }
  if (image->end() > IscModels::mostBits / 8) {
    entry.report(key, *path + " reaches beyond the largest memory");
    return {};
  }
  return image->flatten(0, image->end());
}

void DeviceReader::readSpi(JsonObject& entry, DeviceDescription& device) {
  std::optional<JsonObject> object = entry.object("spi");
  if (!object) return;
  const std::string name = object->text("part").value_or("");
  DeviceDescription::Spi spi;
  spi.part = FlashParts::findSpi(name);
  if (spi.part == nullptr)
    object->report("part", "no SPI flash \"" + name + "\"; known are " + namesOf(FlashParts::spi()));
  if (device.part->bridge.spiInstruction.empty())
    entry.report("spi", "the part \"" + device.part->name + "\" reaches no SPI flash");
  spi.content = readContent(*object, "file");
  readTimes(*object, spi.times, spiTimes);
  object->finish();
  device.spi = std::move(spi);
}

void DeviceReader::readBpi(JsonObject& entry, DeviceDescription& device) {
  std::optional<JsonObject> object = entry.object("bpi");
  if (!object) return;
  const std::string name = object->text("part").value_or("");
  DeviceDescription::Bpi bpi;
  bpi.part = FlashParts::findBpi(name);
  if (bpi.part == nullptr)
    object->report("part", "no BPI flash \"" + name + "\"; known are " + namesOf(FlashParts::bpi()));
  if (device.part->bridge.bpiInstruction.empty())
    entry.report("bpi", "the part \"" + device.part->name + "\" reaches no BPI flash");
  bpi.content = readContent(*object, "file");
  readTimes(*object, bpi.times, bpiTimes);
  object->finish();
  device.bpi = std::move(bpi);
}

void DeviceReader::readRegisters(JsonObject& entry, DeviceDescription& device) {
  if (const auto usercode = entry.hex("usercode", 32)) device.registers["usercode"] = *usercode;
  if (const auto dna = entry.hex("dna", 64)) device.registers["dna"] = *dna;
  std::optional<JsonObject> object = entry.object("registers");
  if (!object) return;
  for (const std::string& name : object->keys()) {
    const NamedRegister* known = device.part->findRegister(name);
    if (known == nullptr) {
      object->report(name, "the part \"" + device.part->name + "\" has no such register");
    } else if (const auto value = object->hex(name, known->length)) {
      device.registers[name] = *value;
    }
  }
}

void DeviceReader::readMonitors(JsonObject& entry, DeviceDescription& device) {
  std::optional<JsonObject> object = entry.object("monitors");
  if (!object) return;
  for (const std::string& name : object->keys()) {
    bool known = false;
    for (const NamedRegister& reg : device.part->registers)
      for (const RegisterField& field : reg.fields) known = known || (field.name == name && field.scale != 0);
    if (!known) object->report(name, "the part \"" + device.part->name + "\" has no such monitor");
    if (const auto quantity = object->number(name, -1e6, 1e6)) device.monitors[name] = *quantity;
  }
}

void DeviceReader::readModel(JsonObject& entry, DeviceDescription& device) {
  IscModelChoice choice;
  std::optional<JsonObject> object = entry.object("model");
  if (object) {
    choice.pages = object->count("pages", 1, IscModels::mostBits);
    choice.bits = object->count("bits", 1, IscModels::mostBits);
    choice.addressStep = object->count("addressStep", 1, std::uint64_t{1} << 32);
    if (auto names = object->object("roles")) {
      for (const RoleKey& role : roles) {
        const auto instruction = names->text(role.key);
        if (!instruction) continue;
        choice.names.*role.instruction = upper(*instruction);
        if (device.part->opcode(upper(*instruction)) == nullptr)
          names->report(role.key, "the part \"" + device.part->name + "\" has no instruction " + *instruction);
      }
      names->finish();
    }
    if (auto times = object->object("times")) {
      choice.eraseTime = times->number("erase", 0, longestTime);
      choice.programTime = times->number("program", 0, longestTime);
      times->finish();
    }
    if (auto status = object->object("status")) {
      choice.statusMask = status->hex("mask", 0);
      choice.statusBusy = status->hex("busy", 0);
      if (!status->has("mask")) status->report("mask", "missing");
      status->finish();
    }
    object->finish();
  }
  Result<IscModel> model = IscModels::make(*device.part, choice);
  if (model) {
    device.isc = std::move(*model);
  } else {
    entry.report("model", model.failure().text);
  }
}

void DeviceReader::readFaults(JsonObject& entry, DeviceDescription& device) {
  std::optional<JsonObject> faults = entry.object("faults");
  if (!faults) return;
  device.endlessBusy = faults->boolean("busyForever").value_or(false);
  if (const auto idcode = faults->hex("idcode", 32)) device.idcode = static_cast<std::uint32_t>(idcode->number());
  faults->finish();
}
