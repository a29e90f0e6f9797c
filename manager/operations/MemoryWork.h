#pragma once

#include <memory>
#include <optional>
#include <string>

#include "manager/content/DataImage.h"
#include "manager/devices/Memory.h"
#include "manager/operations/Operation.h"

/// What the words on memories share: which memory is meant, and which data.
namespace MemoryWork {

/// The memory that a command means, opened: the device's own, or the flash behind it.
Result<std::unique_ptr<Memory>> memory(DeviceWork& work);

struct Source {
  DataImage image;
  std::string name;  ///< the file's, or "the data of -data"
};
/// The data that a command means: `-data`, the file of `-file`, or the assigned one; moved to the place of the
/// revision when the command names one of `memory`'s.
Result<Source> source(DeviceWork& work, const Memory& memory);

/// A part of a memory, in bytes.
struct Region {
  std::uint64_t first = 0;
  std::uint64_t size = 0;
};
/// The place of the revision that a command names; revisions share the memory evenly. Empty when it names none.
Result<std::optional<Region>> revision(DeviceWork& work, const Memory& memory);
/// The whole content that a memory is to have when one region changes and the others stay: the region is blank but
/// for the data.
Result<DataImage> withOthers(DeviceWork& work, Memory& memory, const Region& region, const DataImage* data);

/// "12 of 4096 bytes differ, the first at address 0x00000010: expected 0x12, found 0x34".
std::string shown(const Comparison& comparison);

}  // namespace MemoryWork
