// The command table and the grouping of words into switches.
// Input: a byte, then a line. A byte from 128 on stands for a command word of the table that the line lacks.

#include <algorithm>
#include <cctype>
#include <climits>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "interfaces/utility/CommandSet.h"
#include "interfaces/utility/TesselCmdargs.h"
#include "tests/fuzz/LineModel.h"
#include "tests/fuzz/MessageLog.h"
#include "tests/fuzz/Require.h"

namespace {

using fuzz::MessageLog;
using fuzz::require;

enum class Outcome { accepted, unknownWord, rejected };

constexpr unsigned char firstWordByte = 128;

const std::vector<StringBase>& tableWords() {
  static const std::vector<StringBase> words = TesselCmdargs::findAllCommands();
  return words;
}

bool isKnown(std::string_view word) {
  const auto begins = [word](std::string_view whole) {
    return word.size() >= 2 && word.size() < whole.size() &&
           fuzz::equalIgnoringCase(word, whole.substr(0, word.size()));
  };
  return begins("exit") || begins("info") || begins("identify") ||
         std::any_of(tableWords().begin(), tableWords().end(),
                     [word](const StringBase& each) { return fuzz::equalIgnoringCase(each.view(), word); });
}

std::string lineOf(unsigned char choice, std::string_view text) {
  std::string line;
  if (choice >= firstWordByte) line.append(tableWords()[(choice - firstWordByte) % tableWords().size()].view()) += ' ';
  line += text.substr(0, text.find('\0'));
  return line;
}

std::vector<const char*> pointersTo(const std::vector<std::string>& words) {
  std::vector<const char*> pointers;
  for (const std::string& word : words) pointers.push_back(word.c_str());
  return pointers;
}

void checkArgument(const UT_CMDSWINFO& given, int index, const std::string& expected) {
  require(given.getargtxt(index) == expected, "a switch has the arguments behind it");
  require(given.getarg(index)->getargtxt() == expected, "an argument has its text");
  const std::int32_t number = fuzz::leadingNumber(expected.c_str());
  require(given.getargnum32(index) == number && given.getarg(index)->getargnum32() == number,
          "an argument's number is the decimal number that it begins with");
  const auto low = static_cast<std::int16_t>(number & 0xFFFF);
  require(given.getargnum(index) == low && given.getarg(index)->getargnum() == low,
          "the short number is the low half of the long one");
}

void checkNoArgument(const UT_CMDSWINFO& given, int index) {
  require(given.getarg(index) == nullptr && given.getargtxt(index) == nullptr, "outside there is no text");
  require(given.getargnum(index) == -1 && given.getargnum32(index) == -1, "outside the number is -1");
}

void checkSwitch(const UT_CMDSWINFO& given, const std::vector<std::string>& words, std::size_t first,
                 std::size_t last) {
  const auto count = static_cast<int>(last - first);
  require(given.getnumargs() == count, "the words up to the next switch are a switch's arguments");
  for (int i = 0; i < count; ++i) checkArgument(given, i, words[first + static_cast<std::size_t>(i)]);
  for (const int outside : {-1, count, count + 1, INT_MAX, INT_MIN}) checkNoArgument(given, outside);
}

void checkGrouping(const UT_CMDARGS& given, const std::vector<std::string>& words) {
  require(given.getcmd() == words.front(), "the first word is the command word");
  std::vector<std::size_t> starts;
  for (std::size_t i = 1; i < words.size(); ++i)
    if (fuzz::isSwitch(words[i])) starts.push_back(i);
  const std::size_t firstSwitch = starts.empty() ? words.size() : starts.front();
  require(given.getnumargs() == static_cast<int>(firstSwitch) - 1, "words before all switches are the command's own");
  require(given.getnumsw() == static_cast<int>(starts.size()), "every switch is found");
  starts.push_back(words.size());
  for (std::size_t i = 0; i + 1 < starts.size(); ++i) {
    const std::string& name = words[starts[i]];
    const UT_CMDSWINFO* const each = given.getsw(static_cast<int>(i));
    require(each != nullptr && each->getswname() == name, "a switch keeps its name as typed");
    checkSwitch(*each, words, starts[i] + 1, starts[i + 1]);
    const auto before = std::count_if(starts.begin(), starts.begin() + static_cast<std::ptrdiff_t>(i),
                                      [&](std::size_t at) { return fuzz::equalIgnoringCase(words[at], name); });
    require(given.findsw(name.c_str()) && given.getsw(name.c_str(), static_cast<int>(before)) == each,
            "a switch is found by its name and its turn");
  }
  for (const int outside : {-1, given.getnumsw(), INT_MAX, INT_MIN})
    require(given.getsw(outside) == nullptr, "outside there is no switch");
  require(!given.findsw("no switch") && given.getsw("-p", INT_MAX) == nullptr && given.getsw("-p", -1) == nullptr,
          "what was not given is not found");
}

/// Whether a text stands behind -key and nowhere else in the line.
bool isSecret(const std::vector<std::string>& words, std::size_t index) {
  constexpr std::size_t shortest = 8;  // what is shorter may stand in a message by chance
  if (words[index].size() < shortest || isKnown(words[index])) return false;
  if (!fuzz::equalIgnoringCase(words[index - 1], "-key") || fuzz::isSwitch(words[index])) return false;
  return std::count_if(words.begin(), words.end(),
                       [&](const std::string& each) { return each.find(words[index]) != std::string::npos; }) == 1;
}

void checkSecrets(const std::vector<std::string>& words, const MessageLog& messages) {
  const StringBase help = TesselCmdargs::findBatchFormatString(words.front().c_str());
  for (std::size_t i = 1; i < words.size(); ++i)
    require(!isSecret(words, i) || messages.all().find(words[i]) == std::string::npos ||
                help.view().find(words[i]) != std::string_view::npos,
            "what stands behind -key goes into no message");
}

Outcome outcomeOf(const std::vector<std::string>& words, MessageLog& messages) {
  const std::vector<const char*> pointers = pointersTo(words);
  messages.clear();
  try {
    const auto given = TesselCmdargs::getCmdargs(static_cast<int>(pointers.size()), pointers.data(), true);
    require(messages.shown() == 0, "a line that fits brings no message");
    checkGrouping(*given, words);
    return Outcome::accepted;
  } catch (const ACDEntryNotFoundException& exception) {
    require(messages.shown() == 0, "an unknown word brings no message");
    require(exception.what() == words.front(), "the exception names the unknown word");
    return Outcome::unknownWord;
  } catch (const InvalidArgumentException& exception) {
    require(messages.shown() == 1 && messages.errors() == 1, "a line that does not fit brings one error");
    require(messages.lastError() == std::string(exception.what()) + "\n", "the exception tells what the error tells");
    checkSecrets(words, messages);
    return Outcome::rejected;
  }
}

void checkHelp(const char* word, bool known) {
  const bool described = !TesselCmdargs::findBatchFormatString(word).empty();
  require(described == known, "every known word, and no other, has a usage text");
  for (const StringBase& match : TesselCmdargs::findMatchingCommands(word))
    require(isKnown(match.view()), "a match is a word of the table");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return -1;
  MessageLog messages;
  const auto set =
      CommandSet::string2CommandSet(lineOf(data[0], {reinterpret_cast<const char*>(data) + 1, size - 1}).c_str());
  if (set == nullptr) return -1;
  std::vector<std::string> words(set->getCommands(), set->getCommands() + set->getNumberCommands());

  messages.clear();
  checkGrouping(*TesselCmdargs::getCmdargs(set->getNumberCommands(), set->getCommands(), false), words);
  require(messages.shown() == 0, "without a check nothing is reported");

  const bool known = isKnown(words.front());
  const Outcome outcome = outcomeOf(words, messages);
  require((outcome == Outcome::unknownWord) == !known, "the words of the table, and only they, are known");
  checkHelp(words.front().c_str(), known);

  for (std::string& word : words)
    for (char& character : word)
      if (character >= 'a' && character <= 'z') character = static_cast<char>(character - ('a' - 'A'));
  require(outcomeOf(words, messages) == outcome, "letter case does not matter");
  return 0;
}
