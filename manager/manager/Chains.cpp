// The chain of each mode: its devices, their files, attributes and attached flash.

#include <cstdlib>
#include <filesystem>

#include "interfaces/portability/FormatArgument.h"
#include "interfaces/portability/UT_PATH.h"
#include "interfaces/portability/UT_STR.h"
#include "manager/chain/Attributes.h"
#include "manager/content/Bitstream.h"
#include "manager/content/DataFile.h"
#include "manager/manager/DeviceManager.h"
#include "manager/support/Report.h"

namespace {

bool report(const Status& status) { return status.ok() || reportError("%s\n", status.failure().text); }

bool isBsdl(const std::string& file) {
  const char* extension = UT_PATH::GetExt(file.c_str());
  if (extension == nullptr) return false;
  for (const char* each : {"bsd", "bsdl", "bsm"})
    if (UT_STR::ICompare(extension, each) == 0) return true;
  return false;
}

ChainDevice deviceOf(PartPointer part) {
  ChainDevice device;
  device.name = part->name;
  device.irLength = part->irLength;
  device.part = std::move(part);
  return device;
}

Result<DataImage> readData(const std::string& file) {
  return DataFile::read(file, DataFile::formatOf(file).value_or(DataFile::Format::binary));
}

/// The part whose IDCODE stands at the head of a bitstream.
Result<PartPointer> partOfBitstream(PartLibrary& parts, const std::string& file) {
  const Result<DataImage> image = readData(file);
  if (!image) return image.failure();
  const auto header = Bitstream::header(image->flatten(0, Bitstream::headerBytes));
  if (!header)
    return Failure{
        Port::format("%s does not tell which part it is for, expected a BSDL file or a bitstream. "
                     "Use -part and assignFile.",
                     file)};
  if (PartPointer part = parts.identify(BitVector::fromNumber(header->idcode, 32))) return part;
  return Failure{Port::format("%s is a bitstream for IDCODE 0x%08X, which no known part has.", file, header->idcode)};
}

std::vector<std::string> directoriesNamed() {
  std::vector<std::string> directories;
  const std::string preferred = TesselPreference::getPreferenceObject().get(TesselPreference::partsDirectory);
  if (!preferred.empty()) directories.push_back(preferred);
  const char* variable = std::getenv("TESSEL_PARTS");
  std::string list = variable == nullptr ? "" : variable;
  while (!list.empty()) {
    const std::size_t end = std::min(list.find(':'), list.size());
    if (end > 0) directories.push_back(list.substr(0, end));
    list.erase(0, end + 1);
  }
  return directories;
}

std::string quotedPath(const std::string& path) { return "\"" + path + "\""; }

}  // namespace

PartLibrary& DeviceManager::parts() {
  std::vector<std::string> named = directoriesNamed();
  if (named != partsDirectories_) {
    parts_ = PartLibrary(named);
    partsDirectories_ = std::move(named);
  }
  return parts_;
}

DeviceChain* DeviceManager::chain(const char* command) {
  if (hasChain(activeMode_)) return &chains_[activeMode_];
  if (activeMode_ == tESSELNS::NO_MODE)
    reportError("%s needs a mode. Use setMode.\n", command);
  else
    reportError("%s in this mode is not built yet.\n", command);
  return nullptr;
}

ChainDevice* DeviceManager::device(const char* command, int position) {
  DeviceChain* devices = chain(command);
  if (devices == nullptr) return nullptr;
  const Result<ChainDevice*> found = devices->find(position);
  if (found) return *found;
  reportError("%s: %s\n", command, found.failure().text);
  return nullptr;
}

bool DeviceManager::insert(int position, ChainDevice device, const std::string& step) {
  if (!report(chains_[activeMode_].insert(position, std::move(device)))) return false;
  recordStep(step);
  return true;
}

int DeviceManager::getDeviceChainCount() {
  const auto found = chains_.find(activeMode_);
  return found == chains_.end() ? 0 : found->second.size();
}

bool DeviceManager::addDeviceByPart(int position, const char* part) {
  if (chain("addDevice") == nullptr) return false;
  const std::string step = Port::format("addDevice -p %d -part %s", position + 1, part);
  if (activeMode_ == tESSELNS::SPI) {
    ChainDevice flash;
    flash.spi = FlashParts::findSpi(part);
    if (flash.spi == nullptr) return reportError("There is no SPI flash part %s.\n", part);
    flash.name = flash.spi->name;
    return insert(position, std::move(flash), step);
  }
  const Result<PartPointer> found = parts().find(part);
  if (found) return insert(position, deviceOf(*found), step);
  if (FlashParts::findSpi(part) != nullptr || FlashParts::findBpi(part) != nullptr)
    return reportError("%s is a flash memory, which stands behind a device of the chain. Use attachFlash.\n", part);
  return reportError("%s\n", found.failure().text);
}

bool DeviceManager::addDeviceByFile(int position, const char* file, const char* bmmFile,
                                    std::vector<StringBase> extraFiles) {
  if (chain("addDevice") == nullptr) return false;
  const Result<PartPointer> part = isBsdl(file) ? parts().read(file) : partOfBitstream(parts(), file);
  if (!part) return reportError("%s\n", part.failure().text);
  ChainDevice device = deviceOf(*part);
  if (!isBsdl(file)) device.file = file;
  if (bmmFile != nullptr) device.bmmFile = bmmFile;
  for (const StringBase& each : extraFiles) device.extraFiles.emplace_back(each.view());
  return insert(position, std::move(device), Port::format("addDevice -p %d -file %s", position + 1, quotedPath(file)));
}

bool DeviceManager::addCoreFiles(int position, CoreFiles files) {
  ChainDevice* found = device("Adding core files", position);
  if (found == nullptr) return false;
  for (const auto& [core, file] : files) found->coreFiles[core] = file.view();
  return true;
}

bool DeviceManager::clearCoreFiles(int position, int core) {
  ChainDevice* found = device("Clearing core files", position);
  if (found == nullptr) return false;
  found->coreFiles.erase(core);  // also a core that has none: the interpreter asks for one more than the user named
  return true;
}

bool DeviceManager::addExtraFiles(int position, std::vector<StringBase> files) {
  ChainDevice* found = device("Adding extra files", position);
  if (found == nullptr) return false;
  for (const StringBase& each : files) found->extraFiles.emplace_back(each.view());
  return true;
}

bool DeviceManager::clearAdditionalConfigFiles(int position) {
  ChainDevice* found = device("clearAdditionalConfigFiles", position);
  if (found == nullptr) return false;
  found->extraFiles.clear();
  found->coreFiles.clear();
  return true;
}

bool DeviceManager::assignFile(int position, const char* file) {
  ChainDevice* found = device("assignFile", position);
  if (found == nullptr) return false;
  if (isBsdl(file)) {
    const Result<PartPointer> part = parts().read(file);
    if (!part) return reportError("%s\n", part.failure().text);
    found->part = *part;
    found->name = (*part)->name;
    found->irLength = (*part)->irLength;
  } else {
    if (const Result<DataImage> data = readData(file); !data) return reportError("%s\n", data.failure().text);
    found->file = file;
  }
  recordStep(Port::format("assignFile -p %d -file %s", position + 1, quotedPath(file)));
  return true;
}

bool DeviceManager::removeDevice(int position) {
  if (device("deleteDevice", position) == nullptr) return false;
  if (!report(chains_[activeMode_].remove(position))) return false;
  recordStep(Port::format("deleteDevice -p %d", position + 1));
  return true;
}

bool DeviceManager::attachDeviceByPart(int position, FLASH_TYPE type, const char* part) {
  ChainDevice* found = device("attachFlash", position);
  if (found == nullptr) return false;
  const bool spi = type == tESSELNS::SPI_FLASH;
  const char* kind = spi ? "SPI" : "BPI";
  if (part == nullptr) return reportError("attachFlash needs the name of a part behind -%s.\n", spi ? "spi" : "bpi");
  const bool known = spi ? FlashParts::findSpi(part) != nullptr : FlashParts::findBpi(part) != nullptr;
  if (!known) return reportError("There is no %s flash part %s.\n", kind, part);
  if (found->part == nullptr)
    return reportError("'%d': %s flash can't be attached to a device that is %s.\n", position + 1, kind, found->name);
  const std::string& bridge = spi ? found->part->bridge.spiInstruction : found->part->bridge.bpiInstruction;
  if (bridge.empty()) return reportError("'%d': %s reaches no %s flash.\n", position + 1, found->part->name, kind);
  std::optional<AttachedFlash>& place = spi ? found->spiFlash : found->bpiFlash;
  place.emplace();
  place->partName = part;
  recordStep(Port::format("attachFlash -p %d -%s %s", position + 1, spi ? "spi" : "bpi", part));
  return true;
}

bool DeviceManager::assignFileToFlashDevice(int position, FLASH_TYPE type, const char* file) {
  ChainDevice* found = device("assignFileToAttachedFlash", position);
  if (found == nullptr) return false;
  std::optional<AttachedFlash>& flash = type == tESSELNS::SPI_FLASH ? found->spiFlash : found->bpiFlash;
  if (!flash) return reportError("'%d': No flash is attached to %s. Use attachFlash.\n", position + 1, found->name);
  if (const Result<DataImage> data = readData(file); !data) return reportError("%s\n", data.failure().text);
  flash->file = file;
  recordStep(Port::format("assignFileToAttachedFlash -p %d -file %s", position + 1, quotedPath(file)));
  return true;
}

bool DeviceManager::deleteAttachedDevice(int position) {
  ChainDevice* found = device("deleteAttachedFlash", position);
  if (found == nullptr) return false;
  if (found->attached() == nullptr)
    return reportError("'%d': No flash is attached to %s.\n", position + 1, found->name);
  found->spiFlash.reset();
  found->bpiFlash.reset();
  recordStep(Port::format("deleteAttachedFlash -p %d", position + 1));
  return true;
}

const char* DeviceManager::getDeviceAttribute(int position, DeviceNS::ATTRIBUTE attribute) {
  const auto found = chains_.find(activeMode_);
  if (found == chains_.end() || !found->second.has(position)) return nullptr;
  const std::optional<std::string> text = Attributes::get(found->second.at(position), attribute);
  if (!text) return nullptr;
  answer_ = *text;
  return answer_.c_str();
}

bool DeviceManager::setDeviceAttribute(int position, DeviceNS::ATTRIBUTE attribute, const char* value, bool quiet) {
  if (attribute == DeviceNS::CONFIG_FILE_NAME) return assignFile(position, value);
  ChainDevice* found = device("setAttribute", position);
  if (found == nullptr) return false;
  if (attribute == DeviceNS::KEY && quiet) {
    found->efuseKey.set(value);  // for the operation that follows, and for nothing else
    return true;
  }
  if (const Status set = Attributes::set(*found, attribute, value); !set)
    return reportError("'%d': %s\n", position + 1, set.failure().text);
  return true;
}

bool DeviceManager::setAttribute(int position, MODE_TYPE mode, DeviceNS::ATTRIBUTE attribute, const char* value,
                                 bool /*attached*/) {
  const auto found = chains_.find(mode);
  if (found == chains_.end() || !found->second.has(position))
    return reportError("There is no device %d in that mode.\n", position + 1);
  AttachedFlash* flash = found->second.at(position).attached();
  if (flash == nullptr) return reportError("'%d': No flash is attached. Use attachFlash.\n", position + 1);
  if (const Status set = Attributes::set(*flash, attribute, value); !set)
    return reportError("'%d': %s\n", position + 1, set.failure().text);
  return true;
}

DeviceOptionsMgr* DeviceManager::getDeviceOptionsMgr(MODE_TYPE mode, int position, bool attachedFlash) {
  const auto found = chains_.find(mode);
  if (found == chains_.end() || !found->second.has(position)) return &noOptions_;
  ChainDevice& device = found->second.at(position);
  AttachedFlash* flash = device.attached();
  if (attachedFlash && flash == nullptr) return &noOptions_;
  StoredOptions& stored = attachedFlash ? flash->stored : device.stored;
  DeviceOptionsMgr& options = attachedFlash ? flash->options : device.options;
  const TesselPreference& preferences = TesselPreference::getPreferenceObject();
  stored.give(options, {{DeviceNS::ERASE_FIRST, preferences.get(TesselPreference::eraseFirst)},
                        {DeviceNS::VERIFY_AFTER, preferences.get(TesselPreference::verifyAfter)}});
  return &options;
}
