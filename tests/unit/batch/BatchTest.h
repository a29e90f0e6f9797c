#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "batch/CmdParser.h"
#include "batch/Interrupts.h"
#include "batch/log/TesselBatchMsgMan.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "tests/unit/support/Files.h"
#include "tests/unit/support/RecordedMessages.h"
#include "tests/unit/support/ScopedVariable.h"

/// Sessions in a directory of their own; the flags that sessions share are as at load.
class BatchTest : public testing::Test {
 protected:
  BatchTest() { reset(); }
  ~BatchTest() override { reset(); }

  testsupport::WorkingDirectory directory_;
  testsupport::TemporaryDirectory runtime_;
  testsupport::ScopedVariable runtimeVariable_{"XDG_RUNTIME_DIR", runtime_.path().c_str()};
  testsupport::ScopedVariable callbackVariable_{"ZOR_TESSEL_ALLOWBATCHMODECALLBACK", nullptr};
  testsupport::RecordedMessages messages_;

 private:
  static void reset() {
    TesselBatchMsgMan::removeBatchLog();
    DeviceManagerInterface::removeDeviceManager();
    TesselPreference::getPreferenceObject() = TesselPreference();
    allowBatchCallback = interruptRequested = interactive = 0;
  }
};
