#include "manager/chain/Attributes.h"

#include <algorithm>
#include <string_view>

#include "interfaces/devicemanager/AttributeNames.h"
#include "interfaces/portability/FormatArgument.h"

namespace {

constexpr std::string_view hexDigits = "0123456789abcdefABCDEF";
constexpr std::string_view decimalDigits = "0123456789";

bool isTruth(std::string_view value) { return value == "true" || value == "false"; }
bool isShortHex(std::string_view value) {
  return value.size() <= 8 && value.find_first_not_of(hexDigits) == std::string_view::npos;
}
bool isSmallNumber(std::string_view value) {
  return !value.empty() && value.size() <= 3 && value.find_first_not_of(decimalDigits) == std::string_view::npos;
}
bool isWidth(std::string_view value) { return value == "8" || value == "16"; }
bool isUes(std::string_view value) { return value.size() <= 64; }
bool isAnything(std::string_view) { return true; }

/// An attribute that is kept as a text and says which values it takes.
struct KeptRow {
  DeviceNS::ATTRIBUTE attribute;
  bool option;  ///< kept with the options of operations
  bool device;  ///< of a device of the chain
  bool flash;   ///< of an attached flash
  bool (*accepts)(std::string_view value);
  const char* expected;
};
constexpr KeptRow keptRows[] = {
    {DeviceNS::CS_PIN, false, true, false, isAnything, ""},
    {DeviceNS::MPM_PAIR, false, true, false, isTruth, "true or false"},
    {DeviceNS::ERASE_FIRST, true, true, true, isTruth, "true or false"},
    {DeviceNS::VERIFY_AFTER, true, true, true, isTruth, "true or false"},
    {DeviceNS::ONLY_FPGA, true, true, false, isTruth, "true or false"},
    {DeviceNS::USERCODE, true, true, false, isShortHex, "up to 8 hex digits"},
    {DeviceNS::UES, true, true, false, isUes, "up to 64 characters"},
    {DeviceNS::REVISION, true, true, false, isSmallNumber, "a number from 0 to 999"},
    {DeviceNS::BPI_WIDTH, true, false, true, isWidth, "8 or 16"},
};

const KeptRow* keptRow(DeviceNS::ATTRIBUTE attribute) {
  const auto* row = std::ranges::find(keptRows, attribute, &KeptRow::attribute);
  return row == std::end(keptRows) ? nullptr : row;
}

std::string nameOf(DeviceNS::ATTRIBUTE attribute) {
  for (const auto& row : AttributeNames::device)
    if (row.attribute == attribute) return row.name;
  return "number " + std::to_string(static_cast<int>(attribute));
}

Failure cantSet(DeviceNS::ATTRIBUTE attribute, const char* of) {
  if (attribute == DeviceNS::UNKNOWN) return {Port::format("There is no such attribute of %s.", of)};
  return {Port::format("The attribute %s of %s can't be set.", nameOf(attribute), of)};
}

Status keep(const KeptRow& row, std::map<DeviceNS::ATTRIBUTE, std::string>& texts, const char* value) {
  if (!row.accepts(value))
    return Failure{
        Port::format("The attribute %s can't be \"%s\", expected %s.", nameOf(row.attribute), value, row.expected)};
  texts[row.attribute] = value;
  return {};
}

std::optional<std::string> lookUp(const std::map<DeviceNS::ATTRIBUTE, std::string>& texts,
                                  DeviceNS::ATTRIBUTE attribute) {
  const auto found = texts.find(attribute);
  return found == texts.end() ? std::nullopt : std::optional(found->second);
}

std::optional<std::string> filled(const std::string& text) { return text.empty() ? std::nullopt : std::optional(text); }

std::optional<std::string> flashText(const std::optional<AttachedFlash>& flash, std::string AttachedFlash::*text) {
  return flash ? filled((*flash).*text) : std::nullopt;
}

Status setIrLength(ChainDevice& device, const char* value) {
  const std::string text = value;
  const bool number = !text.empty() && text.size() <= 3 && text.find_first_not_of(decimalDigits) == std::string::npos;
  const int length = number ? std::stoi(text) : 0;
  if (length < 2 || length > 256)
    return Failure{
        Port::format("The length of an instruction register can't be \"%s\", expected 2 to 256 bits.", value)};
  if (device.part != nullptr && static_cast<std::size_t>(length) != device.part->irLength)
    return Failure{Port::format("The instruction register of %s has %d bits, not %d.", device.part->name,
                                device.part->irLength, length)};
  device.irLength = static_cast<std::size_t>(length);
  return {};
}

}  // namespace

std::optional<std::string> Attributes::get(const ChainDevice& device, DeviceNS::ATTRIBUTE attribute) {
  switch (attribute) {
    case DeviceNS::NAME:
      return device.name;
    case DeviceNS::STATE:
      return device.part != nullptr || device.spi != nullptr ? "known" : "unknown";
    case DeviceNS::CONFIG_FILE_NAME:
      return filled(device.file);
    case DeviceNS::IR_LENGTH:
      return device.irLength == 0 ? std::nullopt : std::optional(std::to_string(device.irLength));
    case DeviceNS::SPI_PART:
      return flashText(device.spiFlash, &AttachedFlash::partName);
    case DeviceNS::SPI_FILE:
      return flashText(device.spiFlash, &AttachedFlash::file);
    case DeviceNS::BPI_PART:
      return flashText(device.bpiFlash, &AttachedFlash::partName);
    case DeviceNS::BPI_FILE:
      return flashText(device.bpiFlash, &AttachedFlash::file);
    default:
      break;
  }
  const KeptRow* row = keptRow(attribute);
  if (row == nullptr) return std::nullopt;
  return lookUp(row->option ? device.stored.values : device.texts, attribute);
}

Status Attributes::set(ChainDevice& device, DeviceNS::ATTRIBUTE attribute, const char* value) {
  if (attribute == DeviceNS::NAME) {
    if (*value == '\0') return Failure{"The name of a device can't be empty."};
    device.name = value;
    return {};
  }
  if (attribute == DeviceNS::IR_LENGTH) return setIrLength(device, value);
  if (attribute == DeviceNS::KEY) {
    device.stored.key.set(value);
    return {};
  }
  const KeptRow* row = keptRow(attribute);
  if (row == nullptr || !row->device) return cantSet(attribute, "a device");
  return keep(*row, row->option ? device.stored.values : device.texts, value);
}

Status Attributes::set(AttachedFlash& flash, DeviceNS::ATTRIBUTE attribute, const char* value) {
  const KeptRow* row = keptRow(attribute);
  if (row == nullptr || !row->flash) return cantSet(attribute, "an attached flash");
  return keep(*row, flash.stored.values, value);
}
