#include <gtest/gtest.h>

#include "batch/settings/PortWord.h"

namespace {

struct Row {
  const char* word;
  const char* type;  ///< null for a word that names no cable
  int index;
  int baud;
};
constexpr Row rows[] = {
    // serial ports of a workstation; 00 and 01 are the third and the fourth port
    {"tty00", "com", 2, 9600},
    {"TTY01", "com", 3, 9600},
    {"tty00x", "com", 2, 9600},
    {"tty02", "com", 1, 9600},
    {"tty0", "com", 1, 9600},
    {"ttyS0", "com", 0, 9600},
    {"ttys9", "com", 9, 9600},
    {"ttyS12", "com", 1, 9600},
    {"ttyS", "com", -'0', 9600},
    {"ttyS:", "com", 10, 9600},
    {"ttya", "com", 0, 9600},
    {"ttyb", "com", 1, 9600},
    {"ttyA", "com", 1, 9600},
    {"ttyab", "com", 0, 9600},
    {"tty", "com", 1, 9600},
    // parallel ports
    {"lpt1", "lpt", 0, -1},
    {"LPT4", "lpt", 3, -1},
    {"lpt0", "lpt", -1, -1},
    {"lpt", "lpt", -'1', -1},
    {"lptx", "lpt", 'x' - '1', -1},
    {"parport0", "lpt", 0, -1},
    {"ParPort3", "lpt", 3, -1},
    {"parport", "lpt", -'0', -1},
    {"parpor0", nullptr, -1, 9600},
    // serial ports of a personal computer
    {"com1", "com", 0, 9600},
    {"COM9", "com", 8, 9600},
    {"com10", "com", 0, 9600},
    {"com", "com", -'1', 9600},
    // USB: four characters are the old cable
    {"usb1", "usb", 0, -1},
    {"USB2", "usb", 1, -1},
    {"usbx", "usb", 'x' - '1', -1},
    {"usb21", "usb2", 0, -1},
    {"usb22", "usb2", 1, -1},
    {"usb213", "usb2", 0, -1},
    {"usb", "usb2", -'1', -1},
    // the others
    {"auto", "auto", 0, 9600},
    {"AUTOMATIC", "auto", 0, 9600},
    {"aut", nullptr, -1, 9600},
    {"null", "null", 0, 9600},
    {"NULL", "null", 0, 9600},
    {"null0", nullptr, -1, 9600},
    {"nul", nullptr, -1, 9600},
    // no cable
    {"", nullptr, -1, 9600},
    {"ethernet", nullptr, -1, 9600},
    {" com1", nullptr, -1, 9600},
    {"co", nullptr, -1, 9600},
    {"\xFF", nullptr, -1, 9600},
};

TEST(PortWord, NamesACableItsPortAndItsSpeed) {
  for (const Row& row : rows) {
    SCOPED_TRACE(row.word);
    const PortWord port = classifyPort(row.word);
    EXPECT_STREQ(port.type, row.type);
    EXPECT_EQ(port.index, row.index);
    EXPECT_EQ(port.baud, row.baud);
    EXPECT_FALSE(port.fileCable);
  }
}

struct FileRow {
  const char* word;
  const char* type;
};

TEST(PortWord, NamesAFileCable) {
  constexpr FileRow fileRows[] = {{"svf", "svf"},     {"SVF", "svf"},      {"svfx", "svf"},  {"csvf", "csvf"},
                                  {"CSVF", "csvf"},   {"csv", "csvf"},     {"csvx", "csvf"}, {"stapl", "stapl"},
                                  {"STAPL", "stapl"}, {"stapler", "stapl"}};
  for (const FileRow& row : fileRows) {
    SCOPED_TRACE(row.word);
    const PortWord port = classifyPort(row.word);
    EXPECT_STREQ(port.type, row.type);
    EXPECT_TRUE(port.fileCable);
    EXPECT_EQ(port.index, -1);
    EXPECT_EQ(port.baud, 9600);
  }
  EXPECT_EQ(classifyPort("stap").type, nullptr);
  EXPECT_EQ(classifyPort("cs").type, nullptr);
}

}  // namespace
