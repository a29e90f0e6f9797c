#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "benchmarks/board/Rate.h"
#include "manager/parts/PartLibrary.h"
#include "manager/simulator/BitbangDecoder.h"

namespace {

using Bytes = std::vector<std::uint8_t>;

constexpr std::size_t clocksOfPiece = std::size_t{128} * 1024;
constexpr int pieces = 32;
constexpr int rounds = 10;
// Millions of TCKs a second.
constexpr double barWithoutReads = 100;
constexpr double barWithReads = 50;

enum class Order { noRead, readBeforeRise, readAfterRise };
constexpr const char* names[] = {"without reads", "reads before the rise", "reads after the rise"};

/// What a server gets at once, with data that vary.
Bytes piece(Order order) {
  Bytes bytes;
  std::uint32_t random = 1;
  for (std::size_t i = 0; i < clocksOfPiece; ++i) {
    random = random * 1664525 + 1013904223;
    const auto low = static_cast<std::uint8_t>('0' + (random >> 31));
    bytes.push_back(low);
    if (order == Order::readBeforeRise) bytes.push_back('R');
    bytes.push_back(static_cast<std::uint8_t>(low + 4));
    if (order == Order::readAfterRise) bytes.push_back('R');
  }
  return bytes;
}

std::unique_ptr<SimulatedBoard> makeBoard(PartLibrary& parts, std::size_t devices) {
  std::string text = R"({"chain": [)";
  for (std::size_t i = 0; i < devices; ++i) text += std::string(i > 0 ? "," : "") + R"({"part": "marlin3-4"})";
  auto board = SimulatedBoard::parse("benchmark", text + "]}", "", parts);
  return board ? std::move(*board) : nullptr;
}

/// From reset to Shift-DR with this opcode in every device.
void select(SimulatedBoard& board, std::size_t devices, const BitVector& opcode) {
  board.clockLevels(0b0011011111, 0, 10);
  BitVector all;
  for (std::size_t i = 0; i < devices; ++i) all.append(opcode);
  board.clock(false, all.slice(0, all.size() - 1), nullptr);
  board.clock(true, all.slice(all.size() - 1, 1), nullptr);
  board.clockLevels(0b0011, 0, 4);
}

bool report(const char* what, SimulatedBoard& board) {
  bool reached = true;
  for (const Order order : {Order::noRead, Order::readBeforeRise, Order::readAfterRise}) {
    const Bytes bytes = piece(order);
    BitbangDecoder decoder(board);
    Bytes answers;
    const double seconds = fastest(rounds, [&] {
      for (int i = 0; i < pieces; ++i) {
        answers.clear();
        decoder.feed(bytes, answers);
      }
    });
    const double rate = static_cast<double>(clocksOfPiece) * pieces / seconds / 1e6;
    const double bar = order == Order::noRead ? barWithoutReads : barWithReads;
    std::printf("%-24s %-22s %8.0f million TCK/s (bar %.0f)\n", what, names[static_cast<int>(order)], rate, bar);
    reached = reached && rate >= bar;
  }
  return reached;
}

}  // namespace

bool reportDecoder() {
  PartLibrary parts;
  bool reached = true;
  for (const std::size_t devices : {1U, 2U, 8U}) {
    const auto board = makeBoard(parts, devices);
    select(*board, devices, BitVector(8, true));
    reached = report(("BYPASS in " + std::to_string(devices)).c_str(), *board) && reached;
  }
  const auto single = makeBoard(parts, 1);
  select(*single, 1, *(*parts.find("marlin3-4"))->opcode("CFG_IN"));
  reached = report("register of 4 Mbit", *single) && reached;
  const auto idle = makeBoard(parts, 2);
  idle->clockLevels(0b011111, 0, 6);
  return report("Run-Test/Idle", *idle) && reached;
}
