#pragma once

#include <array>
#include <cstdint>
#include <span>

#include "manager/scan/BitVector.h"

/// Finds runs of clocks in the bytes of the remote-bitbang protocol that are sent in a regular pattern with one TMS
/// level: low-high, low-R-high or low-high-R for each clock. Works on eight clocks at a time.
class BitbangPattern {
 public:
  enum class Kind { lowHigh, lowReadHigh, lowHighRead };

  /// The pattern of the first clock of the bytes; null when there is no pattern with a low and a high.
  static const BitbangPattern* find(std::span<const std::uint8_t> bytes);

  /// Appends to `tdi` the levels of the eights of clocks that follow the pattern with this TMS level. Gives the number
  /// of bytes that they took.
  std::size_t gather(std::span<const std::uint8_t> bytes, bool tms, BitVector& tdi) const;

  Kind kind() const { return kind_; }
  constexpr bool reads() const { return kind_ != Kind::lowHigh; }
  /// Where the high stands in the bytes of a clock.
  constexpr std::size_t highPlace() const { return kind_ == Kind::lowReadHigh ? 2 : 1; }

 private:
  static constexpr std::size_t mostWords = 3;

  explicit constexpr BitbangPattern(Kind kind);

  Kind kind_;
  std::size_t words_;  ///< that eight clocks take
  std::array<std::uint64_t, mostWords> mask_{};
  std::array<std::uint64_t, mostWords> levels_{};  ///< what the masked bytes are for TMS low
  std::array<std::uint64_t, mostWords> tms_{};     ///< the TMS bit of each high
  std::array<unsigned, mostWords> firstHigh_{};    ///< the byte of a word that is its first high
  std::array<unsigned, mostWords> highs_{};        ///< how many a word has
};
