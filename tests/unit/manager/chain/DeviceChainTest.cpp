#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "manager/chain/DeviceChain.h"

namespace {

using testing::ElementsAre;

ChainDevice named(const char* name, std::size_t irLength = 4) {
  ChainDevice device;
  device.name = name;
  device.irLength = irLength;
  return device;
}

class DeviceChainTest : public testing::Test {
 protected:
  std::vector<std::string> names() const {
    std::vector<std::string> result;
    for (int i = 0; i < chain_.size(); ++i) result.push_back(chain_.at(i).name);
    return result;
  }

  DeviceChain chain_;
};

TEST_F(DeviceChainTest, KeepsTheOrder) {
  EXPECT_TRUE(chain_.insert(0, named("b")).ok());
  EXPECT_TRUE(chain_.insert(0, named("a")).ok());
  EXPECT_TRUE(chain_.insert(2, named("d")).ok());
  EXPECT_TRUE(chain_.insert(2, named("c")).ok());
  EXPECT_THAT(names(), ElementsAre("a", "b", "c", "d"));
  EXPECT_TRUE(chain_.remove(1).ok());
  EXPECT_THAT(names(), ElementsAre("a", "c", "d"));
}

TEST_F(DeviceChainTest, RefusesPositionsThatThereAreNot) {
  EXPECT_EQ(chain_.find(0).failure().text, "There is no device 1: the chain is empty.");
  EXPECT_EQ(chain_.insert(1, named("a")).failure().text, "A device can't be added at position 2: the chain has 0.");
  EXPECT_EQ(chain_.insert(-1, named("a")).failure().text, "A device can't be added at position 0: the chain has 0.");
  ASSERT_TRUE(chain_.insert(0, named("a")).ok());
  EXPECT_EQ(chain_.find(1).failure().text, "There is no device 2 on the chain, which has 1.");
  EXPECT_EQ(chain_.remove(-1).failure().text, "There is no device 0 on the chain, which has 1.");
  EXPECT_THAT(names(), ElementsAre("a"));
}

TEST_F(DeviceChainTest, HasAtMostAsManyDevicesAsAScanAddresses) {
  for (int i = 0; i < DeviceChain::most; ++i) ASSERT_TRUE(chain_.insert(i, named("x")).ok());
  EXPECT_EQ(chain_.insert(0, named("y")).failure().text, "A chain has at most 256 devices.");
}

TEST_F(DeviceChainTest, IrLengthsAreKnownOrTheDeviceIsNamed) {
  ASSERT_TRUE(chain_.insert(0, named("a", 6)).ok());
  ASSERT_TRUE(chain_.insert(1, named("b", 8)).ok());
  EXPECT_THAT(*chain_.irLengths(), ElementsAre(6U, 8U));
  ASSERT_TRUE(chain_.insert(2, named("unknown", 0)).ok());
  EXPECT_EQ(chain_.irLengths().failure().text,
            "'3': The length of the instruction register of unknown is not known. Use defineDevice to tell it.");
}

}  // namespace
