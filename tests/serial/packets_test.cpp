#include "serial/packets.h"

#include <gmock/gmock.h>

#include <array>

#include "platform/runtime_error.h"
#include "serial/light_packets.h"

namespace tendril {
namespace {

using testing::ElementsAre;

TEST(Packets, Checksum_BringsTheSumToZeroOrIsMarked) {
  EXPECT_EQ(BuildChecksummedPacket(1, 0x0A, {}), (Bytes{0, 1, 0x0A, 0x56, 0}));
  // 0xAA + 0x56 is 0 already: two marks instead of a checksum of zero.
  EXPECT_EQ(BuildChecksummedPacket(1, 0x0A, std::array<std::uint8_t, 1>{0x56}),
            (Bytes{0, 1, 0x0A, 0x56, 0x80, 0x80, 0}));
}

TEST(LightPackets, Circuits_TakeTwoBytesFrom64AndLowBitsFirst) {
  EXPECT_THAT(EncodeCircuit(63), ElementsAre(0xBF));
  EXPECT_THAT(EncodeCircuit(64), ElementsAre(0xC0, 0x81));
  EXPECT_THAT(EncodeCircuit(129), ElementsAre(0xC1, 0x82));
  EXPECT_THAT(EncodeCircuit(10000), ElementsAre(0xFF, 0xFF));
  EXPECT_THROW(EncodeCircuit(-1), RuntimeError);
}

TEST(LightPackets, Intensities_AreNeverZeroAndClampAtFull) {
  Bytes encoded;
  for (const std::uint8_t percent : Bytes{0, 1, 50, 99, 100, 101, 254, 255})
    encoded.push_back(EncodeIntensity(percent));
  EXPECT_THAT(encoded, ElementsAre(0xF0, 0xE2, 0x80, 0x1E, 0x01, 0x01, 0x01, 0xFF));
}

TEST(LightPackets, FadeRate_RoundsHalfToEvenAndNeverHoldsAZeroByte) {
  EXPECT_THAT(EncodeFadeRate(0xF0, 0xF0, 10), ElementsAre(0xC0, 0x01)) << "no change: both bytes are marked";
  EXPECT_THAT(EncodeFadeRate(0xF0, 0x01, 1), ElementsAre(0x13, 0xEB)) << "239 * 256 / 12 = 5098.67";
  EXPECT_THAT(EncodeFadeRate(0x01, 0xF0, 1), ElementsAre(0x13, 0xEB)) << "the direction does not matter";
  EXPECT_THAT(EncodeFadeRate(9, 0, 128), ElementsAre(0x80, 0x02)) << "1.5 goes to 2";
  EXPECT_THAT(EncodeFadeRate(15, 0, 128), ElementsAre(0x80, 0x02)) << "and 2.5 as well";
  EXPECT_THAT(EncodeFadeRate(12, 0, 1), ElementsAre(0x41, 0x01)) << "256: a low byte of zero is marked";
  EXPECT_THROW(EncodeFadeRate(1, 2, 0), RuntimeError);
}

}  // namespace
}  // namespace tendril
