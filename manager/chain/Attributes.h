#pragma once

#include <optional>
#include <string>

#include "manager/chain/ChainDevice.h"
#include "manager/support/Result.h"

/// The attributes of a chain device and of its attached flash, by number, as texts.
namespace Attributes {

/// Empty when the attribute is not set, or is one that is not given away, such as a key.
std::optional<std::string> get(const ChainDevice& device, DeviceNS::ATTRIBUTE attribute);
/// The failure says which values the attribute takes, or that it can't be set.
Status set(ChainDevice& device, DeviceNS::ATTRIBUTE attribute, const char* value);
/// The form for an attached flash.
Status set(AttachedFlash& flash, DeviceNS::ATTRIBUTE attribute, const char* value);

}  // namespace Attributes
