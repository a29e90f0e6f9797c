#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "manager/parts/PartLibrary.h"
#include "manager/simulator/BoardDescription.h"
#include "manager/simulator/JsonObject.h"

/// Reads the entries of a board file's "chain". Problems go to the entry's own list.
class DeviceReader {
 public:
  DeviceReader(std::string directory, PartLibrary& parts) : directory_(std::move(directory)), parts_(parts) {}

  DeviceDescription read(JsonObject& entry);
  std::string pathOf(const std::string& path) const;

 private:
  PartPointer readPart(JsonObject& entry);
  std::vector<std::uint8_t> readContent(JsonObject& entry, const std::string& key);
  void readSpi(JsonObject& entry, DeviceDescription& device);
  void readBpi(JsonObject& entry, DeviceDescription& device);
  void readRegisters(JsonObject& entry, DeviceDescription& device);
  void readMonitors(JsonObject& entry, DeviceDescription& device);
  void readModel(JsonObject& entry, DeviceDescription& device);
  void readFaults(JsonObject& entry, DeviceDescription& device);

  std::string directory_;
  PartLibrary& parts_;
};
