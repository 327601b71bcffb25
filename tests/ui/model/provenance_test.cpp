#include "ui/model/provenance.h"

#include <gtest/gtest.h>

#include "ui/model/readings.h"

namespace tendril {
namespace {

TEST(Provenance, NamesTheOriginAndWhatChangedSince) {
  ChannelTable working;
  Provenance provenance(working);
  provenance.FromPreset("Medium Range (default)");
  EXPECT_EQ(provenance.Sentence(), "Preset Medium Range (default)");
  working.At(2).PowerUPOpt = kPowerUpNeutral;
  EXPECT_EQ(provenance.Sentence(), "Preset Medium Range (default); channel 3 changed since");
  working.At(0).VirtualStops[1] += 10;
  working.At(7).PortType = kPortPwm;
  EXPECT_EQ(provenance.Sentence(), "Preset Medium Range (default); channels 1, 3 and 8 changed since");
  working.At(0).VirtualStops[1] -= 10;
  EXPECT_EQ(provenance.Sentence(), "Preset Medium Range (default); channels 3 and 8 changed since");
  provenance.SentTo(0x0A, "14:02");
  EXPECT_EQ(provenance.Sentence(), "Sent to 0A at 14:02");
  provenance.ReadFrom(0x01, "2026-11-22T14:05:31+01:00");
  EXPECT_EQ(provenance.Sentence(), "Read from 01 at 14:05");
  EXPECT_EQ(provenance.UnchangedReading()->time, "2026-11-22T14:05:31+01:00");
}

TEST(Readings, SendToEveryUnit_KeepsTheWayBackOfEach) {
  Readings readings;
  readings.Keep(1, 0x01, {}, "14:02");
  readings.Keep(2, 0x01, {}, "14:03");
  readings.SendBegins(1, 0xFF);
  readings.Keep(1, 0x01, {}, "14:09");
  readings.Keep(2, 0x01, {}, "14:09");
  EXPECT_EQ(readings.WayBack(1, 0x01)->time, "14:02");
  EXPECT_EQ(readings.WayBack(2, 0x01)->time, "14:09") << "of another port";
}

}  // namespace
}  // namespace tendril
