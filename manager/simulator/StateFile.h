#pragma once

#include <map>
#include <set>
#include <span>
#include <string>
#include <string_view>

#include "manager/simulator/StateVisitor.h"
#include "manager/support/Result.h"

/// The state file of a board: what its memories hold between runs. All numbers have their lowest byte first.
///
///     0   "TSLSTATE"
///     8   version, 32 bits
///     12  number of sections, 32 bits; each: length of its name (16 bits), name, length in bits (64 bits), the
///         bits as bytes, the lowest bit of the first byte first
///     end CRC-32 over all bytes before it
namespace StateFile {

inline constexpr std::uint64_t mostBytes = std::uint64_t{1} << 32;

struct Section {
  std::uint64_t bits = 0;
  std::span<const std::uint8_t> bytes;  ///< within the file's text
};
using Content = std::map<std::string, Section>;

/// The sections; they refer to `text`. The failure says where the file is damaged.
Result<Content> parse(const std::string& path, std::string_view text);

/// Gives a board what a file holds. The file must have exactly the sections of the board.
class Loader : public StateVisitor {
 public:
  Loader(std::string path, const Content& content) : path_(std::move(path)), content_(content) {}

  void visit(const std::string& name, BitVector& bits) override;
  void visit(const std::string& name, std::vector<std::uint8_t>& bytes) override;
  /// The first thing that did not fit.
  Status finish() const;

 private:
  const Section* find(const std::string& name, std::uint64_t bits);

  std::string path_;
  const Content& content_;
  std::set<std::string> used_;
  std::string problem_;
};

/// Makes a file's text of a board.
class Saver : public StateVisitor {
 public:
  void visit(const std::string& name, BitVector& bits) override;
  void visit(const std::string& name, std::vector<std::uint8_t>& bytes) override;
  std::string text() const;

 private:
  void add(const std::string& name, std::uint64_t bits, std::span<const std::uint8_t> bytes);

  std::uint32_t sections_ = 0;
  std::string body_;
};

}  // namespace StateFile
