#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <random>
#include <string>
#include <vector>

#include "manager/cables/SimulatedCable.h"
#include "manager/devices/Memory.h"
#include "manager/parts/PartLibrary.h"
#include "manager/scan/ScanChain.h"
#include "manager/simulator/SimulatedBoard.h"
#include "tests/unit/support/Files.h"

/// A simulated board, the cable to it and the chain on it.
class BoardBench {
 public:
  using Bytes = std::vector<std::uint8_t>;

  /// Puts a file beside the board, for its relative paths.
  void file(const std::string& name, const std::string& content) {
    testsupport::writeFile(directory.file(name), content);
  }

  /// `chain` and `more` are pieces of the board file.
  void make(const std::string& devices, const std::string& more = "") {
    auto parsed =
        SimulatedBoard::parse("board.json", "{\"chain\": [" + devices + "]" + more + "}", directory.path(), library);
    ASSERT_TRUE(parsed) << parsed.failure().text;
    board = std::move(*parsed);
    cable = std::make_unique<SimulatedCable>(board);
    std::vector<std::size_t> lengths(board->devices(), 8);
    chain = std::make_unique<ScanChain>(*cable, lengths);
  }

  PartPointer part(const std::string& name) {
    auto found = name.ends_with(".bsd") ? library.read(directory.file(name)) : library.find(name);
    if (!found) ADD_FAILURE() << found.failure().text;
    return found ? *found : std::make_shared<Part>();
  }

  std::unique_ptr<Memory> memory(Result<std::unique_ptr<Memory>> made) {
    if (made) return std::move(*made);
    ADD_FAILURE() << made.failure().text;
    return nullptr;
  }

  static Bytes random(std::size_t size, unsigned seed) {
    std::mt19937 generator(seed);
    Bytes bytes(size);
    for (auto& byte : bytes) byte = static_cast<std::uint8_t>(generator());
    return bytes;
  }
  static DataImage image(const Bytes& bytes, std::uint64_t address = 0) {
    DataImage result;
    EXPECT_TRUE(result.add(address, bytes));
    return result;
  }

  testsupport::TemporaryDirectory directory;
  PartLibrary library;
  std::shared_ptr<SimulatedBoard> board;
  std::unique_ptr<SimulatedCable> cable;
  std::unique_ptr<ScanChain> chain;
};

/// The text of a failure; what else the result is when it is none.
template <class T>
std::string failureText(const Result<T>& result) {
  return result ? "(no failure)" : result.failure().text;
}
inline std::string failureText(const Status& status) { return status ? "(no failure)" : status.failure().text; }
