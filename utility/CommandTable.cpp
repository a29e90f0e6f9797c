#include "utility/CommandTable.h"

#include <algorithm>
#include <cstdint>
#include <deque>
#include <string>
#include <string_view>
#include <unordered_map>

#include "interfaces/portability/UT_STR.h"

namespace CommandTable {
namespace {

struct HashIgnoringCase {
  std::size_t operator()(std::string_view word) const {
    // The length and four letters tell the words of the table apart well enough.
    std::size_t hash = word.size();
    for (const std::size_t place : {word.size() / 4, word.size() / 2, word.size() * 3 / 4, word.size() - 1})
      if (place < word.size()) hash = hash * 131 + static_cast<std::size_t>(UT_STR::Lower(word[place]));
    return hash;
  }
};

struct EqualIgnoringCase {
  bool operator()(std::string_view a, std::string_view b) const {
    if (a == b) return true;
    return a.size() == b.size() && UT_STR::INCompare(a.data(), b.data(), static_cast<int>(a.size())) == 0;
  }
};

class Index {
 public:
  static Index& instance() {
    static Index index;
    return index;
  }

  const std::vector<const Command*>& all() const { return sorted_; }

  const Command* find(const char* word) const {
    const auto place = byWord_.find(word);
    return place == byWord_.end() ? nullptr : place->second;
  }

  void accept(const char* word) {
    if (find(word) != nullptr) return;
    acceptedWords_.emplace_back(word);
    accepted_.push_back({acceptedWords_.back().c_str(), 0, "A word of the host.", {}, {}, ""});
    add(accepted_.back());
    sort();
  }

 private:
  Index() {
    for (const auto& family : {sessionCommands, settingsCommands, cableCommands, chainCommands, operationCommands,
                               formatterCommands, projectCommands, converterCommands})
      for (const Command& command : family) add(command);
    sort();
  }

  void add(const Command& command) {
    sorted_.push_back(&command);
    const std::string_view word = command.word;
    byWord_.emplace(word, &command);
    for (std::size_t length = static_cast<std::size_t>(command.shortest); length > 0 && length < word.size(); ++length)
      byWord_.emplace(word.substr(0, length), &command);
  }

  void sort() {
    std::sort(sorted_.begin(), sorted_.end(),
              [](const Command* a, const Command* b) { return UT_STR::ICompare(a->word, b->word) < 0; });
  }

  std::vector<const Command*> sorted_;
  std::unordered_map<std::string_view, const Command*, HashIgnoringCase, EqualIgnoringCase> byWord_;
  std::deque<std::string> acceptedWords_;
  std::deque<Command> accepted_;
};

}  // namespace

const std::vector<const Command*>& all() { return Index::instance().all(); }
const Command* find(const char* word) { return Index::instance().find(word); }
void accept(const char* word) { Index::instance().accept(word); }

}  // namespace CommandTable
