// State files of boards. Input: a byte, then the file; with an odd byte the file's CRC is made right. What is loaded
// must come out again when it is saved.

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "manager/content/Bitstream.h"
#include "manager/simulator/StateFile.h"
#include "tests/fuzz/Require.h"

namespace {

using fuzz::require;

/// Something like a board, with memories of odd sizes.
struct Memories {
  BitVector bits = BitVector(13, true);
  BitVector none;
  std::vector<std::uint8_t> bytes = {1, 2, 3};

  void visit(StateVisitor& visitor) {
    visitor.visit("a", bits);
    visitor.visit("b", none);
    visitor.visit("c", bytes);
  }
};

std::string fileOf(Memories& memories) {
  StateFile::Saver saver;
  memories.visit(saver);
  return saver.text();
}

std::string withRightCrc(std::string_view text) {
  std::string result(text.substr(0, text.size() - 4));
  const std::vector<std::uint8_t> bytes(result.begin(), result.end());
  const std::uint32_t sum = Bitstream::crc32(bytes);
  for (int i = 0; i < 4; ++i) result += static_cast<char>(sum >> 8 * i & 0xFFU);
  return result;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size < 6) return 0;
  std::string text(reinterpret_cast<const char*>(data) + 1, size - 1);
  if (data[0] % 2 == 1) text = withRightCrc(text);

  const Result<StateFile::Content> content = StateFile::parse("state", text);
  if (!content) {
    require(content.failure().text.starts_with("state: "), "a failure names the file");
    return 0;
  }
  Memories memories;
  StateFile::Loader loader("state", *content);
  memories.visit(loader);
  require(memories.bits.size() == 13 && memories.none.empty() && memories.bytes.size() == 3, "sizes never change");
  if (!loader.finish()) return 0;

  const std::string saved = fileOf(memories);
  const Result<StateFile::Content> again = StateFile::parse("state", saved);
  require(again.ok(), "what was saved can be read");
  Memories copy;
  StateFile::Loader second("state", *again);
  copy.visit(second);
  require(second.finish().ok(), "and fits");
  require(copy.bits == memories.bits && copy.bytes == memories.bytes, "and is the same");
  return 0;
}
