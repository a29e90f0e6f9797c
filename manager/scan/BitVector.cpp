#include "manager/scan/BitVector.h"

#include <algorithm>
#include <bit>
#include <cstring>

namespace {

using Word = BitVector::Word;
constexpr std::size_t wordBits = BitVector::wordBits;

constexpr std::size_t wordsFor(std::size_t bits) { return bits / wordBits + (bits % wordBits != 0 ? 1 : 0); }

/// The lowest `count` bits set; `count` is at most 64.
constexpr Word lowMask(std::size_t count) { return count >= wordBits ? ~Word{0} : (Word{1} << count) - 1; }

/// 1 to 64 bits. Touches no word that they do not reach.
Word readBits(const Word* words, std::size_t first, std::size_t count) {
  words += first / wordBits;
  const std::size_t shift = first % wordBits;
  Word result = words[0] >> shift;
  if (shift + count > wordBits) result |= words[1] << (wordBits - shift);
  return result & lowMask(count);
}

void writeBits(Word* words, std::size_t first, std::size_t count, Word number) {
  words += first / wordBits;
  const std::size_t shift = first % wordBits;
  const Word mask = lowMask(count);
  number &= mask;
  words[0] = (words[0] & ~(mask << shift)) | number << shift;
  if (shift + count <= wordBits) return;
  const std::size_t done = wordBits - shift;
  words[1] = (words[1] & ~(mask >> done)) | number >> done;
}

void copyBits(Word* to, std::size_t place, const Word* from, std::size_t first, std::size_t count) {
  const std::size_t head = std::min(count, (wordBits - place % wordBits) % wordBits);
  if (head > 0) writeBits(to, place, head, readBits(from, first, head));
  to += wordsFor(place);
  first += head;
  count -= head;

  from += first / wordBits;
  const std::size_t shift = first % wordBits;
  const std::size_t whole = count / wordBits;
  if (shift == 0) {
    std::copy_n(from, whole, to);
  } else {
    for (std::size_t i = 0; i < whole; ++i) to[i] = from[i] >> shift | from[i + 1] << (wordBits - shift);
  }
  const std::size_t tail = count % wordBits;
  if (tail > 0) writeBits(to + whole, 0, tail, readBits(from + whole, shift, tail));
}

/// -1 for a character that is none.
int hexDigit(char character) {
  if (character >= '0' && character <= '9') return character - '0';
  if (character >= 'a' && character <= 'f') return character - 'a' + 10;
  if (character >= 'A' && character <= 'F') return character - 'A' + 10;
  return -1;
}

}  // namespace

BitVector::BitVector(std::size_t size, bool value) : size_(size), words_(wordsFor(size), value ? ~Word{0} : 0) {
  clearTail();
}

BitVector BitVector::fromNumber(Word number, std::size_t size) {
  BitVector result;
  result.appendNumber(number, size);
  return result;
}

BitVector BitVector::fromBytes(std::span<const std::uint8_t> bytes) {
  BitVector result(bytes.size() * 8);
  if constexpr (std::endian::native == std::endian::little) {
    if (!bytes.empty()) std::memcpy(result.words_.data(), bytes.data(), bytes.size());
  } else {
    for (std::size_t i = 0; i < bytes.size(); ++i) result.setNumber(i * 8, 8, bytes[i]);
  }
  return result;
}

std::optional<BitVector> BitVector::fromHex(std::string_view digits, std::size_t size) {
  BitVector result(size);
  std::size_t place = 0;
  for (std::size_t i = digits.size(); i-- > 0; place += 4) {
    const int digit = hexDigit(digits[i]);
    if (digit < 0) return std::nullopt;
    const auto number = static_cast<Word>(digit);
    const std::size_t room = place < size ? std::min<std::size_t>(4, size - place) : 0;
    if ((number & ~lowMask(room)) != 0) return std::nullopt;
    if (room > 0) result.words_[place / wordBits] |= number << (place % wordBits);
  }
  return result;
}

std::optional<BitVector> BitVector::fromBinary(std::string_view digits) {
  BitVector result(digits.size());
  std::size_t place = digits.size();
  for (const char digit : digits) {
    --place;
    if (digit != '0' && digit != '1') return std::nullopt;
    result.words_[place / wordBits] |= Word{digit == '1'} << (place % wordBits);
  }
  return result;
}

void BitVector::set(std::size_t place, bool value) {
  const Word bit = Word{1} << (place % wordBits);
  Word& word = words_[place / wordBits];
  word = value ? word | bit : word & ~bit;
}

BitVector::Word BitVector::number(std::size_t first, std::size_t count) const {
  return count == 0 ? 0 : readBits(words_.data(), first, count);
}

void BitVector::setNumber(std::size_t first, std::size_t count, Word number) {
  if (count > 0) writeBits(words_.data(), first, count, number);
}

void BitVector::append(bool bit) {
  if (size_ % wordBits == 0) words_.push_back(0);
  words_.back() |= Word{bit} << (size_ % wordBits);
  ++size_;
}

void BitVector::append(const BitVector& bits) { append(bits, 0, bits.size_); }

void BitVector::append(const BitVector& bits, std::size_t first, std::size_t count) {
  const std::size_t place = size_;
  resize(size_ + count);
  copyBits(words_.data(), place, bits.words_.data(), first, count);
}

void BitVector::appendNumber(Word number, std::size_t count) {
  const std::size_t place = size_;
  resize(size_ + count);
  setNumber(place, count, number);
}

void BitVector::appendFill(std::size_t count, bool value) {
  const std::size_t place = size_;
  resize(size_ + count);
  if (!value || count == 0) return;
  words_[place / wordBits] |= ~Word{0} << (place % wordBits);
  std::fill(words_.begin() + static_cast<std::ptrdiff_t>(place / wordBits) + 1, words_.end(), ~Word{0});
  clearTail();
}

void BitVector::resize(std::size_t size) {
  const bool shorter = size < size_;
  size_ = size;
  words_.resize(wordsFor(size), 0);
  if (shorter) clearTail();
}

void BitVector::reserve(std::size_t size) { words_.reserve(wordsFor(size)); }

void BitVector::fill(bool value) {
  std::fill(words_.begin(), words_.end(), value ? ~Word{0} : 0);
  clearTail();
}

BitVector BitVector::slice(std::size_t first, std::size_t count) const {
  BitVector result(count);
  copyBits(result.words_.data(), 0, words_.data(), first, count);
  return result;
}

void BitVector::copy(std::size_t place, const BitVector& bits, std::size_t first, std::size_t count) {
  copyBits(words_.data(), place, bits.words_.data(), first, count);
}

std::vector<std::uint8_t> BitVector::bytes() const {
  std::vector<std::uint8_t> result(size_ / 8 + (size_ % 8 != 0 ? 1 : 0));
  if constexpr (std::endian::native == std::endian::little) {
    if (!result.empty()) std::memcpy(result.data(), words_.data(), result.size());
  } else {
    for (std::size_t i = 0; i < result.size(); ++i)
      result[i] = static_cast<std::uint8_t>(words_[i / 8] >> (i % 8 * 8) & 0xFFU);
  }
  return result;
}

std::string BitVector::hex() const {
  std::string result(size_ / 4 + (size_ % 4 != 0 ? 1 : 0), '0');
  std::size_t place = 0;
  for (std::size_t i = result.size(); i-- > 0; place += 4)
    result[i] = "0123456789ABCDEF"[words_[place / wordBits] >> (place % wordBits) & 0xFU];
  return result;
}

std::string BitVector::binary() const {
  std::string result(size_, '0');
  for (std::size_t i = 0; i < size_; ++i)
    if (get(i)) result[size_ - 1 - i] = '1';
  return result;
}

std::size_t BitVector::count() const {
  std::size_t result = 0;
  for (const Word word : words_) result += static_cast<std::size_t>(std::popcount(word));
  return result;
}

BitVector BitVector::operator~() const {
  BitVector result(*this);
  for (Word& word : result.words_) word = ~word;
  result.clearTail();
  return result;
}

void BitVector::clearTail() {
  if (size_ % wordBits != 0) words_.back() &= lowMask(size_ % wordBits);
}

std::size_t firstDifference(const BitVector& left, const BitVector& right, const BitVector* mask) {
  const std::span<const Word> a = left.words();
  const std::span<const Word> b = right.words();
  const std::size_t words = std::min(a.size(), b.size());
  for (std::size_t i = 0; i < words; ++i) {
    Word difference = a[i] ^ b[i];
    if (mask != nullptr) difference &= mask->words()[i];
    if (difference != 0) return i * wordBits + static_cast<std::size_t>(std::countr_zero(difference));
  }
  return BitVector::npos;
}
