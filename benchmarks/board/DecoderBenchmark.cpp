// How many TCKs a second the board's side of the remote-bitbang protocol carries out, without a network: bytes in,
// answers out. Arguments: the number of devices in BYPASS, or 0 for a register of 4 Mbit; whether each clock is read.

#include <benchmark/benchmark.h>

#include <stdexcept>
#include <vector>

#include "manager/parts/PartLibrary.h"
#include "manager/simulator/BitbangDecoder.h"

namespace {

using Bytes = std::vector<std::uint8_t>;

constexpr std::size_t clocksOfPiece = 128 * 1024;

enum class Order { noRead, readBeforeRise, readAfterRise };

/// One piece as a server would get it, with data that vary.
Bytes piece(bool tms, Order order) {
  Bytes bytes;
  std::uint32_t random = 1;
  for (std::size_t i = 0; i < clocksOfPiece; ++i) {
    random = random * 1664525 + 1013904223;
    const auto low = static_cast<std::uint8_t>('0' + (tms ? 2U : 0U) + (random >> 31));
    bytes.push_back(low);
    if (order == Order::readBeforeRise) bytes.push_back('R');
    bytes.push_back(static_cast<std::uint8_t>(low + 4));
    if (order == Order::readAfterRise) bytes.push_back('R');
  }
  return bytes;
}

std::unique_ptr<SimulatedBoard> makeBoard(PartLibrary& parts, std::int64_t devices) {
  std::string text = R"({"chain": [)";
  for (std::int64_t i = 0; i < devices; ++i) text += std::string(i > 0 ? "," : "") + R"({"part": "marlin3-4"})";
  auto board = SimulatedBoard::parse("benchmark", text + "]}", "", parts);
  if (!board) throw std::runtime_error(board.failure().text);
  return std::move(*board);
}

/// Ends in Shift-DR with this opcode in every device.
void select(SimulatedBoard& board, std::size_t devices, const BitVector& opcode) {
  board.clockLevels(0b0011011111, 0, 10);
  BitVector all;
  for (std::size_t i = 0; i < devices; ++i) all.append(opcode);
  board.clock(false, all.slice(0, all.size() - 1), nullptr);
  board.clock(true, all.slice(all.size() - 1, 1), nullptr);
  board.clockLevels(0b0011, 0, 4);
}

void run(benchmark::State& state, SimulatedBoard& board, Order order) {
  const Bytes bytes = piece(false, order);
  BitbangDecoder decoder(board);
  Bytes answers;
  for (auto step : state) {
    answers.clear();
    decoder.feed(bytes, answers);
    benchmark::DoNotOptimize(answers.data());
  }
  state.counters["TCK/s"] = benchmark::Counter(static_cast<double>(state.iterations()) * clocksOfPiece,
                                               benchmark::Counter::kIsRate);
}

void bypass(benchmark::State& state) {
  PartLibrary parts;
  const auto board = makeBoard(parts, state.range(0));
  select(*board, static_cast<std::size_t>(state.range(0)), BitVector(8, true));
  run(state, *board, static_cast<Order>(state.range(1)));
}

void longRegister(benchmark::State& state) {
  PartLibrary parts;
  const auto board = makeBoard(parts, 1);
  select(*board, 1, *(*parts.find("marlin3-4"))->opcode("CFG_IN"));
  run(state, *board, static_cast<Order>(state.range(0)));
}

void idle(benchmark::State& state) {
  PartLibrary parts;
  const auto board = makeBoard(parts, 2);
  board->clockLevels(0b011111, 0, 6);
  run(state, *board, static_cast<Order>(state.range(0)));
}

BENCHMARK(bypass)->ArgsProduct({{1, 2, 8}, {0, 1, 2}});
BENCHMARK(longRegister)->DenseRange(0, 2);
BENCHMARK(idle)->DenseRange(0, 2);

}  // namespace
