#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

#include "manager/scan/BitVector.h"
#include "manager/support/Result.h"

/// Where the answers of a remote-bitbang server go. Those that only tell that the server is alive come before those
/// that are collected.
class BitbangAnswers {
 public:
  /// One more answer is on its way that nobody wants to know; not while some are collected.
  void expectSign() { ++signs_; }
  /// The answers after these signs go to `to`, from bit 0 on; null ends it. The vector stays in place until then.
  void collect(BitVector* to);
  bool collecting() const { return to_ != nullptr; }
  /// So many more answers are on their way to be collected.
  void expect(std::size_t count) { wanted_ += count; }

  std::size_t outstanding() const { return signs_ + wanted_; }
  /// All answers that ever came.
  std::uint64_t received() const { return received_; }

  /// Failures say what the server did, to follow its name.
  Status take(std::span<const char> bytes);

 private:
  Status takeSigns(std::span<const char>& bytes);
  Status takeBits(std::span<const char>& bytes);

  std::size_t signs_ = 0;
  std::size_t wanted_ = 0;
  BitVector* to_ = nullptr;
  std::size_t place_ = 0;
  std::uint64_t received_ = 0;
};
