#include <gtest/gtest.h>
#include <unistd.h>

#include <array>
#include <string>
#include <vector>

#include "interfaces/portability/Console.h"
#include "tests/unit/support/ConsoleCapture.h"
#include "tests/unit/support/Files.h"

namespace {

using Port::Console;
using testsupport::StandardInput;
using Lines = std::vector<std::string>;

Lines linesOf(const std::string& text, int size) {
  const StandardInput input(text);
  std::vector<char> buffer(static_cast<std::size_t>(size));
  Lines lines;
  while (Console::readLine(buffer.data(), size)) lines.emplace_back(buffer.data());
  return lines;
}

TEST(Console, ReadLineKeepsTheLineEnd) {
  EXPECT_EQ(linesOf("", 8), Lines{});
  EXPECT_EQ(linesOf("one\ntwo\n", 8), (Lines{"one\n", "two\n"}));
  EXPECT_EQ(linesOf("one\ntwo", 8), (Lines{"one\n", "two"}));
  EXPECT_EQ(linesOf("\n\r\n", 8), (Lines{"\n", "\r\n"}));
}

TEST(Console, ReadLineGivesALongLineInPieces) {
  EXPECT_EQ(linesOf("abcdefghi\n", 5), (Lines{"abcd", "efgh", "i\n"}));
  EXPECT_EQ(linesOf("abcd\n", 5), (Lines{"abcd", "\n"}));
  EXPECT_EQ(linesOf("abc\n", 5), (Lines{"abc\n"}));
  const std::string line(3000, 'x');
  EXPECT_EQ(linesOf(line + "\n", 1023),
            (Lines{line.substr(0, 1022), line.substr(0, 1022), line.substr(0, 956) + "\n"}));
}

TEST(Console, ReadLineGivesAZeroByteAsSubstitute) {
  EXPECT_EQ(linesOf(std::string("a\0b\n\0", 5), 8), (Lines{"a\x1A"
                                                           "b\n",
                                                           "\x1A"}));
}

TEST(Console, ReadLineIntoNoRoomGivesAnEmptyText) {
  const StandardInput input("text\n");
  char buffer = 'x';
  EXPECT_FALSE(Console::readLine(&buffer, 1));
  EXPECT_EQ(buffer, '\0');
}

TEST(Console, ReadLineFailsWhereNothingCanBeRead) {
  const StandardInput restored("");
  const testsupport::TemporaryDirectory directory;
  std::FILE* folder = std::fopen(directory.path().c_str(), "r");
  ASSERT_NE(folder, nullptr);
  ::dup2(::fileno(folder), STDIN_FILENO);
  std::array<char, 8> buffer{};
  EXPECT_FALSE(Console::readLine(buffer.data(), 8));
  std::fclose(folder);
}

TEST(Console, PrintReachesStandardOutputAtOnce) {
  std::array<int, 2> ends{};
  ASSERT_EQ(::pipe(ends.data()), 0);
  std::fflush(stdout);
  const int former = ::dup(STDOUT_FILENO);
  ::dup2(ends[1], STDOUT_FILENO);
  Console::print(">");
  Console::printFromSignalHandler("now %d\n");
  std::array<char, 32> text{};
  const ssize_t count = ::read(ends[0], text.data(), text.size());
  ::dup2(former, STDOUT_FILENO);
  for (const int descriptor : {former, ends[0], ends[1]}) ::close(descriptor);
  EXPECT_EQ(std::string(text.data(), static_cast<std::size_t>(count)), ">now %d\n");
}

TEST(Console, PrintStandsBehindWhatWasPrintedBefore) {
  testsupport::StandardOutputCapture output;
  std::fputs("one ", stdout);
  Console::print("two ");
  Console::print("");
  Console::print("three\n");
  EXPECT_EQ(output.text(), "one two three\n");
}

}  // namespace
