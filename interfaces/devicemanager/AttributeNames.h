#pragma once

#include <span>
#include <string_view>

#include "interfaces/devicemanager/CollectionNS.h"
#include "interfaces/devicemanager/ConfigDeviceNS.h"
#include "interfaces/devicemanager/DesignNS.h"
#include "interfaces/devicemanager/DeviceNS.h"
#include "interfaces/portability/UT_STR.h"

/// The attribute names that users type, in any letter case. Every device manager answers the
/// `string2Attribute` mappings from these tables.
namespace AttributeNames {

template <class Attribute>
struct Row {
  const char* name;
  Attribute attribute;
};

inline constexpr Row<DeviceNS::ATTRIBUTE> device[] = {
    {"name", DeviceNS::NAME},
    {"state", DeviceNS::STATE},
    {"csPin", DeviceNS::CS_PIN},
    {"configFileName", DeviceNS::CONFIG_FILE_NAME},
    {"irLength", DeviceNS::IR_LENGTH},
    {"key", DeviceNS::KEY},
    {"mpmPair", DeviceNS::MPM_PAIR},
    {"eraseFirst", DeviceNS::ERASE_FIRST},
    {"verifyAfter", DeviceNS::VERIFY_AFTER},
    {"onlyFpga", DeviceNS::ONLY_FPGA},
    {"usercode", DeviceNS::USERCODE},
    {"ues", DeviceNS::UES},
    {"revision", DeviceNS::REVISION},
    {"bpiWidth", DeviceNS::BPI_WIDTH},
    {"spiPart", DeviceNS::SPI_PART},
    {"spiFile", DeviceNS::SPI_FILE},
    {"bpiPart", DeviceNS::BPI_PART},
    {"bpiFile", DeviceNS::BPI_FILE},
};
inline constexpr Row<ConfigDeviceNS::ATTRIBUTE> configDevice[] = {
    {"fileName", ConfigDeviceNS::FILE_NAME}, {"fileFormat", ConfigDeviceNS::FILE_FORMAT},
    {"swapBit", ConfigDeviceNS::SWAP_BIT},   {"fillValue", ConfigDeviceNS::FILL_VALUE},
    {"dir", ConfigDeviceNS::DIRECTION},
};
inline constexpr Row<CollectionNS::ATTRIBUTE> collection[] = {{"name", CollectionNS::NAME}};
inline constexpr Row<DesignNS::ATTRIBUTE> design[] = {
    {"name", DesignNS::NAME},
    {"startAddress", DesignNS::START_ADDRESS},
};

/// The attribute of that name, or -1 for a name that the table does not hold.
template <class Attribute>
Attribute find(std::span<const Row<Attribute>> table, const char* name) {
  for (const Row<Attribute>& row : table)
    if (name != nullptr && UT_STR::ICompare(row.name, name) == 0) return row.attribute;
  return Attribute(-1);
}

}  // namespace AttributeNames
