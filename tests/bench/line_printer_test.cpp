#include "bench/line_printer.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <vector>

namespace tendril {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

class LinePrinterTest : public testing::Test {
 protected:
  void Note(LineSide from, const Bytes& bytes, std::uint64_t start_us, bool garbled = false) {
    for (const std::uint8_t byte : bytes) {
      printer.Note({.from = from, .value = byte, .garbled = garbled, .at_us = start_us += 521});
    }
  }

  std::vector<std::string> printed;
  LinePrinter printer{[this](const std::string& line) { printed.push_back(line); }};
};

TEST_F(LinePrinterTest, Packets_GetALineEach) {
  Note(LineSide::kProgram, {0, 1, 0x8A, 0x56, 0, 0, 1, 0x88, 0x30, 0x2D, 0}, 1'000'000);
  Note(LineSide::kUnit, {0, 0, 0xFE, 0x30, 1, 10, 0}, 1'010'000);
  Note(LineSide::kProgram, {0, 0}, 1'020'000);
  Note(LineSide::kProgram, {0, 0xFF, 0x81, 0x56, 0}, 2'000'000);  // long after the zero bytes
  Note(LineSide::kUnit, {0x11, 0x12}, 3'000'000, true);
  printer.Flush();
  printer.Flush();
  EXPECT_THAT(
      printed,
      ElementsAre(
          "    1.002605  program  00 01 8A 56 00                                   unlock unit 01",
          "    1.005731  program  00 01 88 30 2D 00                                poll unit 01, kind '0'",
          "    1.013647  unit     00 00 FE 30 01 0A 00                             reply to '0': "
          "acknowledged",
          "    1.021042  program  00 00                                            2 zero bytes",
          "    2.002605  program  00 FF 81 56 00                                   heartbeat to all units",
          "    3.001042  unit     11 12                                            noise (garbled)"));
}

TEST_F(LinePrinterTest, FloodsAndHalfPackets_ArePrintedToo) {
  Note(LineSide::kUnit, Bytes(5000, 0x11), 0);
  for (const Bytes& cut_short :
       {Bytes{0, 5, 0}, Bytes{0, 5, 0x88, 0}, Bytes{0, 5, 0x0A, 17, 0}, Bytes{5, 0x0F, 0}}) {
    Note(LineSide::kProgram, cut_short, 1'000'000);
  }
  Note(LineSide::kUnit, {0xFE, 0x30, 1, 0, 0xFE, 0x6E, 0}, 2'000'000);
  ASSERT_EQ(printed.size(), 7u);
  EXPECT_LT(printed[0].size(), 200u);
  EXPECT_THAT(printed[0], HasSubstr("(5000 bytes)  noise"));
  EXPECT_THAT(printed[1], HasSubstr("no packet"));
  EXPECT_THAT(printed[2], HasSubstr("poll unit 05, too short"));
  EXPECT_THAT(printed[3], HasSubstr("set option of unit 05, too short"));
  EXPECT_THAT(printed[4], HasSubstr("set ID of unit 05, too short"));
  EXPECT_THAT(printed[5], HasSubstr("reply to '0': 1 data bytes"));
  EXPECT_THAT(printed[6], HasSubstr("reply to 'n': 0 data bytes"));
}

}  // namespace
}  // namespace tendril
