#include "manager/simulator/StateFile.h"

#include <algorithm>

#include "manager/content/Bitstream.h"

namespace {

constexpr std::string_view mark = "TSLSTATE";
constexpr std::uint32_t version = 1;
constexpr std::size_t crcBytes = 4;

std::span<const std::uint8_t> bytesOf(std::string_view text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

void put(std::string& text, std::uint64_t number, int bytes) {
  for (int i = 0; i < bytes; ++i) text += static_cast<char>(number >> (8 * i) & 0xFFU);
}

/// Goes through the bytes; what is not there reads as zeros and is remembered.
class Reader {
 public:
  explicit Reader(std::string_view text) : text_(text) {}

  std::string_view take(std::uint64_t count) {
    if (count > text_.size() - place_) {
      ended_ = true;
      return {};
    }
    const std::string_view taken = text_.substr(place_, static_cast<std::size_t>(count));
    place_ += taken.size();
    return taken;
  }
  std::uint64_t number(std::uint64_t bytes) {
    std::uint64_t result = 0;
    const std::string_view taken = take(bytes);
    for (std::size_t i = taken.size(); i-- > 0;) result = result << 8 | static_cast<unsigned char>(taken[i]);
    return result;
  }
  bool ended() const { return ended_; }
  std::size_t place() const { return place_; }
  bool atEnd() const { return place_ == text_.size(); }

 private:
  std::string_view text_;
  std::size_t place_ = 0;
  bool ended_ = false;
};

Failure bad(const std::string& path, const std::string& what) {
  return {.text = path + ": " + what + "; delete it to begin with the board's initial content"};
}

std::uint64_t bytesFor(std::uint64_t bits) { return bits / 8 + (bits % 8 != 0 ? 1 : 0); }

}  // namespace

Result<StateFile::Content> StateFile::parse(const std::string& path, std::string_view text) {
  if (!text.starts_with(mark)) return bad(path, "not a state file of a simulated board");
  if (text.size() < mark.size() + 8 + crcBytes) return bad(path, "the state file is cut short");
  Reader reader(text.substr(0, text.size() - crcBytes));
  reader.take(mark.size());
  const std::uint64_t found = reader.number(4);
  if (found != version)
    return bad(path,
               "a state file of version " + std::to_string(found) + ", expected version " + std::to_string(version));
  Reader sum(text.substr(text.size() - crcBytes));
  if (sum.number(crcBytes) != Bitstream::crc32(bytesOf(text.substr(0, text.size() - crcBytes))))
    return bad(path, "the state file is damaged or cut short (its CRC is wrong)");

  Content content;
  for (std::uint64_t left = reader.number(4); left > 0; --left) {
    const std::string name(reader.take(reader.number(2)));
    const std::uint64_t bits = reader.number(8);
    const std::string_view bytes = reader.take(bytesFor(bits));
    if (reader.ended())
      return bad(path, "the state file is damaged at byte " + std::to_string(reader.place()) + " (section " + name +
                           " reaches beyond its end)");
    content[name] = {.bits = bits, .bytes = bytesOf(bytes)};
  }
  if (!reader.atEnd()) return bad(path, "the state file has bytes behind its last section");
  return content;
}

const StateFile::Section* StateFile::Loader::find(const std::string& name, std::uint64_t bits) {
  used_.insert(name);
  const auto found = content_.find(name);
  if (found != content_.end() && found->second.bits == bits) return &found->second;
  if (problem_.empty()) {
    problem_ = found == content_.end() ? "it has nothing for \"" + name + "\""
                                       : "it has " + std::to_string(found->second.bits) + " bits for \"" + name +
                                             "\", which has " + std::to_string(bits);
  }
  return nullptr;
}

void StateFile::Loader::visit(const std::string& name, BitVector& bits) {
  const Section* section = find(name, bits.size());
  if (section == nullptr) return;
  const std::size_t size = bits.size();
  bits = BitVector::fromBytes(section->bytes);
  bits.resize(size);
}

void StateFile::Loader::visit(const std::string& name, std::vector<std::uint8_t>& bytes) {
  const Section* section = find(name, bytes.size() * 8);
  if (section != nullptr) std::copy(section->bytes.begin(), section->bytes.end(), bytes.begin());
}

Status StateFile::Loader::finish() const {
  std::string problem = problem_;
  for (const auto& [name, section] : content_)
    if (problem.empty() && used_.count(name) == 0) problem = "it has a section \"" + name + "\" that the board lacks";
  if (problem.empty()) return {};
  return bad(path_, "the state file is of another board: " + problem);
}

void StateFile::Saver::visit(const std::string& name, BitVector& bits) { add(name, bits.size(), bits.bytes()); }

void StateFile::Saver::visit(const std::string& name, std::vector<std::uint8_t>& bytes) {
  add(name, bytes.size() * 8, bytes);
}

void StateFile::Saver::add(const std::string& name, std::uint64_t bits, std::span<const std::uint8_t> bytes) {
  ++sections_;
  put(body_, name.size(), 2);
  body_ += name;
  put(body_, bits, 8);
  body_.append(bytes.begin(), bytes.end());
}

std::string StateFile::Saver::text() const {
  std::string text(mark);
  put(text, version, 4);
  put(text, sections_, 4);
  text += body_;
  put(text, Bitstream::crc32(bytesOf(text)), crcBytes);
  return text;
}
