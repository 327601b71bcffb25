#include "bench/virtual_unit.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

constexpr PortOptionBytes kWritten = {0x9F, 0x01, 0xFF, 0x32, 0xFA, 0x3C, 0xF0, 0x78, 0x96};
const Bytes kUnlock5 = {0x00, 0x05, 0x8A, 0x56, 0x00};
const Bytes kWritePort3 = {0x00, 0x05, 0x0A, 0x11, 0x03, 0x9F, 0x01, 0xFF,
                           0x32, 0xFA, 0x3C, 0xF0, 0x78, 0x96, 0x3D, 0x00};
const Bytes kPollAck = {0x00, 0x05, 0x88, 0x30, 0x2D, 0x00};

// Feeds `packets` to the unit and returns the last thing that it said.
Bytes Say(VirtualUnit& unit, std::initializer_list<Bytes> packets) {
  Bytes said;
  std::uint64_t at_us = 0;
  for (const Bytes& packet : packets) {
    for (const std::uint8_t byte : packet) {
      for (const Transmission& answer : unit.Hear(byte, at_us += 521)) said = answer.bytes;
    }
  }
  return said;
}

TEST(VirtualUnit, Polls_AreAnsweredAndAcknowledgeOnce) {
  VirtualUnit unit(0x05);
  const Bytes accepted = {0, 0, 0, 0xFE, 0x30, 1, 10, 0};
  const Bytes nothing_new = {0, 0, 0, 0xFE, 0x30, 1, 1, 0};
  const struct {
    std::initializer_list<Bytes> packets;
    Bytes said;
  } cases[] = {{{{0, 0xFF, 0x88, 0x2B, 0x2D, 0}}, {0, 0, 0, 0xFE, 0x2B, 0x05, 0}},
               {{{0, 5, 0x88, 0x64, 0x2D, 0}}, {}},  // of a kind that it does not know
               {{kPollAck}, nothing_new},
               {{kUnlock5, kWritePort3, kPollAck}, accepted},
               {{kPollAck}, nothing_new}};
  for (const auto& [packets, said] : cases) EXPECT_EQ(Say(unit, packets), said);
  EXPECT_EQ(unit.PortOptions(3), kWritten);
  EXPECT_EQ(unit.PortOptions(4), kFreshPortOptions);
  EXPECT_EQ(unit.rejected_commands(), 0u);
}

TEST(VirtualUnit, Checksum_BothFormsCount) {
  const struct {
    Bytes packet;
    PortOptionBytes expected;
  } cases[] = {
      {kWritePort3, kWritten},
      // Body and AA add up to 0: the pair.
      {{0, 5, 0x0A, 17, 3, 1, 60, 240, 100, 200, 100, 200, 150, 39, 0x80, 0x80, 0},
       {1, 60, 240, 100, 200, 100, 200, 150, 39}},
      // A last option byte of 80 with a checksum of 80 looks like the pair and is none.
      {{0, 5, 0x0A, 17, 3, 1, 60, 240, 100, 200, 100, 200, 189, 0x80, 0x80, 0},
       {1, 60, 240, 100, 200, 100, 200, 189, 0x80}},
  };
  for (const auto& each : cases) {
    VirtualUnit unit(0x05);
    Say(unit, {kUnlock5, each.packet});
    EXPECT_EQ(unit.accepted_commands(), 1u);
    EXPECT_EQ(unit.PortOptions(3), each.expected);
  }
}

TEST(VirtualUnit, Rejections_ChangeNothing) {
  Bytes wrong_sum = kWritePort3;
  wrong_sum[8] ^= 1;
  const Bytes one_byte_missing = {0, 5, 0x0A, 17, 3, 1, 60, 240, 100, 200, 100, 200, 150, 39, 0};
  const Bytes port_9 = {0, 5, 0x0A, 17, 9, 1, 60, 240, 100, 200, 100, 200, 150, 150, 0x8B, 0};
  const Bytes unlike_ids = {0, 5, 0x0F, 7, 7, 8, 0x40, 0};
  const Bytes live_without_end = {0, 5, 0x0A, 17, 137, 4, 150, 1, 0x21, 0};
  const Bytes set_id_7 = {0, 5, 0x0F, 7, 7, 7, 0x41, 0};
  const Bytes zero_inside = {0, 5, 0x0A, 17, 0x89, 4, 0, 0xFF, 0xB9, 0};
  const struct {
    std::initializer_list<Bytes> packets;
    std::size_t accepted;
  } cases[] = {
      {{kWritePort3}, 0},
      {{kUnlock5, kPollAck, kWritePort3}, 0},
      {{{0, 5, 0x8A, 0x57, 0}}, 0},
      {{kUnlock5, wrong_sum}, 0},
      {{kUnlock5, one_byte_missing}, 0},
      {{kUnlock5, zero_inside}, 0},
      {{kUnlock5, port_9}, 0},
      {{kUnlock5, unlike_ids}, 0},
      {{kUnlock5, live_without_end}, 0},
      // An unlock serves one command, accepted or not.
      {{kUnlock5, set_id_7, {0, 7, 0x0F, 5, 5, 5, 0x47, 0}}, 1},
  };
  for (const auto& each : cases) {
    VirtualUnit unit(0x05);
    Say(unit, each.packets);
    EXPECT_EQ(unit.rejected_commands(), 1u);
    EXPECT_EQ(unit.accepted_commands(), each.accepted);
    EXPECT_EQ(unit.PortOptions(3), kFreshPortOptions);
  }
}

}  // namespace
}  // namespace tendril
