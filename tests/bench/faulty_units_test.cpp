#include "bench/faulty_units.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

namespace tendril {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

std::vector<Transmission> Poll(VirtualUnit& unit, char kind, std::uint64_t at_us = 0) {
  std::vector<Transmission> said;
  for (const std::uint8_t byte : Bytes{0, unit.id(), 0x88, static_cast<std::uint8_t>(kind), 45, 0}) {
    said = unit.Hear(byte, at_us);
  }
  return said;
}

void SetId(VirtualUnit& unit, std::uint8_t id, std::uint64_t at_us) {
  const auto checksum = static_cast<std::uint8_t>(256 - (0xAA + 3 * id) % 256);
  for (const std::uint8_t byte :
       Bytes{0, unit.id(), 0x8A, 0x56, 0, unit.id(), 0x0F, id, id, id, checksum, 0}) {
    unit.Hear(byte, at_us);
  }
}

// The ports that `polls` configuration polls report; 0 for a reply that is too short.
std::vector<int> ReportedPorts(VirtualUnit& unit, int polls) {
  std::vector<int> ports;
  for (int i = 0; i < polls; ++i) {
    const Bytes reply = Poll(unit, 'n').at(0).bytes;
    const bool whole = reply.size() == 3 + 2 + 10 + 1;
    ports.push_back(whole ? reply[5] : 0);
  }
  return ports;
}

TEST(FaultyUnits, Replies_HaveTheOneFaultOfTheirName) {
  const struct {
    const char* fault;
    char kind;
    Bytes reply;
  } cases[] = {
      {"mute", '0', {}},
      {"wrong-answer", '0', {0, 0, 0, 0xFE, 0x30, 1, 11, 0}},
      {"locked", '0', {0, 0, 0, 0xFE, 0x30, 1, 1, 0}},
      {"stubborn", '0', {0, 0, 0, 0xFE, 0x30, 1, 10, 0}},
      {"wrong-address", '*', {0, 0, 0, 5, 0x2A, 5, 0}},
      {"unfinished", '*', {0, 0, 0, 0xFE, 0x2A, 5}},
      {"rambling", '*', {0, 0, 0, 0x11, 0x12, 0x13, 0x14, 0x15, 0, 0xFE, 0x2A, 5, 0}},
  };
  for (const auto& each : cases) {
    const auto unit = FindFaultKind(each.fault)->make(5);
    SetId(*unit, 5, 0);  // a command to acknowledge
    const auto said = Poll(*unit, each.kind);
    EXPECT_EQ(said.empty() ? Bytes{} : said[0].bytes, each.reply) << each.fault;
    EXPECT_EQ(unit->polls_heard(), 1u) << each.fault;
  }
}

TEST(FaultyUnits, DeafUnit_MissesEveryNthPoll) {
  DeafUnit deaf(5, 3);
  for (const std::size_t answers : {1u, 1u, 0u, 1u, 1u, 0u}) EXPECT_EQ(Poll(deaf, '*').size(), answers);
}

// The shortest time-out that a poll gets at 19200 baud is 86 ms from its first byte on: (38 + 45) bytes,
// twice.
TEST(FaultyUnits, SlowReplies_EndWithinOrBeyondTheTimeOut) {
  const auto reply_ends_us = [](VirtualUnit& unit, char kind) {
    VirtualLine line({.driver_follows_rts = false});
    line.Attach(unit);
    std::uint64_t last_us = 0;
    line.SetProgramHandler([&](std::uint8_t, std::uint64_t at_us) { last_us = at_us; });
    line.ProgramWrites(Bytes{0, 5, 0x88, static_cast<std::uint8_t>(kind), 45, 0}, 0);
    line.AdvanceTo(5'000'000);
    return last_us;
  };
  SlowUnit slow(5);
  TooSlowUnit too_slow(5);
  FloodingUnit flooding(5);
  EXPECT_LT(reply_ends_us(slow, 'n'), 80'000u);
  EXPECT_GT(reply_ends_us(slow, 'n'), 60'000u);
  EXPECT_GT(reply_ends_us(too_slow, '0'), 150'000u);
  EXPECT_GT(reply_ends_us(flooding, '0'), 2'500'000u);
}

TEST(FaultyUnits, ReportedPorts_FollowTheFault) {
  ScrambledUnit scrambled(5);
  EXPECT_THAT(ReportedPorts(scrambled, 8), testing::UnorderedElementsAre(1, 2, 3, 4, 5, 6, 7, 8));
  RepeatingUnit repeating(5);
  EXPECT_THAT(ReportedPorts(repeating, 6), ElementsAre(1, 1, 2, 2, 3, 3));
  MissingPortUnit missing(5);
  EXPECT_THAT(ReportedPorts(missing, 9), ElementsAre(1, 2, 3, 4, 6, 7, 8, 1, 2));
  StuckPortUnit stuck(5);
  EXPECT_THAT(ReportedPorts(stuck, 3), ElementsAre(3, 3, 3));
  NinthPortUnit ninth(5);
  EXPECT_THAT(ReportedPorts(ninth, 10), ElementsAre(1, 2, 3, 4, 5, 6, 7, 8, 9, 1));
  ShortReplyUnit short_reply(5);
  EXPECT_THAT(ReportedPorts(short_reply, 6), ElementsAre(1, 2, 0, 4, 5, 0));
}

TEST(FaultyUnits, NewIds_AreTakenLateOrNever) {
  RestartingUnit restarting(0xFF, 500'000);
  SetId(restarting, 7, 1'000'000);
  EXPECT_EQ(restarting.id(), 7);
  EXPECT_THAT(Poll(restarting, '+', 1'499'999), IsEmpty());
  EXPECT_EQ(Poll(restarting, '+', 1'500'000).size(), 1u);

  StubbornUnit stubborn(0xFF);
  SetId(stubborn, 7, 0);
  EXPECT_EQ(stubborn.id(), 0xFF);
}

TEST(FaultyUnits, Names_MakeTheirUnits) {
  for (const FaultKind& kind : FaultKinds()) {
    EXPECT_EQ(FindFaultKind(kind.name), &kind) << kind.name;
    EXPECT_EQ(kind.make(0x42)->id(), 0x42) << kind.name;
  }
  EXPECT_EQ(FindFaultKind("no-such-fault"), nullptr);
}

}  // namespace
}  // namespace tendril
