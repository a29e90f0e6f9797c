#include "interfaces/devicemanager/AttributeNames.h"
#include "interfaces/devicemanager/Collection.h"
#include "interfaces/devicemanager/Design.h"
#include "interfaces/devicemanager/Device.h"
#include "tests/unit/manager/ManagerTest.h"

namespace {

struct Row {
  const char* name;
  int number;
};

TEST(Statics, KnowsTheAttributesOfADevice) {
  constexpr Row rows[] = {{"name", 1},      {"state", 2},     {"csPin", 3},    {"configFileName", 4},
                          {"irLength", 18}, {"key", 25},      {"mpmPair", 30}, {"spiPart", 57},
                          {"spiFile", 58},  {"bpiPart", 60},  {"bpiFile", 61}, {"NAME", 1},
                          {"cspin", 3},     {"", -1},         {"nam", -1},     {"fileName", -1},
                          {"names", -1},    {"spi part", -1}, {nullptr, -1}};
  for (const Row& row : rows) EXPECT_EQ(int{Device::string2Attribute(row.name)}, row.number) << row.number;
}

class StaticsTest : public ManagerTest {};

TEST_F(StaticsTest, KnowsTheAttributesOfTheConfigurationDevice) {
  constexpr Row rows[] = {{"fileName", 1}, {"fileFormat", 6}, {"swapBit", 7}, {"fillValue", 8}, {"dir", 10},
                          {"FILENAME", 1}, {"name", -1},      {"", -1},       {nullptr, -1}};
  for (const Row& row : rows) EXPECT_EQ(int{manager().string2Attribute(row.name)}, row.number) << row.number;
}

TEST(Statics, KnowsTheAttributesOfCollectionsAndDesigns) {
  EXPECT_EQ(int{Collection::string2Attribute("Name")}, 1);
  EXPECT_EQ(int{Collection::string2Attribute("startAddress")}, -1);
  EXPECT_EQ(int{Collection::string2Attribute(nullptr)}, -1);
  EXPECT_EQ(int{Design::string2Attribute("name")}, 1);
  EXPECT_EQ(int{Design::string2Attribute("STARTADDRESS")}, 2);
  EXPECT_EQ(int{Design::string2Attribute("start")}, -1);
  EXPECT_EQ(int{Design::string2Attribute(nullptr)}, -1);
}

}  // namespace
