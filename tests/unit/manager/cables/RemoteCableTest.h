#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <memory>
#include <utility>

#include "manager/cables/RemoteCable.h"
#include "tests/unit/manager/cables/TestServer.h"

/// So that a test of silence is short.
constexpr RemoteCable::Limits quick{.connect = 1, .answer = 0.5};

/// Since it was made.
class Stopwatch {
 public:
  double seconds() const { return std::chrono::duration<double>(std::chrono::steady_clock::now() - start_).count(); }

 private:
  std::chrono::steady_clock::time_point start_ = std::chrono::steady_clock::now();
};

/// Run-Test/Idle.
inline Status run(Cable& cable, std::uint64_t cycles, double seconds) { return cable.runTest(cycles, seconds); }

/// Null, and the test fails, when there is no connection.
inline std::unique_ptr<RemoteCable> connected(const TestServer& server, RemoteCable::Limits limits = {}) {
  Result<std::unique_ptr<RemoteCable>> cable = RemoteCable::connect(server.address(), limits);
  EXPECT_TRUE(cable) << cable.failure().text;
  return cable ? std::move(*cable) : nullptr;
}
