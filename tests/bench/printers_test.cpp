// What the bench prints of a line and of a connection, for the user to read.
#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <vector>

#include "bench/printers.h"

namespace tendril {
namespace {

constexpr std::size_t kBytesColumn = 23;
constexpr std::size_t kMeaningColumn = kBytesColumn + 49;

// What is printed of bytes that are one microsecond apart.
std::vector<std::string> Printed(LineSide from, const Bytes& bytes, bool garbled = false) {
  std::vector<std::string> lines;
  LinePrinter printer([&](const std::string& line) { lines.push_back(line); });
  std::uint64_t at_us = 1'284'000;
  for (const std::uint8_t byte : bytes) printer.Note({from, byte, garbled, ++at_us});
  printer.Flush();
  return lines;
}

TEST(LinePrinter, Packet_IsPrintedWithItsMeaning) {
  const struct {
    LineSide from;
    Bytes bytes;
    std::string_view meaning;
  } cases[] = {
      {LineSide::kProgram, {0, 1, 0x88, '0', 45, 0}, "poll unit 01, kind '0'"},
      {LineSide::kProgram, {0, 0xFF, 0x8A, 0x56, 0}, "unlock all units"},
      {LineSide::kProgram, {0, 1, 0x0F, 0x0A, 0x0A, 0x0A, 0x38, 0}, "set ID of unit 01 to 0A"},
      {LineSide::kProgram, {0, 1, 0x0A, 17, 3, 1, 60, 0}, "set options of port 3 of unit 01"},
      {LineSide::kProgram,
       {0, 1, 0x0A, 17, 137, 4, 150, 255, 1, 0},
       "live position of unit 01: port 3, 1500 µs"},
      {LineSide::kUnit, {0, 0xFE, '0', 1, 10, 0}, "reply to '0': acknowledged"},
      {LineSide::kUnit, {0, 0xFE, '0', 1, 1, 0}, "reply to '0': nothing accepted"},
      {LineSide::kUnit, {0xFE, 'n', 3, 1, 1, 1, 1, 1, 1, 1, 1, 1, 0}, "reply to 'n': options of port 3"},
      {LineSide::kUnit, {0xFE, '*', 5, 0}, "reply to '*': here is unit 05"},
      {LineSide::kUnit, {7, 7, 0}, "noise"},
  };
  for (const auto& each : cases) {
    const std::vector<std::string> lines = Printed(each.from, each.bytes);
    ASSERT_EQ(lines.size(), 1u) << each.meaning;
    EXPECT_EQ(lines[0].substr(kMeaningColumn), each.meaning);
  }
  EXPECT_EQ(
      Printed(LineSide::kUnit, {0, 0, 0, 0xFE, '0', 1, 10, 0}, true)[0],
      "    1.284008  unit     00 00 00 FE 30 01 0A 00                          reply to '0': acknowledged "
      "(garbled)");
  EXPECT_EQ(Printed(LineSide::kUnit, {0, 0, 0, 0, 0, 7, 0})[0].substr(kBytesColumn, 12), "5 x 00 07 00");
  EXPECT_NE(Printed(LineSide::kUnit, Bytes(60, 7))[0].find("07 07 ... (60 bytes)"), std::string::npos);
}

TEST(LinePrinter, Packets_EndWithAZeroASilenceOrTheOtherSide) {
  std::string lines;
  LinePrinter printer([&](const std::string& line) { lines += line.substr(kMeaningColumn) + "|"; });
  const auto note = [&](LineSide from, const Bytes& bytes, std::uint64_t at_us) {
    for (const std::uint8_t byte : bytes) printer.Note({from, byte, false, at_us++});
  };
  note(LineSide::kProgram, {0, 5, 0x8A, 0x56, 0, 0, 5, 0x8A, 0x56, 0, 0, 5}, 0);
  note(LineSide::kUnit, {0}, 20);
  note(LineSide::kUnit, {0, 7}, 5'000);
  note(LineSide::kUnit, {7, 0}, 10'000);  // a packet goes on after a silence
  printer.Flush();
  EXPECT_EQ(lines, "unlock unit 05|unlock unit 05|no packet|1 zero byte|noise|");
}

TEST(PanelPrinter, Bytes_ArePrintedWithTheirMeaning) {
  using namespace std::string_literals;
  const struct {
    PanelSide from;
    std::string bytes, meaning;
  } cases[] = {
      {PanelSide::kProgram, "I000004N\1yx", "request 0: here is \"N.yx\""},
      {PanelSide::kProgram, "C100002\3\0"s, "request 1: give up Comm 3"},
      {PanelSide::kProgram, "L300004\1\0\0\0"s, "request 3: lighting data, 4 bytes"},
      {PanelSide::kProgram, "C500009C100002\3\0"s,
       "request 5: repeats 1 inside, to no effect: give up Comm 3"},
      {PanelSide::kPanel, "1100000", "reply to 1: done"},
      {PanelSide::kPanel, "2100000", "reply to 1: neither done nor refused"},
      {PanelSide::kPanel, "1", "1 byte"},
  };
  for (const auto& each : cases) {
    const Bytes bytes(each.bytes.begin(), each.bytes.end());
    EXPECT_EQ(PrintPanelBytes(1, each.from, bytes).substr(kMeaningColumn), each.meaning);
  }
  EXPECT_EQ(PrintPanelBytes(3'284'375, PanelSide::kPanel, Bytes{'1', '1'}),
            "    3.284375  panel    31 31                                            2 bytes");
}

}  // namespace
}  // namespace tendril
