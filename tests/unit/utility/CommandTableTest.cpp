#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <set>

#include "interfaces/portability/UT_STR.h"
#include "interfaces/utility/CommandSet.h"
#include "interfaces/utility/TesselCmdargs.h"
#include "tests/unit/support/RecordedMessages.h"
#include "utility/CommandTable.h"

namespace {

using CommandTable::Command;
using CommandTable::Kind;
using CommandTable::Switch;
using CommandTable::Switches;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

std::string lowered(std::string text) {
  for (char& character : text) character = static_cast<char>(std::tolower(static_cast<unsigned char>(character)));
  return text;
}

std::vector<Switch> switchesOf(const Command& command) {
  std::vector<Switch> all(command.common.begin(), command.common.end());
  all.insert(all.end(), command.own.begin(), command.own.end());
  return all;
}

TEST(CommandTable, HoldsEveryFamily) {
  std::size_t count = 0;
  for (const auto& family :
       {CommandTable::sessionCommands, CommandTable::settingsCommands, CommandTable::cableCommands,
        CommandTable::chainCommands, CommandTable::operationCommands, CommandTable::formatterCommands,
        CommandTable::projectCommands, CommandTable::converterCommands}) {
    EXPECT_FALSE(family.empty());
    count += family.size();
  }
  EXPECT_EQ(CommandTable::all().size(), count);
}

TEST(CommandTable, WordsAreUniqueAndSorted) {
  const Command* former = nullptr;
  for (const Command* command : CommandTable::all()) {
    EXPECT_TRUE(former == nullptr || UT_STR::ICompare(former->word, command->word) < 0) << command->word;
    former = command;
  }
}

TEST(CommandTable, EveryRowTellsItsMeaningAndAnExample) {
  for (const Command* command : CommandTable::all()) {
    SCOPED_TRACE(command->word);
    const std::string meaning = command->meaning;
    ASSERT_FALSE(meaning.empty());
    EXPECT_EQ(meaning.back(), '.');
    EXPECT_EQ(meaning.find('\n'), std::string::npos);
    EXPECT_THAT(std::string(command->example) + " ", StartsWith(std::string(command->word) + " "));
    const std::string note = command->note;
    EXPECT_TRUE(note.empty() || note.back() == '\n');
  }
}

TEST(CommandTable, EveryExampleParses) {
  for (const Command* command : CommandTable::all()) {
    SCOPED_TRACE(command->example);
    const testsupport::RecordedMessages messages;
    const auto line = CommandSet::string2CommandSet(command->example);
    ASSERT_NE(line, nullptr);
    EXPECT_TRUE(line->decrementPositions());
    EXPECT_NO_THROW(TesselCmdargs::getCmdargs(line->getNumberCommands(), line->getCommands(), true));
    EXPECT_THAT(messages.all(), IsEmpty());
  }
}

TEST(CommandTable, EverySwitchRowIsSound) {
  for (const Command* command : CommandTable::all()) {
    std::set<std::string> names;
    for (const Switch& row : switchesOf(*command)) {
      SCOPED_TRACE(std::string(command->word) + " " + row.name);
      EXPECT_TRUE(UT_CMDARGS::isSwitch(row.name));
      EXPECT_TRUE(names.insert(lowered(row.name)).second) << "there are two of that name";
      EXPECT_STRNE(row.meaning, "");
      EXPECT_GE(row.least, 0);
      EXPECT_LE(row.least, row.most);
      EXPECT_EQ(row.most == 0, row.kind == Kind::flag);
      EXPECT_EQ(std::string(row.argument).empty(), row.kind == Kind::flag);
    }
    EXPECT_TRUE(command->switches == Switches::listed || names.empty()) << command->word;
  }
}

TEST(CommandTable, TheUsageTextNamesEverySwitch) {
  for (const Command* command : CommandTable::all()) {
    const std::string text = TesselCmdargs::findBatchFormatString(command->word).c_str();
    EXPECT_THAT(text, StartsWith(std::string(command->word) + ": " + command->meaning + "\n"));
    EXPECT_THAT(text, HasSubstr(command->note));
    EXPECT_THAT(text, testing::EndsWith(std::string("Example: ") + command->example));
    for (const Switch& row : switchesOf(*command)) {
      EXPECT_THAT(text, HasSubstr(std::string("\n  ") + row.name + " ")) << command->word;
      EXPECT_THAT(text, HasSubstr(row.meaning)) << command->word;
    }
  }
}

TEST(CommandTable, FindsEveryWordInAnyLetterCase) {
  for (const Command* command : CommandTable::all()) {
    EXPECT_EQ(CommandTable::find(command->word), command);
    EXPECT_EQ(CommandTable::find(lowered(command->word).c_str()), command);
    std::string upper = command->word;
    for (char& character : upper) character = static_cast<char>(std::toupper(static_cast<unsigned char>(character)));
    EXPECT_EQ(CommandTable::find(upper.c_str()), command);
    EXPECT_EQ(CommandTable::find((upper + "x").c_str()), nullptr);
  }
}

TEST(CommandTable, OnlyThreeWordsHaveAbbreviations) {
  const std::set<std::string> abbreviations = {"ex",  "exi",  "in",    "inf",    "id",
                                               "ide", "iden", "ident", "identi", "identif"};
  for (const Command* command : CommandTable::all()) {
    const std::string word = lowered(command->word);
    for (std::size_t length = 0; length < word.size(); ++length) {
      const std::string start = word.substr(0, length);
      const Command* found = CommandTable::find(start.c_str());
      if (abbreviations.contains(start))
        EXPECT_NE(found, nullptr) << start;
      else
        EXPECT_TRUE(found == nullptr || lowered(found->word) == start) << start << " gives " << found->word;
    }
  }
  EXPECT_STREQ(CommandTable::find("EX")->word, "exit");
  EXPECT_STREQ(CommandTable::find("inf")->word, "info");
  EXPECT_STREQ(CommandTable::find("id")->word, "identify");
  EXPECT_STREQ(CommandTable::find("identifyM") == nullptr ? "none" : "some", "none");
  EXPECT_EQ(CommandTable::find("e"), nullptr);
  EXPECT_EQ(CommandTable::find("i"), nullptr);
  EXPECT_EQ(CommandTable::find(""), nullptr);
}

}  // namespace
