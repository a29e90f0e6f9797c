#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "interfaces/portability/Port_MsgManDefault.h"
#include "interfaces/portability/UT_STR.h"
#include "tests/unit/support/ConsoleCapture.h"
#include "tests/unit/support/Files.h"

namespace {

using testing::ElementsAre;
using testsupport::ConsoleCapture;

std::vector<std::wstring> formatted(MsgType type, bool clean, int width, const wchar_t* text) {
  const Port_MsgManDefault manager(nullptr);
  int count = -1;
  const auto lines = manager.msgFormat(type, clean, width, text, &count);
  EXPECT_EQ(count, static_cast<int>(lines.size()));
  return lines;
}

TEST(Port_MsgManDefault, BeginsWithoutSettings) {
  const Port_MsgManDefault manager("bench");
  EXPECT_EQ(manager.name(), "bench");
  EXPECT_EQ(Port_MsgManDefault(nullptr).name(), "");
  EXPECT_FALSE(manager.getClean());
  EXPECT_FALSE(manager.getAbortFlag());
  EXPECT_EQ(manager.getMaxLineWidth(), 0);
}

TEST(Port_MsgManDefault, KeepsItsSettings) {
  Port_MsgManDefault manager(nullptr);
  manager.setClean(true);
  manager.setAbortFlag(true);
  manager.setMaxLineWidth(72);
  EXPECT_TRUE(manager.getClean());
  EXPECT_TRUE(manager.getAbortFlag());
  EXPECT_EQ(manager.getMaxLineWidth(), 72);
}

struct ShownRow {
  MsgType type;
  const wchar_t* plain;
  const wchar_t* clean;
};

TEST(Port_MsgManDefault, TheShownFormTellsTheKindOfErrorsAndWarnings) {
  constexpr ShownRow rows[] = {{MsgType::error, L"ERROR:text\n", L"text\n"},
                               {MsgType::warning, L"WARNING:text\n", L"text\n"},
                               {MsgType::status, L"text\n", L"text\n"}};
  for (const ShownRow& row : rows) {
    EXPECT_THAT(formatted(row.type, false, 0, L"text\n"), ElementsAre(row.plain));
    EXPECT_THAT(formatted(row.type, true, 0, L"text\n"), ElementsAre(row.clean));
  }
}

TEST(Port_MsgManDefault, WithoutALineWidthATextIsOneLine) {
  EXPECT_THAT(formatted(MsgType::status, false, 0, L""), ElementsAre(L""));
  EXPECT_THAT(formatted(MsgType::status, false, 0, L"a\nb\n\n"), ElementsAre(L"a\nb\n\n"));
  const std::wstring wide(5000, L'x');
  EXPECT_THAT(formatted(MsgType::status, false, 0, wide.c_str()), ElementsAre(wide));
}

struct WrapRow {
  int width;
  const wchar_t* text;
  std::vector<std::wstring> expected;
};

TEST(Port_MsgManDefault, WrapsBetweenWords) {
  const WrapRow rows[] = {
      {5, L"abcde", {L"abcde"}},
      {5, L"abcde\n", {L"abcde\n"}},
      {5, L"abcde fgh\n", {L"abcde", L"fgh\n"}},
      {5, L"abcd fgh\n", {L"abcd", L"fgh\n"}},
      {5, L"ab cd ef\n", {L"ab cd", L"ef\n"}},
      {5, L"a b c d e f g", {L"a b c", L"d e f", L"g"}},
      {5, L"abcdefghij kl", {L"abcdefghij", L"kl"}},
      {5, L"ab cdefghij kl", {L"ab", L"cdefghij", L"kl"}},
      {5, L"abcdefghij", {L"abcdefghij"}},
      {5, L"ab\ncd ef gh\nij\n", {L"ab\n", L"cd ef", L"gh\n", L"ij\n"}},
      {5, L"abcde\nfghij\n", {L"abcde\n", L"fghij\n"}},
      {5, L"\n\n", {L"\n", L"\n"}},
      {1, L"a b c", {L"a", L"b", L"c"}},
      {4, L"\u00E9\u00E9\u00E9\u00E9 \u20AC", {L"\u00E9\u00E9\u00E9\u00E9", L"\u20AC"}},
      {100, L"a b c\n", {L"a b c\n"}},
      {-1, L"a b c\n", {L"a b c\n"}},
  };
  for (const WrapRow& row : rows)
    EXPECT_EQ(formatted(MsgType::status, false, row.width, row.text), row.expected)
        << row.width << ' ' << UT_STR::WstrToMbstr(row.text);
}

TEST(Port_MsgManDefault, TheKindCountsForTheLineWidth) {
  EXPECT_THAT(formatted(MsgType::error, false, 10, L"abc defg\n"), ElementsAre(L"ERROR:abc", L"defg\n"));
  EXPECT_THAT(formatted(MsgType::error, true, 10, L"abc defg\n"), ElementsAre(L"abc defg\n"));
}

TEST(Port_MsgManDefault, NoWrappedLineIsWiderThanItsWordsNeed) {
  const std::wstring text = L"Cable lock can't be taken: the cable is in use by another session of this user.\n";
  for (int width = 1; width < 100; ++width) {
    std::wstring joined;
    for (const std::wstring& line : formatted(MsgType::status, false, width, text.c_str())) {
      const std::size_t length = line.find(L'\n') == std::wstring::npos ? line.size() : line.size() - 1;
      const bool oneWord = line.find(L' ') == std::wstring::npos;
      EXPECT_TRUE(length <= static_cast<std::size_t>(width) || oneWord) << width << UT_STR::WstrToMbstr(line.c_str());
      joined += (joined.empty() ? L"" : L" ") + line;
    }
    EXPECT_EQ(joined, text) << width;
  }
}

TEST(Port_MsgManDefault, ErrorsAndWarningsGoToStandardError) {
  const ConsoleCapture console;
  Port_MsgManDefault manager(nullptr);
  manager.msgWrite(MsgType::error, L"one\n");
  manager.msgWrite(MsgType::status, L"two\n");
  manager.msgWrite(MsgType::warning, L"three\n");
  EXPECT_EQ(console.output(), "two\n");
  EXPECT_EQ(console.errors(), "ERROR:one\nWARNING:three\n");
}

TEST(Port_MsgManDefault, OutputWritesALineAsItStands) {
  const ConsoleCapture console;
  Port_MsgManDefault manager(nullptr);
  manager.output(MsgType::error, L"caf\u00E9");
  manager.output(MsgType::status, L"100% %d\n");
  manager.flush();
  EXPECT_EQ(console.errors(), "caf\xC3\xA9");
  EXPECT_EQ(console.output(), "100% %d\n");
}

TEST(Port_MsgManDefault, InOneFileWhatCameFirstStandsFirst) {
  const testsupport::TemporaryDirectory directory;
  std::FILE* output = std::fopen(directory.file("both").c_str(), "a");
  std::FILE* errors = std::fopen(directory.file("both").c_str(), "a");
  std::setbuf(errors, nullptr);
  Port_MsgManDefault::setConsole(output, errors);
  Port_MsgManDefault manager(nullptr);
  manager.output(MsgType::status, L"one\n");
  manager.output(MsgType::error, L"two\n");
  manager.output(MsgType::status, L"three\n");
  manager.output(MsgType::warning, L"four\n");
  Port_MsgManDefault::setConsole(stdout, stderr);
  std::fclose(output);
  std::fclose(errors);
  EXPECT_EQ(testsupport::readFile(directory.file("both")), "one\ntwo\nthree\nfour\n");
}

TEST(Port_MsgManDefault, MsgWriteEndsEveryLineOfAWrappedText) {
  const ConsoleCapture console;
  Port_MsgManDefault manager(nullptr);
  manager.setMaxLineWidth(8);
  manager.msgWrite(MsgType::status, L"one two three\nfour five six");
  EXPECT_EQ(console.output(), "one two\nthree\nfour\nfive six");
}

TEST(Port_MsgManDefault, MsgWriteKeepsStrayBytes) {
  const ConsoleCapture console;
  Port_MsgManDefault(nullptr).msgWrite(MsgType::status, UT_STR::MbstrToWstr("\xFF\xC3(\n").c_str());
  EXPECT_EQ(console.output(), "\xFF\xC3(\n");
}

/// A host's own manager that changes how messages look.
class Shouting : public Port_MsgManDefault {
 public:
  Shouting() : Port_MsgManDefault("shouting") {}
  bool getClean() const override { return true; }
  int getMaxLineWidth() const override { return 4; }
  void output(MsgType /*type*/, const wchar_t* line) override { lines.push_back(UT_STR::WstrToMbstr(line)); }
  void flush() override { ++flushes; }

  std::vector<std::string> lines;
  int flushes = 0;
};

TEST(Port_MsgManDefault, MsgWriteGoesByTheSettingsOfASubclass) {
  Shouting manager;
  manager.msgWrite(MsgType::error, L"abcd efgh\n");
  EXPECT_THAT(manager.lines, ElementsAre("abcd\n", "efgh\n"));
  EXPECT_EQ(manager.flushes, 1);
}

}  // namespace
