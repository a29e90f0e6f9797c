// The line reader and the splitting of lines into words, held against their rules.
// Input: a byte that chooses how the file is read, then the file.

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "interfaces/portability/Stream.h"
#include "interfaces/utility/CommandSet.h"
#include "tests/fuzz/LineModel.h"
#include "tests/fuzz/MemoryFile.h"
#include "tests/fuzz/MessageLog.h"
#include "tests/fuzz/Require.h"

namespace {

using fuzz::MessageLog;
using fuzz::require;

constexpr int sessionBuffer = 1023;
/// How much the reader asks of the system at a time.
constexpr std::size_t readerBlock = 65536;

/// How to read the file, as the input's first byte says. The character 0 reads like a session does.
struct Reading {
  explicit Reading(unsigned char choice) : wipe((choice / 16) % 4 == 2) {
    static constexpr int sizes[] = {sessionBuffer, 2, 17, 256};
    size = sizes[choice % 4];
    acrossBlocks = size == sessionBuffer && (choice / 4) % 4 == 3;
  }

  int size;
  bool acrossBlocks;  ///< long lines stand before the text, so that the end of a block is inside it
  bool wipe;          ///< what was read is wiped behind each line
};

std::string fileOf(std::string_view text, const Reading& reading) {
  std::string file;
  if (reading.acrossBlocks) {
    file.assign(readerBlock - text.size() / 2 - 1, 'x');
    file += '\n';
  }
  return file += text;
}

std::vector<std::string> wordsIn(const CommandSet& set) {
  std::vector<std::string> words;
  for (int i = 0; i < set.getNumberCommands(); ++i) {
    require(set.getCommand(i) == set.getCommands()[i], "both ways to a word lead to the same");
    words.emplace_back(set.getCommand(i));
  }
  require(*set.getCommand(-1) == '\0', "there is nothing before the first word");
  require(*set.getCommand(set.getNumberCommands()) == '\0', "there is nothing behind the last word");
  return words;
}

void checkCopies(const CommandSet& set, const std::vector<std::string>& words) {
  CommandSet copy(set);
  CommandSet assigned(3);
  assigned.addCommand("old");
  assigned = copy;
  const CommandSet& alias = assigned;
  assigned = alias;
  require(copy.holdsKey() == set.holdsKey() && assigned.holdsKey() == set.holdsKey(), "a copy knows of a key");
  copy.addCommand(copy.getCommand(0));
  copy.addCommand(-7);
  require(wordsIn(set) == words && wordsIn(assigned) == words, "copies are equal and stand for themselves");
  std::vector<std::string> longer = words;
  longer.push_back(words.front());
  longer.emplace_back("-7");
  const CommandSet moved(std::move(copy));
  require(wordsIn(moved) == longer, "words are added behind the others");
}

void checkPositions(CommandSet& set, std::vector<std::string> words, MessageLog& messages) {
  messages.clear();
  const bool expected = fuzz::lowerPositions(words);
  require(set.decrementPositions() == expected, "positions that fit 32 bits are lowered, and no others");
  require(messages.errors() == (expected ? 0 : 1) && messages.warnings() == 0, "a failure brings one error");
  if (!expected) return;
  require(wordsIn(set) == words, "positions are lowered by one and nothing else changes");
  CommandSet copy(set);
  require(set.decrementPositions() && wordsIn(set) == words, "a set is converted once");
  require(copy.decrementPositions() && wordsIn(copy) == words, "the copy of a converted set is converted");
  checkCopies(set, words);
}

void checkLine(const std::string& line, CommandSet& reused, MessageLog& messages) {
  const fuzz::Words expected = fuzz::wordsOf(line);
  messages.clear();
  const auto set = CommandSet::string2CommandSet(line.c_str());
  require((set == nullptr) == expected.comment, "comments, and only they, give no set");
  const int warnings = !expected.comment && expected.openQuote ? 1 : 0;
  require(messages.warnings() == warnings && messages.shown() == warnings, "an open quote brings one warning");
  require(CommandSet::string2CommandSet(line.c_str(), reused) == (set != nullptr), "a set can be used again");
  if (set == nullptr) return;
  require(wordsIn(*set) == expected.words, "the line is split into its words");
  require(wordsIn(reused) == expected.words, "a set that is used again holds nothing old");
  bool key = false;
  for (const std::string& word : expected.words) key = key || fuzz::equalIgnoringCase(word, "-key");
  require(set->holdsKey() == key && reused.holdsKey() == key, "a set knows of a key");
  checkCopies(*set, expected.words);
  checkPositions(*set, expected.words, messages);
}

std::vector<std::string> readAll(fuzz::MemoryFile& file, const Reading& reading) {
  Port::Stream stream("input", file.descriptor(), false, false);
  // On the heap and no byte longer, so that an overrun does not go unseen.
  const auto size = static_cast<std::size_t>(reading.size);
  const auto buffer = std::make_unique<char[]>(size);
  std::vector<std::string> lines;
  while (Port::Stream::readline(stream, buffer.get(), reading.size)) {
    lines.emplace_back(buffer.get());
    require(lines.back().size() < size, "a piece leaves room for its zero");
    if (reading.wipe) stream.wipeRead();
  }
  require(!Port::Stream::readline(stream, buffer.get(), reading.size), "the end of a file lasts");
  require(stream.error() == 0, "the file can be read");
  return lines;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return -1;
  static fuzz::MemoryFile file;
  const Reading reading(data[0]);
  const std::string_view text(reinterpret_cast<const char*>(data) + 1, size - 1);
  if (text.size() > readerBlock) return -1;
  const std::string content = fileOf(text, reading);
  file.fill(content);
  const std::vector<std::string> lines = readAll(file, reading);
  require(lines == fuzz::linesOf(content, static_cast<std::size_t>(reading.size) - 1), "a file is read line by line");
  MessageLog messages;
  CommandSet reused(0);
  // Small buffers give many pieces, which tell nothing new about words.
  const std::size_t wordLines = reading.size == sessionBuffer ? lines.size() : 0;
  for (std::size_t i = 0; i < wordLines; ++i)
    if (i == 0 || lines[i] != lines[i - 1]) checkLine(lines[i], reused, messages);
  // Hosts may have lines of any length, with their line ends.
  checkLine(std::string(text.substr(0, text.find('\0'))), reused, messages);
  return 0;
}
