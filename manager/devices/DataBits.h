#pragma once

#include <cstdint>
#include <span>
#include <string>

#include "manager/content/DataImage.h"
#include "manager/devices/Memory.h"
#include "manager/scan/BitVector.h"

/// Images as the bits of a memory, the lowest bit of the first byte first.
struct DataBits {
  BitVector data;     ///< ones where the image has nothing
  BitVector covered;  ///< the bits that the image has

  /// `bits` long; what the image has beyond them is left out.
  static DataBits of(const DataImage& image, std::size_t bits);
  /// All ones, everything covered.
  static DataBits blank(std::size_t bits);
  /// The covered bits that `mask` has and in which `found` differs; all of one size.
  BitVector difference(const BitVector& found, const BitVector& mask) const;
};

/// Goes over the bytes of an image block by block: aligned blocks of one size, of each the part from the first byte
/// that the image has to the last. Blocks without any are passed over.
class ImageWindows {
 public:
  ImageWindows(const DataImage& image, std::uint64_t blockSize)
      : run_(image.runs().begin()), end_(image.runs().end()), blockSize_(blockSize) {}

  /// False at the end.
  bool next();
  std::uint64_t first() const { return first_; }
  std::uint64_t count() const { return count_; }

 private:
  DataImage::Runs::const_iterator run_;
  DataImage::Runs::const_iterator end_;
  std::uint64_t blockSize_;
  std::uint64_t first_ = 0;
  std::uint64_t count_ = 0;
};

namespace DataCompare {

/// Goes on with a comparison of the bytes at `first`. Bytes for which `image` has nothing are not compared; a null
/// `image` means that `blank` is expected everywhere.
void add(Comparison& comparison, const DataImage* image, std::uint64_t first, std::span<const std::uint8_t> found,
         std::uint8_t blank = 0xFF);
/// The failure of a verification that found differences.
Failure failure(const Comparison& comparison);
/// How many bytes an image has.
std::uint64_t count(const DataImage& image);
/// Fails for an image without data, and for one that goes beyond `size` bytes.
Status fits(const DataImage& image, std::uint64_t size);
/// Fails unless the bytes from `first` on are there, in a memory of `size` bytes.
Status inside(std::uint64_t first, std::uint64_t count, std::uint64_t size);
/// "0x1F00"
std::string hex(std::uint64_t number, int digits = 1);

}  // namespace DataCompare
