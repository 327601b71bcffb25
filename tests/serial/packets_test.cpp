#include "serial/packets.h"

#include <gtest/gtest.h>

#include <array>
#include <vector>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

TEST(Packets, Circuits_TakeTwoBytesFrom64AndLowBitsFirst) {
  struct Case {
    std::int16_t circuit;
    Bytes bytes;
  };
  for (const Case& c : std::vector<Case>{{0, {0x80}},
                                         {63, {0xBF}},
                                         {64, {0xC0, 0x81}},
                                         {129, {0xC1, 0x82}},
                                         {8191, {0xFF, 0xFF}},
                                         {10000, {0xFF, 0xFF}}}) {
    EXPECT_EQ(EncodeCircuit(c.circuit), c.bytes) << c.circuit;
  }
  EXPECT_THROW(EncodeCircuit(-1), RuntimeError);
}

TEST(Packets, Intensities_AreNeverZeroAndClampAtFull) {
  struct Case {
    std::uint8_t percent, byte;
  };
  for (const Case& c : std::vector<Case>{{0, 0xF0},
                                         {1, 0xE2},
                                         {50, 0x80},
                                         {99, 0x1E},
                                         {100, 0x01},
                                         {101, 0x01},
                                         {254, 0x01},
                                         {255, 0xFF}}) {
    EXPECT_EQ(EncodeIntensity(c.percent), c.byte) << int{c.percent};
  }
}

TEST(Packets, FadeRate_RoundsHalfToEvenAndNeverHoldsAZeroByte) {
  struct Case {
    std::uint8_t from, to, time, high, low;
  };
  for (const Case& c : std::vector<Case>{
           {0xF0, 0xF0, 10, 0xC0, 0x01},  // no change: both bytes are zero, both are marked
           {0xF0, 0x01, 1, 0x13, 0xEB},   // 239 * 256 / 12 = 5098.67
           {0x01, 0xF0, 1, 0x13, 0xEB},   // the direction does not matter
           {3, 0, 64, 0x80, 0x01},        // exactly 1
           {9, 0, 128, 0x80, 0x02},       // 1.5 goes to 2 ...
           {15, 0, 128, 0x80, 0x02},      // ... and 2.5 as well
           {12, 0, 1, 0x41, 0x01},        // 256: a low byte of zero is marked in the high one
       }) {
    const FadeRate rate = EncodeFadeRate(c.from, c.to, c.time);
    EXPECT_EQ(rate.high, c.high) << int{c.from} << " " << int{c.time};
    EXPECT_EQ(rate.low, c.low) << int{c.from} << " " << int{c.time};
  }
  EXPECT_THROW(EncodeFadeRate(1, 2, 0), RuntimeError);
}

TEST(Packets, Checksum_BringsTheSumToZeroOrIsMarked) {
  EXPECT_EQ(UnlockPacket(5), (Bytes{0, 5, 0x8A, 0x56, 0}));
  EXPECT_EQ(HeartbeatPacket(), (Bytes{0, 0xFF, 0x81, 0x56, 0}));
  EXPECT_EQ(SetAddressPacket(5, 7), (Bytes{0, 5, 0x0F, 7, 7, 7, 0x41, 0}));
  // 0xAA + 0x56 is 0 already: two marks instead of a checksum of zero.
  EXPECT_EQ(BuildChecksummedPacket(1, 0x0A, std::array<std::uint8_t, 1>{0x56}),
            (Bytes{0, 1, 0x0A, 0x56, 0x80, 0x80, 0}));
}

}  // namespace
}  // namespace tendril
