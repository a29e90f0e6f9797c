#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <unistd.h>

#include <array>
#include <cerrno>

#include "interfaces/portability/File.h"
#include "interfaces/portability/Stream.h"
#include "tests/unit/support/Files.h"

namespace {

using Port::File;
using Port::Stream;
using testing::ElementsAre;
using testsupport::readFile;
using testsupport::TemporaryDirectory;
using testsupport::writeFile;
using Lines = std::vector<std::string>;

constexpr int interpreterSize = 1023;

Lines linesOf(Stream& stream, int size) {
  std::vector<char> buffer(static_cast<std::size_t>(size));
  Lines lines;
  while (Stream::readline(stream, buffer.data(), size)) lines.emplace_back(buffer.data());
  return lines;
}

Lines linesOf(const std::string& content, int size = interpreterSize) {
  const TemporaryDirectory directory;
  writeFile(directory.file("text"), content);
  const auto stream = File::open(directory.file("text").c_str(), File::read, true);
  return linesOf(*stream, size);
}

/// What a line of that length comes as.
Lines pieces(std::string line, std::size_t size) {
  Lines result;
  while (line.size() > size - 1) {
    result.push_back(line.substr(0, size - 1));
    line.erase(0, size - 1);
  }
  result.push_back(line);
  return result;
}

/// Long lines of one character by their length, so that a difference can be read.
Lines shortened(Lines lines) {
  for (std::string& line : lines)
    if (line.size() > 40 && line == std::string(line.size(), line.front()))
      line = std::to_string(line.size()) + " times " + line.front();
  return lines;
}

TEST(StreamReadline, TakesLineEndsOff) {
  EXPECT_THAT(linesOf(""), ElementsAre());
  EXPECT_THAT(linesOf("a\nbc\n"), ElementsAre("a", "bc"));
  EXPECT_THAT(linesOf("a\nbc"), ElementsAre("a", "bc"));
  EXPECT_THAT(linesOf("a\r\nbc\r\n"), ElementsAre("a", "bc"));
  EXPECT_THAT(linesOf("\n\r\n\n"), ElementsAre("", "", ""));
  EXPECT_THAT(linesOf("\n"), ElementsAre(""));
}

TEST(StreamReadline, KeepsACarriageReturnThatEndsNoLine) {
  EXPECT_THAT(linesOf("a\rb\nc\r"), ElementsAre("a\rb", "c\r"));
  EXPECT_THAT(linesOf("a\r\r\n"), ElementsAre("a\r"));
  for (int size = 2; size <= 9; ++size)
    EXPECT_EQ(linesOf("abcd\r\r\n", size), pieces("abcd\r", static_cast<std::size_t>(size))) << size;
}

TEST(StreamReadline, GivesAZeroByteAsSubstitute) {
  EXPECT_THAT(linesOf(std::string("a\0b\n\0\n\0", 7)), ElementsAre("a\x1A"
                                                                   "b",
                                                                   "\x1A", "\x1A"));
}

TEST(StreamReadline, KeepsEveryOtherByte) {
  std::string line;
  for (int byte = 1; byte < 256; ++byte)
    if (byte != '\n' && byte != '\r') line += static_cast<char>(byte);
  EXPECT_THAT(linesOf(line + "\n"), ElementsAre(line));
}

TEST(StreamReadline, GivesALongLineInPieces) {
  for (const std::size_t length : {1021U, 1022U, 1023U, 1024U, 2043U, 2044U, 2045U, 65535U, 65536U, 65537U, 200000U}) {
    SCOPED_TRACE(length);
    const std::string line(length, 'x');
    Lines expected = pieces(line, interpreterSize);
    EXPECT_EQ(shortened(linesOf(line)), shortened(expected));
    EXPECT_EQ(shortened(linesOf(line + "\n")), shortened(expected));
    expected.emplace_back("next");
    EXPECT_EQ(shortened(linesOf(line + "\nnext\n")), shortened(expected));
  }
}

TEST(StreamReadline, EveryLengthLineEndAndBufferFit) {
  for (const char* lineEnd : {"\n", "\r\n"})
    for (int size = 2; size <= 9; ++size)
      for (std::size_t length = 0; length <= 30; ++length) {
        const std::string line = std::string("abcdefghijklmnopqrstuvwxyz1234").substr(0, length);
        Lines expected = pieces(line, static_cast<std::size_t>(size));
        const Lines once = expected;
        expected.insert(expected.end(), once.begin(), once.end());
        EXPECT_EQ(linesOf(line + lineEnd + line + lineEnd, size), expected)
            << length << " in " << size << (lineEnd[0] == '\r' ? " with a carriage return" : "");
      }
}

TEST(StreamReadline, ALineOfExactlyTheBuffersLengthTakesItsWholeLineEnd) {
  for (const std::size_t length : {1021U, 1022U, 1023U, 2044U}) {
    const std::string line(length, 'x');
    Lines expected = pieces(line, interpreterSize);
    expected.emplace_back("next");
    EXPECT_EQ(shortened(linesOf(line + "\r\nnext\r\n")), shortened(expected)) << length;
  }
}

TEST(StreamReadline, LinesThatCrossTheStreamsOwnBufferAreWhole) {
  // Lines of 7 bytes with their line end, so that every place of a line meets every boundary in turn.
  std::string content;
  Lines expected;
  for (int i = 100000; i < 160000; ++i) {
    expected.push_back(std::to_string(i));
    content += expected.back() + "\n";
  }
  EXPECT_EQ(linesOf(content), expected);
}

/// The lines of a text that the system hands over in these parts.
Lines linesOfParts(const std::vector<std::string>& parts, int size) {
  std::array<int, 2> ends{};
  EXPECT_EQ(::pipe2(ends.data(), O_DIRECT), 0);  // each write is read on its own
  for (const std::string& part : parts) EXPECT_GT(::write(ends[1], part.data(), part.size()), 0);
  ::close(ends[1]);
  Stream stream("pipe", ends[0], false, true);
  return linesOf(stream, size);
}

TEST(StreamReadline, PutsALineTogetherThatArrivesInParts) {
  EXPECT_THAT(linesOfParts({"on", "e\ntw", "o", "\n", "three"}, interpreterSize), ElementsAre("one", "two", "three"));
  for (int size = 2; size <= 8; ++size) {
    std::vector<std::string> bytes;
    for (const char byte : std::string("abc\r\ndefg\n\r\n")) bytes.emplace_back(1, byte);
    EXPECT_EQ(linesOfParts(bytes, size), linesOf("abc\r\ndefg\n\r\n", size)) << size;
  }
}

TEST(StreamReadline, TheEndOfTheFileIsNoError) {
  const TemporaryDirectory directory;
  writeFile(directory.file("text"), "a");
  const auto stream = File::open(directory.file("text").c_str(), File::read, true);
  std::array<char, 8> buffer{};
  EXPECT_TRUE(Stream::readline(*stream, buffer.data(), 8));
  EXPECT_FALSE(Stream::readline(*stream, buffer.data(), 8));
  EXPECT_FALSE(Stream::readline(*stream, buffer.data(), 8));
  EXPECT_EQ(stream->error(), 0);
}

TEST(StreamReadline, ADirectoryIsAReadError) {
  const TemporaryDirectory directory;
  Stream stream(directory.path(), ::open(directory.path().c_str(), O_RDONLY), false, true);
  std::array<char, 8> buffer{};
  EXPECT_FALSE(Stream::readline(stream, buffer.data(), 8));
  EXPECT_EQ(stream.error(), EISDIR);
  EXPECT_FALSE(Stream::readline(stream, buffer.data(), 8));
  EXPECT_EQ(stream.error(), EISDIR);
}

TEST(StreamReadline, GoesOnBehindWhatWasWiped) {
  const TemporaryDirectory directory;
  writeFile(directory.file("text"), "program -key 00\nnext\n\nlast");
  const auto stream = File::open(directory.file("text").c_str(), File::read, true);
  stream->wipeRead();
  std::array<char, 32> buffer{};
  EXPECT_TRUE(Stream::readline(*stream, buffer.data(), 32));
  EXPECT_STREQ(buffer.data(), "program -key 00");
  stream->wipeRead();
  EXPECT_THAT(linesOf(*stream, 32), ElementsAre("next", "", "last"));
  stream->wipeRead();
  EXPECT_EQ(stream->error(), 0);
}

TEST(StreamWrite, PutsEveryTextBehindTheOther) {
  const TemporaryDirectory directory;
  auto stream = File::open(directory.file("text").c_str(), File::write, true);
  *stream << "one " << StringBase("two") << Port::endl
          << ""
          << "three";
  stream->write(std::string_view("\0!", 2));
  EXPECT_EQ(stream->error(), 0);
  EXPECT_TRUE(File::close(stream));
  EXPECT_EQ(readFile(directory.file("text")), std::string("one two\nthree\0!", 15));
}

TEST(StreamWrite, EndOfLineAndFlushReachTheFileAtOnce) {
  const TemporaryDirectory directory;
  const auto stream = File::open(directory.file("text").c_str(), File::write, true);
  *stream << "one" << Port::endl;
  EXPECT_EQ(readFile(directory.file("text")), "one\n");
  *stream << "two";
  stream->flush();
  EXPECT_EQ(readFile(directory.file("text")), "one\ntwo");
}

TEST(StreamWrite, TextsLargerThanTheBufferAreWhole) {
  for (const std::size_t size : {65535U, 65536U, 65537U, 300000U}) {
    const TemporaryDirectory directory;
    std::string text(size, '.');
    for (std::size_t i = 0; i < size; i += 7) text[i] = static_cast<char>('a' + i % 26);
    auto stream = File::open(directory.file("text").c_str(), File::write, true);
    *stream << "<" << text.c_str() << ">";
    EXPECT_TRUE(File::close(stream));
    EXPECT_TRUE(readFile(directory.file("text")) == "<" + text + ">") << size;
  }
}

TEST(StreamWrite, TheDestructorWritesWhatIsPending) {
  const TemporaryDirectory directory;
  *File::open(directory.file("text").c_str(), File::write, true) << "pending";
  EXPECT_EQ(readFile(directory.file("text")), "pending");
}

TEST(StreamWrite, AFullDiskIsReported) {
  if (::access("/dev/full", W_OK) != 0) GTEST_SKIP() << "this system has no /dev/full";
  auto stream = File::open("/dev/full", File::write, true);
  *stream << "lost" << Port::endl;
  EXPECT_EQ(stream->error(), ENOSPC);
  EXPECT_FALSE(File::close(stream));
  EXPECT_EQ(stream, nullptr);
}

TEST(StreamWrite, AFullDiskIsReportedWhenTheStreamIsClosed) {
  if (::access("/dev/full", W_OK) != 0) GTEST_SKIP() << "this system has no /dev/full";
  auto stream = File::open("/dev/full", File::write, true);
  *stream << "lost";
  EXPECT_EQ(stream->error(), 0);
  EXPECT_FALSE(File::close(stream));
}

TEST(StreamWrite, AReaderThatHasGoneIsReported) {
  const auto former = ::signal(SIGPIPE, SIG_IGN);
  std::array<int, 2> ends{};
  ASSERT_EQ(::pipe(ends.data()), 0);
  ::close(ends[0]);
  Stream stream("pipe", ends[1], true, true);
  stream << "lost" << Port::endl;
  EXPECT_EQ(stream.error(), EPIPE);
  ::signal(SIGPIPE, former);
}

TEST(Stream, TheFirstErrorStays) {
  Stream stream("nothing", -1, true, false);
  stream << "a" << Port::endl;
  EXPECT_EQ(stream.error(), EBADF);
  stream.flush();
  EXPECT_EQ(stream.error(), EBADF);
}

TEST(Stream, OwnsItsDescriptorOrLeavesItOpen) {
  const TemporaryDirectory directory;
  const int borrowed = ::open(directory.file("text").c_str(), O_WRONLY | O_CREAT, 0600);
  { Stream("text", borrowed, true, false) << "kept"; }
  EXPECT_EQ(::fcntl(borrowed, F_GETFD), 0);
  EXPECT_EQ(readFile(directory.file("text")), "kept");
  { const Stream stream("text", borrowed, true, true); }
  EXPECT_EQ(::fcntl(borrowed, F_GETFD), -1);
}

TEST(Stream, TellsItsPath) {
  const Stream stream("some/where", -1, true, false);
  EXPECT_EQ(stream.path(), "some/where");
}

}  // namespace
