#include "bench/virtual_line.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <utility>
#include <vector>

namespace tendril {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

using TimedBytes = std::vector<std::pair<std::uint8_t, std::uint64_t>>;

// Notes what it hears and says `answer` when it hears `cue`.
class ScriptedUnit : public LineUnit {
 public:
  explicit ScriptedUnit(std::uint8_t cue = 0, const Bytes& answer = {}, std::uint64_t delay_us = 1000)
      : cue_(cue), answer_(answer), delay_us_(delay_us) {}

  std::vector<Transmission> Hear(std::uint8_t byte, std::uint64_t at_us) override {
    heard.emplace_back(byte, at_us);
    if (answer_.empty() || byte != cue_) return {};
    return {{.start_us = at_us + delay_us_, .bytes = answer_}};
  }

  TimedBytes heard;

 private:
  std::uint8_t cue_;
  Bytes answer_;
  std::uint64_t delay_us_;
};

Bytes Values(const TimedBytes& timed) {
  Bytes values;
  for (const auto& [value, at_us] : timed) values.push_back(value);
  return values;
}

class VirtualLineTest : public testing::Test {
 protected:
  void UseLine(const VirtualLineOptions& options) {
    line = std::make_unique<VirtualLine>(options);
    line->SetProgramHandler(
        [this](std::uint8_t byte, std::uint64_t at_us) { arrived.emplace_back(byte, at_us); });
    line->SetDriver(true, 0);
  }
  void Write(const Bytes& bytes, std::uint64_t now_us) { line->ProgramWrites(bytes, now_us); }

  std::unique_ptr<VirtualLine> line;
  TimedBytes arrived;
};

TEST_F(VirtualLineTest, Bytes_ArriveEverywhereAtTheEndOfTheirTenBits) {
  UseLine({});
  ScriptedUnit one;
  ScriptedUnit two;
  line->Attach(one);
  line->Attach(two);
  Write({0x11, 0x22, 0x33}, 10'000);
  EXPECT_EQ(line->PendingFromProgram(10'000), 2u);  // the first is on its way
  EXPECT_EQ(line->NextEventUs(), 10'521u);
  line->AdvanceTo(10'520);
  EXPECT_THAT(arrived, IsEmpty());
  line->AdvanceTo(20'000);
  EXPECT_THAT(arrived, ElementsAre(Pair(0x11, 10'521), Pair(0x22, 11'042), Pair(0x33, 11'563)));
  EXPECT_EQ(one.heard, arrived);
  EXPECT_EQ(two.heard, arrived);
  EXPECT_EQ(line->PendingFromProgram(20'000), 0u);
  EXPECT_EQ(line->NextEventUs(), std::nullopt);
}

TEST_F(VirtualLineTest, LongRun_DoesNotDrift) {
  UseLine({});
  for (int i = 0; i < 192; ++i) Write(Bytes(10, 0x55), static_cast<std::uint64_t>(i));
  line->AdvanceTo(2'000'000);
  ASSERT_EQ(arrived.size(), 1920u);
  EXPECT_EQ(arrived.back().second, 1'000'000u);
}

TEST_F(VirtualLineTest, Echo_FollowsTheAdapter) {
  const struct {
    VirtualLineOptions options;
    Bytes expected;
  } cases[] = {
      {{}, {1, 2, 3, 4}},
      {{.echo = false}, {}},
      {{.echo_loses_every = 2}, {1, 3}},
  };
  for (const auto& each : cases) {
    UseLine(each.options);
    ScriptedUnit unit;
    line->Attach(unit);
    arrived.clear();
    Write({1, 2, 3, 4}, 0);
    line->AdvanceTo(10'000);
    EXPECT_EQ(Values(arrived), each.expected);
    EXPECT_EQ(Values(unit.heard), (Bytes{1, 2, 3, 4}));
  }
}

TEST_F(VirtualLineTest, Driver_KeepsTheUnitFromBeingHeardWhileRtsIsUp) {
  const struct {
    VirtualLineOptions options;
    bool rts;
    bool gets_through;
  } cases[] = {
      {{}, false, true},
      {{}, true, false},
      {{.driver_follows_rts = false}, true, true},
      {{.echo = false}, true, true},  // the adapter's own doing
  };
  const Bytes reply = {0, 0, 0xFE, 0x30, 10, 0};
  for (const auto& each : cases) {
    UseLine(each.options);
    ScriptedUnit unit(0x88, reply);
    line->Attach(unit);
    Write({0x88}, 0);
    line->AdvanceTo(600);
    line->SetDriver(each.rts, 700);
    arrived.clear();
    line->AdvanceTo(20'000);
    if (each.gets_through) {
      EXPECT_EQ(Values(arrived), reply);
      EXPECT_EQ(line->counters().garbled_bytes, 0u);
      EXPECT_EQ(line->counters().lost_pads, 0u);
    } else {
      EXPECT_EQ(arrived.size(), 4u);
      EXPECT_THAT(Values(arrived), testing::Not(testing::Contains(testing::AnyOf(0x00, 0xFE, 10))));
      EXPECT_EQ(line->counters().garbled_bytes, 4u);
      EXPECT_EQ(line->counters().lost_pads, 2u);
    }
  }
}

TEST_F(VirtualLineTest, Driver_ReleasedInTheMiddleOfTheReply_LetsTheRestThrough) {
  UseLine({});
  ScriptedUnit unit(0x88, {0, 0, 0, 0xFE, 0x30, 0});
  line->Attach(unit);
  Write({0x88}, 0);
  line->AdvanceTo(1'521);
  line->SetDriver(false, 2'100);  // within the second pad, which is lost as well
  arrived.clear();
  line->AdvanceTo(20'000);
  EXPECT_EQ(Values(arrived), (Bytes{0, 0xFE, 0x30, 0}));
  EXPECT_EQ(line->counters().lost_pads, 2u);
  EXPECT_EQ(line->counters().garbled_bytes, 0u);
}

TEST_F(VirtualLineTest, Driver_OffOrReleasedTooEarly_CutsWhatTheProgramSends) {
  UseLine({});
  ScriptedUnit unit;
  line->Attach(unit);
  Write({1, 2, 3}, 0);
  line->SetDriver(false, 600);
  line->AdvanceTo(10'000);
  ASSERT_EQ(unit.heard.size(), 2u);
  EXPECT_EQ(unit.heard[0].first, 1);
  EXPECT_NE(unit.heard[1].first, 2);
  EXPECT_EQ(Values(arrived), Values(unit.heard));
  EXPECT_EQ(line->counters().garbled_bytes, 1u);
  EXPECT_EQ(line->counters().undriven_bytes, 1u);
}

TEST_F(VirtualLineTest, Reply_ReachesProgramAndOtherUnits) {
  UseLine({});
  ScriptedUnit speaker(0x88, {0xFE, 0x30, 0});
  ScriptedUnit listener;
  line->Attach(speaker);
  line->Attach(listener);
  Write({0x88}, 0);
  line->SetDriver(false, 600);
  line->AdvanceTo(10'000);
  const TimedBytes expected = {{0x88, 521}, {0xFE, 2'042}, {0x30, 2'563}, {0, 3'084}};
  EXPECT_EQ(arrived, expected);
  EXPECT_EQ(listener.heard, expected);
  EXPECT_THAT(speaker.heard, ElementsAre(Pair(0x88, 521)));
}

TEST_F(VirtualLineTest, TwoUnitsAtOnce_GarbleEachOther) {
  for (const std::uint64_t head_start_us : {0u, 300u, 521u}) {
    UseLine({.driver_follows_rts = false});
    ScriptedUnit one(0x88, {0xFE, 0x30, 10, 0}, 1000);
    ScriptedUnit two(0x88, {0xFE, 0x30, 10, 0}, 1000 + head_start_us);
    ScriptedUnit listener;
    line->Attach(one);
    line->Attach(two);
    line->Attach(listener);
    Write({0x88}, 0);
    line->AdvanceTo(600);
    arrived.clear();
    line->AdvanceTo(20'000);
    // One byte after the other alone can be heard, however many talk.
    EXPECT_EQ(arrived.size(), head_start_us == 521 ? 5u : 4u);
    if (head_start_us == 521) {
      EXPECT_EQ(arrived.front().first, 0xFE);  // out before the other began
      EXPECT_EQ(arrived.back().first, 0);
      EXPECT_EQ(line->counters().garbled_bytes, 6u);
    } else {
      EXPECT_THAT(Values(arrived), testing::Not(testing::Contains(testing::AnyOf(0x00, 0xFE, 10))));
      EXPECT_EQ(line->counters().garbled_bytes, 8u);
    }
    EXPECT_EQ(listener.heard.size(), 1 + arrived.size());
    EXPECT_EQ(line->counters().program_talked_into_reply, 0u);
  }
}

TEST_F(VirtualLineTest, ProgramTalksIntoReply_GarblesBothAndIsNoticed) {
  UseLine({.driver_follows_rts = false});
  ScriptedUnit unit(0x88, {0xFE, 0x30, 10, 0}, 1000);
  ScriptedUnit listener;
  line->Attach(unit);
  line->Attach(listener);
  Write({0x88}, 0);
  line->AdvanceTo(600);
  Write({0x11, 0x12}, 2'200);  // within the second byte of the reply
  line->AdvanceTo(20'000);
  EXPECT_EQ(line->counters().program_talked_into_reply, 2u);
  EXPECT_EQ(line->counters().garbled_bytes, 5u);
  EXPECT_EQ(arrived[1].first, 0xFE);
  EXPECT_THAT(Values(listener.heard), testing::Not(testing::Contains(testing::AnyOf(0x11, 0x12, 0x30, 10))));
  EXPECT_THAT(unit.heard, ElementsAre(Pair(0x88, 521)));  // deaf while it talks
}

TEST_F(VirtualLineTest, ProgramTalksIntoPads_LosesPadsOnly) {
  UseLine({.driver_follows_rts = false});
  ScriptedUnit unit(0x88, {0, 0, 0, 0xFE, 0}, 1000);
  ScriptedUnit listener;
  line->Attach(unit);
  line->Attach(listener);
  Write({0x88}, 0);
  Write({0x11}, 1'600);
  line->AdvanceTo(20'000);
  EXPECT_EQ(Values(listener.heard), (Bytes{0x88, 0x11, 0, 0xFE, 0}));
  EXPECT_EQ(line->counters().lost_pads, 2u);
  EXPECT_EQ(line->counters().garbled_bytes, 0u);
  EXPECT_EQ(line->counters().program_talked_into_reply, 0u);
}

}  // namespace
}  // namespace tendril
