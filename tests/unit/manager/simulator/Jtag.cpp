#include "tests/unit/manager/simulator/Jtag.h"

#include <gtest/gtest.h>

#include <random>

Jtag::Jtag(SimulatedBoard& board, std::vector<PartPointer> parts) : board_(board), parts_(std::move(parts)) { reset(); }

void Jtag::reset() { board_.clockLevels(0b011111, 0, 6); }

BitVector Jtag::load(std::size_t device, const std::string& instruction) {
  const BitVector* opcode = parts_[device]->opcode(instruction);
  EXPECT_NE(opcode, nullptr) << instruction;
  return loadOpcode(device, opcode == nullptr ? BitVector() : *opcode);
}

BitVector Jtag::loadOpcode(std::size_t device, const BitVector& opcode) {
  BitVector out;
  std::size_t place = 0;
  // The device next to TDO has its bits first.
  for (std::size_t i = parts_.size(); i-- > 0;) {
    if (i == device) place = out.size();
    if (i == device && !opcode.empty()) {
      out.append(opcode);
    } else {
      out.appendFill(parts_[i]->irLength, true);
    }
  }
  board_.clockLevels(0b0011, 0, 4);
  return shift(out).slice(place, parts_[device]->irLength);
}

BitVector Jtag::data(std::size_t device, const BitVector& out) {
  const std::size_t behind = parts_.size() - 1 - device;
  BitVector all(behind);
  all.append(out);
  all.appendFill(device, false);
  return scanData(all).slice(behind, out.size());
}

BitVector Jtag::scanData(const BitVector& out) {
  board_.clockLevels(0b001, 0, 3);
  return shift(out);
}

void Jtag::loadAll(const std::string& instruction) {
  BitVector out;
  for (std::size_t i = parts_.size(); i-- > 0;) out.append(*parts_[i]->opcode(instruction));
  board_.clockLevels(0b0011, 0, 4);
  shift(out);
}

std::uint64_t Jtag::data(std::size_t device, std::uint64_t out, std::size_t bits) {
  return data(device, BitVector::fromNumber(out, bits)).number();
}

std::uint64_t Jtag::access(std::size_t device, const std::string& instruction, std::uint64_t out, std::size_t bits) {
  load(device, instruction);
  return data(device, out, bits);
}

BitVector Jtag::shift(const BitVector& out) {
  BitVector in;
  const std::size_t last = out.size() - 1;
  board_.clock(false, out.slice(0, last), &in);
  board_.clock(true, out.slice(last, 1), &in);
  board_.clockLevels(0b01, 0, 2);
  return in;
}

TestBoard::TestBoard(const std::string& json, const std::string& directory) {
  Result<std::unique_ptr<SimulatedBoard>> parsed = SimulatedBoard::parse("board.json", json, directory, parts);
  if (parsed) {
    board = std::move(*parsed);
  } else {
    failure = parsed.failure().text;
  }
}

std::vector<PartPointer> findParts(PartLibrary& parts, const std::vector<std::string>& names) {
  std::vector<PartPointer> result;
  for (const std::string& name : names) {
    Result<PartPointer> part = parts.find(name);
    EXPECT_TRUE(part.ok()) << name;
    if (part) result.push_back(*part);
  }
  return result;
}

BitVector randomBits(std::size_t size, std::uint64_t seed) {
  std::mt19937_64 random(seed);
  BitVector bits;
  while (bits.size() < size) bits.appendNumber(random(), 64);
  bits.resize(size);
  return bits;
}
