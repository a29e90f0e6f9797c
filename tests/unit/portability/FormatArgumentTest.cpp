#include <gtest/gtest.h>

#include <limits>

#include "interfaces/portability/FormatArgument.h"

namespace {

using Port::format;
using Port::FormatArgument;

struct LetterRow {
  const char* format;
  const char* negative;   ///< what -42 gives
  const char* positive;   ///< what 42 without a sign gives
  const char* real;       ///< what 2.5 gives
  const char* character;  ///< what 'A' gives
  const char* text;       ///< what "abc" gives
  const char* null;       ///< what a null text gives
};
constexpr LetterRow letterRows[] = {
    {"<%d>", "<-42>", "<42>", "<2.5>", "<65>", "<abc>", "<(null)>"},
    {"<%i>", "<-42>", "<42>", "<2.5>", "<65>", "<abc>", "<(null)>"},
    {"<%u>", "<18446744073709551574>", "<42>", "<2.5>", "<65>", "<abc>", "<(null)>"},
    {"<%x>", "<ffffffffffffffd6>", "<2a>", "<2.5>", "<41>", "<abc>", "<(null)>"},
    {"<%X>", "<FFFFFFFFFFFFFFD6>", "<2A>", "<2.5>", "<41>", "<abc>", "<(null)>"},
    {"<%o>", "<1777777777777777777726>", "<52>", "<2.5>", "<101>", "<abc>", "<(null)>"},
    {"<%c>", "<\xD6>", "<*>", "<2.5>", "<A>", "<abc>", "<(null)>"},
    {"<%s>", "<-42>", "<42>", "<2.5>", "<A>", "<abc>", "<(null)>"},
    {"<%p>", "<-42>", "<42>", "<2.5>", "<A>", "<abc>", "<(null)>"},
    {"<%f>", "<-42.000000>", "<42.000000>", "<2.500000>", "<A>", "<abc>", "<(null)>"},
    {"<%F>", "<-42.000000>", "<42.000000>", "<2.500000>", "<A>", "<abc>", "<(null)>"},
    {"<%e>", "<-4.200000e+01>", "<4.200000e+01>", "<2.500000e+00>", "<A>", "<abc>", "<(null)>"},
    {"<%E>", "<-4.200000E+01>", "<4.200000E+01>", "<2.500000E+00>", "<A>", "<abc>", "<(null)>"},
    {"<%g>", "<-42>", "<42>", "<2.5>", "<A>", "<abc>", "<(null)>"},
    {"<%G>", "<-42>", "<42>", "<2.5>", "<A>", "<abc>", "<(null)>"},
    {"<%a>", "<-0x1.5p+5>", "<0x1.5p+5>", "<0x1.4p+1>", "<A>", "<abc>", "<(null)>"},
    {"<%A>", "<-0X1.5P+5>", "<0X1.5P+5>", "<0X1.4P+1>", "<A>", "<abc>", "<(null)>"},
    {"<%n>", "<>", "<>", "<>", "<>", "<>", "<>"},
};

TEST(Format, EveryLetterTakesEveryArgument) {
  const char* nullText = nullptr;
  for (const LetterRow& row : letterRows) {
    SCOPED_TRACE(row.format);
    EXPECT_EQ(format(row.format, std::int64_t{-42}), row.negative);
    EXPECT_EQ(format(row.format, std::uint64_t{42}), row.positive);
    EXPECT_EQ(format(row.format, 2.5), row.real);
    EXPECT_EQ(format(row.format, 'A'), row.character);
    EXPECT_EQ(format(row.format, "abc"), row.text);
    EXPECT_EQ(format(row.format, nullText), row.null);
  }
}

enum class Colour : short { red = 3 };

TEST(Format, EveryTypeOfTheLanguageIsAnArgument) {
  EXPECT_EQ(format("%d", static_cast<signed char>(-7)), "-7");
  EXPECT_EQ(format("%d", static_cast<unsigned char>(200)), "200");
  EXPECT_EQ(format("%d", static_cast<short>(-32768)), "-32768");
  EXPECT_EQ(format("%d", std::numeric_limits<long long>::min()), "-9223372036854775808");
  EXPECT_EQ(format("%d", std::numeric_limits<unsigned long long>::max()), "18446744073709551615");
  EXPECT_EQ(format("%d", true), "1");
  EXPECT_EQ(format("%d", Colour::red), "3");
  EXPECT_EQ(format("%.1f", 1.5F), "1.5");
  EXPECT_EQ(format("%s", std::string("text")), "text");
  EXPECT_EQ(format("%s", StringBase("text")), "text");
  EXPECT_EQ(format("%s", StringBase()), "");
}

struct ShapeRow {
  const char* format;
  FormatArgument argument;
  const char* expected;
};

TEST(Format, FlagsWidthAndPrecisionCount) {
  const char* nullText = nullptr;
  const ShapeRow rows[] = {
      {"%5d", 42, "   42"},
      {"%-5d|", 42, "42   |"},
      {"%05d", 42, "00042"},
      {"%+d", 42, "+42"},
      {"% d", 42, " 42"},
      {"%+-5d|", 42, "+42  |"},
      {"%#x", 42, "0x2a"},
      {"%#o", 42, "052"},
      {"%.4d", 42, "0042"},
      {"%6.4d", -42, " -0042"},
      {"%1d", 12345, "12345"},
      {"%5c|", 'x', "    x|"},
      {"%-5c|", 'x', "x    |"},
      {"%5s|", "abc", "  abc|"},
      {"%-5s|", "abc", "abc  |"},
      {"%2s", "abc", "abc"},
      {"%.2s", "abc", "ab"},
      {"%5.2s|", "abc", "   ab|"},
      {"%.9s", "abc", "abc"},
      {"%.s|", "abc", "|"},
      {"%.0s|", "abc", "|"},
      {"%8s", nullText, "  (null)"},
      {"%-8s|", nullText, "(null)  |"},
      {"%5d", "abc", "  abc"},
      {"%5s", 42, "   42"},
      {"%6.0f", 12.0, "    12"},
      {"%6.0f", 12, "    12"},
      {"%6.0f", 12U, "    12"},
      {"%6.0f", "soon", "  soon"},
      {"%6.0f", 1234567.0, "1234567"},
      {"%6.0f", -0.4, "    -0"},
      {"%.0f", 2.5, "2"},
      {"%.2f", 2.675, "2.67"},
      {"%08.3f", -2.5, "-002.500"},
      {"%.3e", 12345.0, "1.234e+04"},
      {"%f", std::numeric_limits<double>::infinity(), "inf"},
  };
  for (const ShapeRow& row : rows) EXPECT_EQ(format(row.format, {&row.argument, 1}), row.expected) << row.format;
}

TEST(Format, LengthLettersAreIgnored) {
  for (const char* text : {"%hhd", "%hd", "%ld", "%lld", "%qd", "%jd", "%zd", "%td", "%Ld"})
    EXPECT_EQ(format(text, 70000), "70000") << text;
  EXPECT_EQ(format("%Lf", 1.0), "1.000000");
  EXPECT_EQ(format("%ls", "abc"), "abc");
}

TEST(Format, APercentSignTakesNoArgument) {
  EXPECT_EQ(format("100%%"), "100%");
  EXPECT_EQ(format("%d%% of %d%%", 5, 10), "5% of 10%");
  EXPECT_EQ(format("%%d", 5), "%d");
}

TEST(Format, NIsSilentAndTakesItsArgument) { EXPECT_EQ(format("a%nb%d", 1, 2), "ab2"); }

TEST(Format, AConversionWithoutAnArgumentStays) {
  EXPECT_EQ(format("%d and %-5.2s!", 1), "1 and %-5.2s!");
  EXPECT_EQ(format("%lld"), "%lld");
  EXPECT_EQ(format("%n"), "%n");
  EXPECT_EQ(format("%s", std::span<const FormatArgument>()), "%s");
}

TEST(Format, AFormatThatEndsInsideAConversionKeepsItsEnd) {
  for (const char* text : {"%", "a%", "%-", "%5", "%5.", "%5.2", "%ll", "%-08.3l"}) {
    EXPECT_EQ(format(text), text);
    EXPECT_EQ(format(text, 1), text);
  }
}

TEST(Format, ArgumentsLeftOverAreDropped) {
  EXPECT_EQ(format("a", 1, "b"), "a");
  EXPECT_EQ(format("", 1), "");
}

TEST(Format, ATextIsNeverReadAsAFormat) {
  EXPECT_EQ(format("%s", "%d %n %s"), "%d %n %s");
  EXPECT_EQ(format("%s", "caf\xC3\xA9 \xFF"), "caf\xC3\xA9 \xFF");
}

TEST(Format, LongResultsAreWhole) {
  const std::string text(100000, 'x');
  EXPECT_EQ(format("<%s>", text), "<" + text + ">");
  const std::string number = format("%.1000f", std::numeric_limits<double>::max());
  EXPECT_EQ(number.size(), 309U + 1 + 1000);
  EXPECT_EQ(number.substr(0, 17), "17976931348623157");
  EXPECT_EQ(number.substr(309), "." + std::string(1000, '0'));
}

TEST(Format, AWidthBeyondReasonIsCut) {
  EXPECT_EQ(format("%1000d", 7), std::string(999, ' ') + "7");
  EXPECT_EQ(format("%99999999999d", 7), std::string(999, ' ') + "7");
  EXPECT_EQ(format("%99999999999s", "x"), std::string(999, ' ') + "x");
  EXPECT_EQ(format("%.99999999999d", 7), std::string(999, '0') + "7");
}

}  // namespace
