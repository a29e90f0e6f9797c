#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/devicemanager/ModeInterface.h"
#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/Port_MsgManDefault.h"
#include "tests/unit/support/Files.h"
#include "tests/unit/support/RecordedMessages.h"
#include "tests/unit/support/ScopedVariable.h"

/// A fresh device manager in a directory of its own, with the default preferences, gone after the test.
class ManagerTest : public testing::Test {
 protected:
  ManagerTest() { reset(); }
  ~ManagerTest() override { reset(); }

  DeviceManagerInterface& manager() { return *DeviceManagerInterface::getDeviceManager(); }
  /// What the batch-command file holds.
  std::string recorded() const { return testsupport::readFile(directory_.file("_tesselbatch.cmd")); }
  static constexpr const char* nothing = "(no file)";

  testsupport::WorkingDirectory directory_;
  testsupport::TemporaryDirectory runtime_;
  testsupport::ScopedVariable runtimeVariable_{"XDG_RUNTIME_DIR", runtime_.path().c_str()};
  testsupport::RecordedMessages messages_;

 private:
  static void reset() {
    DeviceManagerInterface::removeDeviceManager();
    ModeInterface::setBatchCommandOn();
    TesselPreference::getPreferenceObject() = TesselPreference();
    Port_MsgDispatcher::getDefaultMsgMan()->setMaxLineWidth(0);
  }
};
