#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "interfaces/utility/CommandSet.h"
#include "tests/unit/support/ChildProcess.h"
#include "tests/unit/support/RecordedMessages.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testsupport::RecordedMessages;
using Words = std::vector<std::string>;

Words wordsOf(const CommandSet& set) {
  Words words;
  for (int i = 0; i < set.getNumberCommands(); ++i) words.emplace_back(set.getCommand(i));
  return words;
}

/// The words of a line that is no comment.
Words split(const char* line) {
  const auto set = CommandSet::string2CommandSet(line);
  return set == nullptr ? Words{"(comment)"} : wordsOf(*set);
}

struct SplitRow {
  const char* line;
  Words words;
};

TEST(CommandSet, SplitsLinesAtBlanksAndTabs) {
  const SplitRow rows[] = {
      {"program", {"program"}},
      {"program -p 1", {"program", "-p", "1"}},
      {"  program\t-p \t 1\t ", {"program", "-p", "1"}},
      {"program -p 1\n", {"program", "-p", "1"}},
      {"program -p 1\r\n", {"program", "-p", "1"}},
      {"program -p 1 \r\n", {"program", "-p", "1"}},
      {"program\r", {"program\r"}},
      {"program\r\r\n", {"program\r"}},
      {"program\n\n", {"program\n"}},
      {"a\\ b\\n \\", {"a\\", "b\\n", "\\"}},
      {"a 'b c'", {"a", "'b", "c'"}},
      {"a # b // c", {"a", "#", "b", "//", "c"}},
      {"/ a", {"/", "a"}},
      {"/a/", {"/a/"}},
      {"caf\xC3\xA9 \xFF", {"caf\xC3\xA9", "\xFF"}},
      {"a\xC2\xA0"
       "b",
       {"a\xC2\xA0"
        "b"}},
  };
  const RecordedMessages messages;
  for (const SplitRow& row : rows) EXPECT_EQ(split(row.line), row.words) << row.line;
  EXPECT_THAT(messages.all(), IsEmpty());
}

TEST(CommandSet, QuotesGroupAndAreRemoved) {
  const SplitRow rows[] = {
      {"a \"b c\" d", {"a", "b c", "d"}},
      {"\"a b\"", {"a b"}},
      {"a \"\" b", {"a", "", "b"}},
      {"\"\"", {""}},
      {"a \"\"", {"a", ""}},
      {"a b\"c d\"e", {"a", "bc de"}},
      {"a \"b\"\"c d\"", {"a", "bc d"}},
      {"a \"b\tc  d\"", {"a", "b\tc  d"}},
      {"a \"#\" \"// b\"", {"a", "#", "// b"}},
      {"a \"\\\" b", {"a", "\\", "b"}},
      {"a \"b c\"\r\n", {"a", "b c"}},
      {"a \"-p\" 1", {"a", "-p", "1"}},
  };
  const RecordedMessages messages;
  for (const SplitRow& row : rows) EXPECT_EQ(split(row.line), row.words) << row.line;
  EXPECT_THAT(messages.all(), IsEmpty());
}

TEST(CommandSet, ALineOfBlanksIsOneEmptyWord) {
  for (const char* line : {"", "\n", "\r\n", " ", " \t \n", "\t\r\n"}) EXPECT_EQ(split(line), Words{""}) << line;
}

TEST(CommandSet, ACommentIsNoCommand) {
  const RecordedMessages messages;
  for (const char* line : {"#", "# a", "#a b", "  \t# a", "//", "// a \"b", "//a", "\t//\n", "#\r\n"})
    EXPECT_EQ(CommandSet::string2CommandSet(line), nullptr) << line;
  EXPECT_THAT(messages.all(), IsEmpty());
}

struct UnclosedRow {
  const char* line;
  Words words;
};

TEST(CommandSet, AnUnclosedQuoteEndsWithTheLineAfterAWarning) {
  const UnclosedRow rows[] = {
      {"a \"b c", {"a", "b c"}},
      {"a \"b c\n", {"a", "b c"}},
      {"a \"b c \r\n", {"a", "b c "}},
      {"a b\" c", {"a", "b c"}},
      {"a \"", {"a", ""}},
      {"a \"b\" \"c", {"a", "b", "c"}},
      {"a \"b\" c\"d e", {"a", "b", "cd e"}},
  };
  for (const UnclosedRow& row : rows) {
    const RecordedMessages messages;
    EXPECT_EQ(split(row.line), row.words) << row.line;
    EXPECT_THAT(messages.all(),
                ElementsAre(testsupport::warning("Missing closing quote, the text ends with the line.\n")));
  }
}

TEST(CommandSet, TheWarningOfAnUnclosedQuoteShowsNoKey) {
  for (const char* line :
       {"programEFuse -key \"00C0FFEE", "programEFuse -p \"1 -key 00C0FFEE", "\"programEFuse -p 1 -key 00C0FFEE"}) {
    const RecordedMessages messages;
    split(line);
    ASSERT_EQ(messages.all().size(), 1U) << line;
    EXPECT_THAT(messages.all().front().text, testing::Not(testing::HasSubstr("C0FFEE"))) << line;
  }
}

struct KeyRow {
  const char* line;
  bool holdsKey;
};

TEST(CommandSet, KnowsWhetherItHoldsAKey) {
  constexpr KeyRow rows[] = {{"programEFuse -p 1 -key 00", true},
                             {"program -KEY \"0 0\"", true},
                             {"program -key", true},
                             {"program \"-key\" 0", true},
                             {"program -p 1 -keys 0", false},
                             {"key key", false},
                             {"quit", false},
                             {"", false}};
  CommandSet reused(0);
  for (const KeyRow& row : rows) {
    const auto set = CommandSet::string2CommandSet(row.line);
    EXPECT_EQ(set->holdsKey(), row.holdsKey) << row.line;
    EXPECT_EQ(CommandSet(*set).holdsKey(), row.holdsKey) << row.line;
    EXPECT_TRUE(CommandSet::string2CommandSet(row.line, reused));
    EXPECT_EQ(reused.holdsKey(), row.holdsKey) << row.line;
  }
  EXPECT_FALSE(CommandSet(8).holdsKey());
  reused.addCommand("-key");
  EXPECT_TRUE(reused.holdsKey());
}

TEST(CommandSet, ASetThatHeldAKeyIsAsGoodAsAnyOther) {
  CommandSet set(0);
  for (int i = 0; i < 3; ++i) {
    EXPECT_TRUE(CommandSet::string2CommandSet("programEFuse -p 1 -key 00C0FFEE", set));
    for (int word = 0; word < 50; ++word) set.addCommand("a word that needs more room");
    EXPECT_STREQ(set.getCommand(4), "00C0FFEE");
    EXPECT_STREQ(set.getCommand(54), "a word that needs more room");
    const CommandSet copy(set);
    EXPECT_TRUE(CommandSet::string2CommandSet("quit", set));
    EXPECT_EQ(wordsOf(set), Words{"quit"});
    EXPECT_STREQ(copy.getCommand(4), "00C0FFEE");
  }
}

TEST(CommandSet, LongLinesAndManyWordsAreWhole) {
  const std::string word(100000, 'x');
  EXPECT_EQ(split((word + " " + word).c_str()), (Words{word, word}));
  std::string line;
  for (int i = 0; i < 1000; ++i) line += std::to_string(i) + " ";
  const auto set = CommandSet::string2CommandSet(line.c_str());
  ASSERT_EQ(set->getNumberCommands(), 1000);
  EXPECT_STREQ(set->getCommand(999), "999");
}

TEST(CommandSet, AWordPastTheLastIsEmpty) {
  const auto set = CommandSet::string2CommandSet("a b");
  for (const int index : {2, 3, 1000, -1}) EXPECT_STREQ(set->getCommand(index), "") << index;
  EXPECT_STREQ(CommandSet(8).getCommand(0), "");
}

TEST(CommandSet, IsBuiltWordByWord) {
  for (const int capacity : {0, 8, -3}) {
    CommandSet set(capacity);
    EXPECT_EQ(set.getNumberCommands(), 0);
    set.addCommand("program");
    set.addCommand("");
    set.addCommand("two words");
    set.addCommand(12);
    set.addCommand(-2147483647 - 1);
    EXPECT_EQ(wordsOf(set), (Words{"program", "", "two words", "12", "-2147483648"}));
  }
}

TEST(CommandSet, GivesAllWordsAsAnArray) {
  const auto set = CommandSet::string2CommandSet("program -p 1");
  const char* const* words = set->getCommands();
  EXPECT_EQ(Words(words, words + 3), (Words{"program", "-p", "1"}));
  set->addCommand("-showprogress");
  words = set->getCommands();
  EXPECT_EQ(Words(words, words + 4), (Words{"program", "-p", "1", "-showprogress"}));
}

TEST(CommandSet, TakesItsOwnWordsAgain) {
  CommandSet set(0);
  set.addCommand("a word that is longer than a short text");
  for (int i = 0; i < 20; ++i) set.addCommand(set.getCommand(i));
  EXPECT_EQ(wordsOf(set), Words(21, "a word that is longer than a short text"));
}

TEST(CommandSet, CanBeFilledAgain) {
  CommandSet set(0);
  EXPECT_TRUE(CommandSet::string2CommandSet("program -p 1 \"\" x", set));
  EXPECT_TRUE(CommandSet::string2CommandSet("quit", set));
  EXPECT_EQ(wordsOf(set), Words{"quit"});
  EXPECT_TRUE(CommandSet::string2CommandSet("program -file \"a much longer line than before\"", set));
  EXPECT_EQ(wordsOf(set), (Words{"program", "-file", "a much longer line than before"}));
  EXPECT_TRUE(CommandSet::string2CommandSet(" \n", set));
  EXPECT_EQ(wordsOf(set), Words{""});
  EXPECT_FALSE(CommandSet::string2CommandSet("# comment", set));
}

/// Whether the array holds the set's own words, not those of another set.
bool holdsItsOwnWords(const CommandSet& set) {
  for (int i = 0; i < set.getNumberCommands(); ++i)
    if (set.getCommands()[i] != set.getCommand(i)) return false;
  return true;
}

TEST(CommandSet, ACopyIsASetOfItsOwn) {
  const auto set = CommandSet::string2CommandSet("a b");
  set->getCommands();
  CommandSet copy(*set);
  EXPECT_TRUE(holdsItsOwnWords(copy));
  copy.addCommand("c");
  EXPECT_EQ(wordsOf(copy), (Words{"a", "b", "c"}));
  EXPECT_EQ(wordsOf(*set), (Words{"a", "b"}));
  copy = *set;
  EXPECT_EQ(wordsOf(copy), (Words{"a", "b"}));
  EXPECT_TRUE(holdsItsOwnWords(copy));
  const CommandSet& itself = copy;
  copy = itself;
  EXPECT_EQ(wordsOf(copy), (Words{"a", "b"}));
}

TEST(CommandSet, AMovedSetHoldsItsOwnWords) {
  for (const char* line : {"a b", "a line that is longer than a short text"}) {
    const auto set = CommandSet::string2CommandSet(line);
    const Words words = wordsOf(*set);
    set->getCommands();
    CommandSet moved(std::move(*set));
    EXPECT_EQ(wordsOf(moved), words);
    EXPECT_TRUE(holdsItsOwnWords(moved)) << line;
    CommandSet assigned(0);
    moved.getCommands();
    assigned = std::move(moved);
    EXPECT_EQ(wordsOf(assigned), words);
    EXPECT_TRUE(holdsItsOwnWords(assigned)) << line;
  }
}

TEST(CommandSet, AMovedFromSetCanBeFilledAgain) {
  const std::string outcome = testsupport::runInChild([] {
    const auto set = CommandSet::string2CommandSet("program -p 1");
    const CommandSet moved(std::move(*set));
    EXPECT_TRUE(CommandSet::string2CommandSet("quit", *set));
    EXPECT_EQ(wordsOf(*set), Words{"quit"});
    EXPECT_EQ(wordsOf(moved), (Words{"program", "-p", "1"}));
  });
  EXPECT_EQ(outcome, "exit 0");
}

TEST(CommandSet, PrintCommandsIsSilentUnlessToldToEcho) {
  const auto set = CommandSet::string2CommandSet("program  -key \"a b\"");
  testsupport::StandardOutputCapture output;
  set->printCommands(false);
  EXPECT_EQ(output.text(), "");
  testsupport::StandardOutputCapture echo;
  set->printCommands(true);
  EXPECT_EQ(echo.text(), "program -key a b\n");
}

}  // namespace
