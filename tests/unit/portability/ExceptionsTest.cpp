#include <gtest/gtest.h>

#include "interfaces/portability/ACDEntryNotFoundException.h"
#include "interfaces/portability/InvalidArgumentException.h"

namespace {

template <class Exception>
std::string caughtText() {
  try {
    throw Exception("frobnicate");
  } catch (const std::runtime_error& error) {
    return error.what();
  }
}

TEST(Exceptions, TellWhatTheyAreAbout) {
  EXPECT_EQ(caughtText<ACDEntryNotFoundException>(), "frobnicate");
  EXPECT_EQ(caughtText<InvalidArgumentException>(), "frobnicate");
}

TEST(Exceptions, AreToldApart) {
  EXPECT_THROW(throw ACDEntryNotFoundException("a"), ACDEntryNotFoundException);
  const std::runtime_error& error = InvalidArgumentException("a");
  EXPECT_EQ(dynamic_cast<const ACDEntryNotFoundException*>(&error), nullptr);
}

}  // namespace
