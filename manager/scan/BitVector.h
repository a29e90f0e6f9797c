#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

/// A row of bits, as a scan shifts them: bit 0 goes first. 64 bits stand in a word, bit 0 lowest; the bits of the
/// last word beyond the size are zero. Positions and counts are in bits.
///
///     BitVector instruction = BitVector::fromNumber(0x09, 6);
///     instruction.append(BitVector(1, true));  // a bypass bit behind it
class BitVector {
 public:
  using Word = std::uint64_t;
  static constexpr std::size_t wordBits = 64;
  static constexpr std::size_t npos = static_cast<std::size_t>(-1);

  BitVector() = default;
  explicit BitVector(std::size_t size, bool value = false);
  /// The low `size` bits of a number; at most 64.
  static BitVector fromNumber(Word number, std::size_t size);
  /// Eight bits a byte, the lowest bit of the first byte first.
  static BitVector fromBytes(std::span<const std::uint8_t> bytes);
  /// Hex digits as they are written, the last one lowest. Empty when a character is no hex digit or a set bit
  /// lies beyond `size`; missing digits are zero.
  static std::optional<BitVector> fromHex(std::string_view digits, std::size_t size);
  /// Binary digits as they are written, the last one is bit 0. Empty when a character is neither 0 nor 1.
  static std::optional<BitVector> fromBinary(std::string_view digits);

  std::size_t size() const { return size_; }
  bool empty() const { return size_ == 0; }
  bool get(std::size_t place) const { return (words_[place / wordBits] >> (place % wordBits) & 1U) != 0; }
  void set(std::size_t place, bool value);
  /// `count` bits, at most 64, as a number whose lowest bit is the one at `first`.
  Word number(std::size_t first, std::size_t count) const;
  void setNumber(std::size_t first, std::size_t count, Word number);
  /// The whole as a number; the size is at most 64.
  Word number() const { return number(0, size_); }

  void append(bool bit);
  void append(const BitVector& bits);
  void append(const BitVector& bits, std::size_t first, std::size_t count);
  void appendNumber(Word number, std::size_t count);
  void appendFill(std::size_t count, bool value);
  /// New bits are zero.
  void resize(std::size_t size);
  void clear() { resize(0); }
  void reserve(std::size_t size);
  void fill(bool value);

  BitVector slice(std::size_t first, std::size_t count) const;
  /// Overwrites `count` bits from `place` on with those of `bits` from `first` on. The two must be different objects.
  void copy(std::size_t place, const BitVector& bits, std::size_t first, std::size_t count);

  /// The last byte is filled up with zeros.
  std::vector<std::uint8_t> bytes() const;
  /// Upper-case digits, the lowest bits last; as many as the size needs.
  std::string hex() const;
  std::string binary() const;
  /// How many bits are set.
  std::size_t count() const;

  std::span<const Word> words() const { return words_; }
  std::span<Word> words() { return words_; }

  bool operator==(const BitVector&) const = default;
  BitVector operator~() const;

 private:
  void clearTail();

  std::size_t size_ = 0;
  std::vector<Word> words_;
};

/// The first place where two vectors of one size differ in a bit that `mask` has set (null: in any bit); npos when
/// there is none.
std::size_t firstDifference(const BitVector& left, const BitVector& right, const BitVector* mask = nullptr);
