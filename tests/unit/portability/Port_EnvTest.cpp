#include <gtest/gtest.h>

#include <cerrno>
#include <string>

#include "interfaces/portability/Port_Env.h"
#include "tests/unit/support/ScopedVariable.h"

namespace {

class Port_EnvTest : public testing::Test {
 private:
  // Gone before and after each test.
  testsupport::ScopedVariable variable_{"TESSEL_TEST_VARIABLE", nullptr};
};

TEST_F(Port_EnvTest, AMissingVariableIsNull) {
  EXPECT_EQ(Port_Env::GetEnv("TESSEL_TEST_VARIABLE"), nullptr);
  EXPECT_EQ(Port_Env::GetEnv(""), nullptr);
}

TEST_F(Port_EnvTest, PutEnvSetsAndReplaces) {
  EXPECT_EQ(Port_Env::PutEnv("TESSEL_TEST_VARIABLE=one"), 0);
  EXPECT_STREQ(Port_Env::GetEnv("TESSEL_TEST_VARIABLE"), "one");
  EXPECT_EQ(Port_Env::PutEnv("TESSEL_TEST_VARIABLE=a=b c"), 0);
  EXPECT_STREQ(Port_Env::GetEnv("TESSEL_TEST_VARIABLE"), "a=b c");
  EXPECT_EQ(Port_Env::PutEnv("TESSEL_TEST_VARIABLE="), 0);
  EXPECT_STREQ(Port_Env::GetEnv("TESSEL_TEST_VARIABLE"), "");
}

TEST_F(Port_EnvTest, PutEnvKeepsItsOwnCopy) {
  std::string text = "TESSEL_TEST_VARIABLE=kept";
  EXPECT_EQ(Port_Env::PutEnv(text.c_str()), 0);
  text.replace(text.size() - 4, 4, "gone");
  EXPECT_STREQ(Port_Env::GetEnv("TESSEL_TEST_VARIABLE"), "kept");
}

TEST_F(Port_EnvTest, PutEnvRefusesWhatNamesNoVariable) {
  for (const char* text : {"", "TESSEL_TEST_VARIABLE", "=value", "="})
    EXPECT_EQ(Port_Env::PutEnv(text), EINVAL) << text;
  EXPECT_EQ(Port_Env::GetEnv("TESSEL_TEST_VARIABLE"), nullptr);
}

TEST_F(Port_EnvTest, UnsetEnvRemoves) {
  Port_Env::PutEnv("TESSEL_TEST_VARIABLE=one");
  EXPECT_EQ(Port_Env::UnsetEnv("TESSEL_TEST_VARIABLE"), 0);
  EXPECT_EQ(Port_Env::GetEnv("TESSEL_TEST_VARIABLE"), nullptr);
  EXPECT_EQ(Port_Env::UnsetEnv("TESSEL_TEST_VARIABLE"), 0);
}

TEST_F(Port_EnvTest, UnsetEnvRefusesWhatNamesNoVariable) {
  EXPECT_EQ(Port_Env::UnsetEnv(""), EINVAL);
  EXPECT_EQ(Port_Env::UnsetEnv("TESSEL_TEST_VARIABLE=one"), EINVAL);
}

}  // namespace
