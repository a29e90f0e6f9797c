#pragma once

#include <cstddef>
#include <functional>

#include "manager/scan/BitVector.h"

/// What stands between TDI and TDO of a device while its TAP is in Shift-DR or Shift-IR. Runs of clocks are shifted
/// at once.
class DataRegister {
 public:
  virtual ~DataRegister() = default;

  virtual void capture() = 0;
  /// Shifts in all bits of `in`; `out`, a different vector of the same size, gets the bits that come out. The board's
  /// clock stands still meanwhile: a register that depends on the time counts the bits itself.
  virtual void shift(const BitVector& in, BitVector& out) = 0;
  /// The bit that comes out next.
  virtual bool next() const = 0;
  virtual void update() = 0;
};

/// One bit that captures 0.
class BypassRegister : public DataRegister {
 public:
  void capture() override { bit_ = false; }
  void shift(const BitVector& in, BitVector& out) override;
  bool next() const override { return bit_; }
  void update() override {}

 private:
  bool bit_ = false;
};

/// A register of a fixed length, at least one bit. What it captures and what an update does are given to it; without
/// `captured` it captures nothing and shifts out what was shifted in before.
class ShiftRegister : public DataRegister {
 public:
  using Captured = std::function<BitVector()>;
  using Updated = std::function<void(const BitVector&)>;

  explicit ShiftRegister(std::size_t length, Captured captured = {}, Updated updated = {});

  void capture() override;
  void shift(const BitVector& in, BitVector& out) override;
  bool next() const override;
  void update() override;

  std::size_t length() const { return length_; }
  /// Its bits, the one next to TDO first.
  BitVector value() const;
  /// Missing bits are zero, those beyond the length are left out.
  void load(const BitVector& value);

 private:
  void rotate(const BitVector& in, BitVector& out);

  /// A ring: the bit at `first_` goes out next, and the place is free for one that comes in. It is made when it is
  /// needed first, for a configuration memory is long.
  BitVector ring_;
  std::size_t first_ = 0;
  std::size_t length_;
  Captured captured_;
  Updated updated_;
};
