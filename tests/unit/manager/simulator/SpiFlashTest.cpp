#include <gtest/gtest.h>

#include <algorithm>

#include "manager/parts/Sfdp.h"
#include "tests/unit/manager/simulator/Jtag.h"

namespace {

using Bytes = std::vector<std::uint8_t>;

/// Transactions with the flash behind the second of three devices.
class SpiFlashBoard : public testing::Test {
 protected:
  explicit SpiFlashBoard(const std::string& part = "w25q64")
      : test_(R"({"chain": [{"part": "zp18v01"}, {"part": "marlin3-1", "spi": {"part": ")" + part +
              R"("}}, {"part": "mullet-32"}]})"),
        jtag_(*test_.board, findParts(test_.parts, {"zp18v01", "marlin3-1", "mullet-32"})) {
    jtag_.load(1, "USER1");
  }

  /// Sends bytes, or a number of bits when it is given, and gives the answer.
  Bytes transfer(const Bytes& bytes, std::size_t bits = 0) {
    if (bits == 0) bits = bytes.size() * 8;
    BitVector out(3);
    out.append(true);
    const auto length = static_cast<std::uint32_t>(bits - 1);
    for (int i = 31; i >= 0; --i) out.append((length >> i & 1U) != 0);
    const std::size_t first = out.size();
    for (std::size_t i = 0; i < bits; ++i) out.append((bytes[i / 8] >> (7 - i % 8) & 1) != 0);
    out.appendFill(jtag_.size(), false);
    const BitVector in = jtag_.data(1, out);
    EXPECT_EQ(in.slice(0, first + jtag_.size()).count(), 0U) << "bits before the answer are zeros";
    Bytes answer(bits / 8);
    for (std::size_t i = 0; i < answer.size() * 8; ++i)
      if (in.get(first + jtag_.size() + i)) answer[i / 8] = static_cast<std::uint8_t>(answer[i / 8] | 0x80 >> i % 8);
    return answer;
  }
  /// The answer to a command of `header` bytes.
  Bytes read(Bytes header, std::size_t count) {
    const auto first = static_cast<std::ptrdiff_t>(header.size());
    header.resize(header.size() + count);
    const Bytes answer = transfer(header);
    return {answer.begin() + first, answer.end()};
  }
  int status() { return read({0x05}, 1)[0]; }
  void write(const Bytes& bytes, double seconds = 0.1) {
    transfer({0x06});
    transfer(bytes);
    jtag_.wait(seconds);
  }
  Bytes flash() { return test_.board->spiMemory(1); }

  TestBoard test_;
  Jtag jtag_;
};

struct BigSpiFlashBoard : SpiFlashBoard {
  BigSpiFlashBoard() : SpiFlashBoard("w25q256") {}
};

}  // namespace

TEST_F(SpiFlashBoard, TellsWhatItIs) {
  EXPECT_EQ(read({0x9F}, 3), (Bytes{0xEF, 0x40, 0x17}));
  const Bytes sfdp = Sfdp::build(*FlashParts::findSpi("w25q64"));
  EXPECT_EQ(read({0x5A, 0, 0, 0, 0}, 64), Bytes(sfdp.begin(), sfdp.begin() + 64));
  EXPECT_EQ(read({0x5A, 0, 0, 8, 0}, 8), Bytes(sfdp.begin() + 8, sfdp.begin() + 16));
}

TEST_F(SpiFlashBoard, NeedsWriteEnableForEachProgramming) {
  transfer({0x02, 0, 0, 0, 0x12});
  EXPECT_EQ(flash()[0], 0xFF);
  transfer({0x06});
  EXPECT_EQ(status(), 2);
  transfer({0x04});
  EXPECT_EQ(status(), 0);
  transfer({0x06});
  transfer({0x02, 0, 0, 0, 0x12});
  EXPECT_EQ(status() & 1, 1);
  jtag_.wait(0.01);
  EXPECT_EQ(status(), 0) << "the enable is used up";
  EXPECT_EQ(flash()[0], 0x12);
}

TEST_F(SpiFlashBoard, ProgrammingClearsBitsAndWrapsInThePage) {
  write({0x02, 0x00, 0x01, 0xFE, 0xF0, 0x0F, 0x33});
  EXPECT_EQ(flash()[0x1FE], 0xF0);
  EXPECT_EQ(flash()[0x1FF], 0x0F);
  EXPECT_EQ(flash()[0x100], 0x33);
  EXPECT_EQ(flash()[0x200], 0xFF);
  write({0x02, 0x00, 0x01, 0xFE, 0x3C});
  EXPECT_EQ(flash()[0x1FE], 0x30);
  Bytes tooMuch = {0x02, 0, 2, 0};
  tooMuch.resize(4 + 258, 0x55);
  tooMuch[4 + 256] = 0x66;
  write(tooMuch);
  EXPECT_EQ(flash()[0x200], 0x66) << "the last bytes of a page count";
  EXPECT_EQ(flash()[0x2FF], 0x55);
}

TEST_F(SpiFlashBoard, ErasesBlocksOfItsSizes) {
  struct Row {
    std::uint8_t command;
    std::size_t size;
  };
  for (const Row& row : {Row{0x20, 4096}, Row{0x52, 32768}, Row{0xD8, 65536}}) {
    write({0xC7}, 1);
    write({0x02, 0x01, 0xFF, 0xFF, 0});
    write({0x02, 0x02, 0x00, 0x00, 0});
    write({0x02, 0x03, 0x00, 0x00, 0});
    write({row.command, 0x02, 0x00, 0x05});
    const Bytes now = flash();
    EXPECT_EQ(now[0x1FFFF], 0) << row.size;
    EXPECT_EQ(now[0x20000], 0xFF) << row.size;
    EXPECT_EQ(now[0x30000], 0) << row.size;
  }
  write({0x60}, 1);
  EXPECT_EQ(flash(), Bytes(8 << 20, 0xFF));
}

TEST_F(SpiFlashBoard, WhileBusyItOnlyTellsItsStatus) {
  transfer({0x06});
  transfer({0xC7});
  EXPECT_EQ(status() & 1, 1);
  EXPECT_EQ(read({0x9F}, 3), Bytes(3, 0xFF));
  transfer({0x06});
  transfer({0x02, 0, 0, 0, 0});
  jtag_.wait(1);
  EXPECT_EQ(flash()[0], 0xFF);
  EXPECT_EQ(status(), 0);
}

TEST_F(SpiFlashBoard, ATransactionThatEndsInsideAByteDoesNothing) {
  transfer({0x06});
  transfer({0x02, 0, 0, 0, 0x12, 0x34}, 44);
  jtag_.wait(0.1);
  EXPECT_EQ(flash()[0], 0xFF);
  EXPECT_EQ(status(), 2);
}

TEST_F(SpiFlashBoard, StatusRegistersKeepBitsAndProtect) {
  write({0x01, 0x1C | 3, 0x02});
  EXPECT_EQ(status(), 0x1C);
  EXPECT_EQ(read({0x35}, 1)[0], 2);
  write({0x02, 0, 0, 0, 0});
  write({0x20, 0, 0, 0});
  EXPECT_EQ(flash()[0], 0xFF);
  EXPECT_EQ(status(), 0x1C);
  write({0x11, 0x60});
  EXPECT_EQ(read({0x15}, 1)[0], 0x60);
  write({0x01, 0});
  write({0x02, 0, 0, 0, 0});
  EXPECT_EQ(flash()[0], 0);
}

TEST_F(SpiFlashBoard, SleepsUntilItIsWoken) {
  transfer({0xB9});
  EXPECT_EQ(read({0x9F}, 3), Bytes(3, 0xFF));
  transfer({0xAB});
  EXPECT_EQ(read({0x9F}, 1)[0], 0xEF);
}

TEST_F(SpiFlashBoard, AResetNeedsItsEnable) {
  transfer({0x06});
  transfer({0x99});
  EXPECT_EQ(status(), 2);
  transfer({0x66});
  transfer({0x99});
  EXPECT_EQ(status(), 0);
  transfer({0x06});
  transfer({0x66});
  transfer({0x05});
  transfer({0x99});
  EXPECT_EQ(status(), 2) << "another command in between takes the enable back";
}

TEST_F(SpiFlashBoard, AFourByteCommandIsUnknownToASmallPart) {
  write({0x12, 0, 0, 0, 0, 0x12});
  EXPECT_EQ(flash()[0], 0xFF);
  transfer({0xB7});
  write({0x02, 0, 0, 0, 0x12});
  EXPECT_EQ(flash()[0], 0x12);
}

TEST_F(BigSpiFlashBoard, ReachesItsUpperPartByFourAddressBytes) {
  write({0x12, 0x01, 0x23, 0x45, 0x00, 0xA1});
  EXPECT_EQ(flash()[0x1234500], 0xA1);
  transfer({0xB7});
  write({0x02, 0x01, 0x23, 0x46, 0x00, 0xA2});
  EXPECT_EQ(read({0x03, 0x01, 0x23, 0x45, 0x00}, 1)[0], 0xA1);
  EXPECT_EQ(read({0x0C, 0x01, 0x23, 0x46, 0x00, 0}, 1)[0], 0xA2);
  transfer({0xE9});
  EXPECT_EQ(read({0x03, 0x23, 0x45, 0x00}, 1)[0], 0xFF);
  EXPECT_EQ(read({0x13, 0x01, 0x23, 0x46, 0x00}, 1)[0], 0xA2);
  write({0x21, 0x01, 0x23, 0x45, 0x00});
  EXPECT_EQ(flash()[0x1234500], 0xFF);
}

TEST_F(SpiFlashBoard, AScanInPiecesIsOneTransaction) {
  write({0x02, 0, 0, 0, 0x5A, 0xC3});
  // The same bits as in `transfer`, with visits to Pause-DR between them.
  BitVector out = BitVector::fromNumber(0b1, 1);
  for (int i = 31; i >= 0; --i) out.append((47U >> i & 1U) != 0);
  for (const int byte : {0x03, 0, 0, 0, 0, 0})
    for (int i = 7; i >= 0; --i) out.append((byte >> i & 1) != 0);
  out.appendFill(4, false);
  test_.board->clockLevels(0b001, 0, 3);
  BitVector in;
  for (std::size_t i = 0; i < out.size(); ++i) {
    const std::size_t last = i % 5 == 4 ? 1 : 0;
    in.append(test_.board->clockLevels(last, out.get(i) ? 1 : 0, 1) != 0);
    if (last == 1) test_.board->clockLevels(0b010, 0, 3);  // Pause-DR, Exit2-DR, Shift-DR
  }
  BitVector answer;
  for (std::size_t i = in.size() - 17; i < in.size() - 1; ++i) answer.append(in.get(i));
  BitVector expected;
  for (const int byte : {0x5A, 0xC3})
    for (int i = 7; i >= 0; --i) expected.append((byte >> i & 1) != 0);
  EXPECT_EQ(answer.binary(), expected.binary());
}

TEST_F(SpiFlashBoard, ProgramsAndReadsBackWhatWasWritten) {
  constexpr std::size_t size = std::size_t{256} * 1024;
  const Bytes content = randomBits(size * 8, 3).bytes();
  for (std::size_t place = 0; place < size; place += 256) {
    Bytes page = {0x02, static_cast<std::uint8_t>(place >> 16), static_cast<std::uint8_t>(place >> 8), 0};
    page.insert(page.end(), content.begin() + static_cast<std::ptrdiff_t>(place),
                content.begin() + static_cast<std::ptrdiff_t>(place + 256));
    write(page, 0.001);
  }
  EXPECT_TRUE(read({0x03, 0, 0, 0}, size) == content);
  EXPECT_TRUE(read({0x0B, 0, 0, 0, 0}, size) == content);
}

TEST_F(SpiFlashBoard, APollWithinOneScanSeesTheTimePass) {
  write({0x02, 0, 0, 0, 0}, 0);
  // A page takes 50 microseconds, that is 62 bytes at 10 MHz, some of which the scans around take.
  const Bytes answers = read({0x05}, 200);
  const auto ready = std::find(answers.begin(), answers.end(), 0);
  EXPECT_GT(ready - answers.begin(), 40);
  EXPECT_LT(ready - answers.begin(), 63);
  EXPECT_EQ(std::count(ready, answers.end(), 0), answers.end() - ready);
}
