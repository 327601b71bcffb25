#include "bench/virtual_line.h"

#include <gmock/gmock.h>

#include <memory>
#include <utility>
#include <vector>

namespace tendril {
namespace {

using testing::AnyOf;
using testing::Contains;
using testing::ElementsAre;
using testing::Not;
using testing::Pair;

using TimedBytes = std::vector<std::pair<std::uint8_t, std::uint64_t>>;

// Notes what it hears and says `answer` when it hears 0x88.
class ScriptedUnit : public LineUnit {
 public:
  explicit ScriptedUnit(const Bytes& answer = {}, std::uint64_t delay_us = 1000)
      : answer_(answer), delay_us_(delay_us) {}

  std::vector<Transmission> Hear(std::uint8_t byte, std::uint64_t at_us) override {
    heard.emplace_back(byte, at_us);
    if (answer_.empty() || byte != 0x88) return {};
    return {{.start_us = at_us + delay_us_, .bytes = answer_}};
  }

  TimedBytes heard;

 private:
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
  // A new line with its driver on, these units and one that only listens.
  void UseLine(const VirtualLineOptions& options, std::initializer_list<ScriptedUnit*> units = {}) {
    line = std::make_unique<VirtualLine>(options);
    line->SetProgramHandler(
        [this](std::uint8_t byte, std::uint64_t at_us) { arrived.emplace_back(byte, at_us); });
    line->SetDriver(true, 0);
    for (ScriptedUnit* unit : units) line->Attach(*unit);
    line->Attach(listener);
    arrived.clear();
    listener.heard.clear();
  }
  void Write(const Bytes& bytes, std::uint64_t now_us) { line->ProgramWrites(bytes, now_us); }

  std::unique_ptr<VirtualLine> line;
  ScriptedUnit listener;
  TimedBytes arrived;
};

TEST_F(VirtualLineTest, Bytes_ArriveEverywhereAtTheEndOfTheirTenBits) {
  UseLine({});
  Write({0x11, 0x22, 0x33}, 10'000);
  EXPECT_EQ(line->PendingFromProgram(10'000), 2u);  // the first is on its way
  line->AdvanceTo(20'000);
  EXPECT_THAT(arrived, ElementsAre(Pair(0x11, 10'521), Pair(0x22, 11'042), Pair(0x33, 11'563)));
  EXPECT_EQ(listener.heard, arrived);
  EXPECT_EQ(line->NextEventUs(), std::nullopt);

  Write(Bytes(1920, 0x55), 1'000'000);
  line->AdvanceTo(3'000'000);
  EXPECT_EQ(arrived.back().second, 2'000'000u) << "a long run drifts";
}

TEST_F(VirtualLineTest, OtherSpeed_MakesGarbageOfWhatTheOtherEndHears) {
  ScriptedUnit unit({0xFE, 0x30, 0});
  UseLine({.driver_follows_rts = false}, {&unit});
  Write({0x88}, 0);
  line->AdvanceTo(600);
  line->SetProgramBaud(9600, 600);
  line->AdvanceTo(10'000);
  Write({0x22}, 10'000);
  line->AdvanceTo(20'000);
  EXPECT_THAT(Values(arrived), ElementsAre(0x88, Not(0xFE), Not(0x30), Not(0), 0x22));
  EXPECT_EQ(arrived.back().second, 11'042u);  // twice as long, and its own echo whole
  EXPECT_NE(listener.heard.back().first, 0x22);
}

TEST_F(VirtualLineTest, Driver_KeepsTheUnitFromBeingHeardWhileRtsIsUp) {
  const Bytes reply = {0, 0, 0xFE, 0x30, 10, 0};
  const struct {
    VirtualLineOptions options;
    std::uint64_t released_us;  // the reply runs from 1521 on
    std::size_t garbled;
  } cases[] = {
      {{}, 700, 0},
      {{}, 30'000, 4},
      {{}, 2'100, 0},                // within the second pad, which is lost as well
      {{.echo = false}, 30'000, 0},  // the adapter's own doing
  };
  for (const auto& each : cases) {
    SCOPED_TRACE(each.released_us);
    ScriptedUnit unit(reply);
    UseLine(each.options, {&unit});
    Write({0x88}, 0);
    line->AdvanceTo(600);
    arrived.clear();
    line->AdvanceTo(each.released_us);
    line->SetDriver(false, each.released_us);
    line->AdvanceTo(40'000);
    ASSERT_GE(arrived.size(), 4u);
    const Bytes heard = Values(TimedBytes(arrived.end() - 4, arrived.end()));
    if (each.garbled == 0) {
      EXPECT_EQ(heard, Bytes(reply.end() - 4, reply.end()));
    } else {
      EXPECT_THAT(heard, Not(Contains(AnyOf(0x00, 0xFE, 10))));
    }
    EXPECT_EQ(line->counters().garbled_bytes, each.garbled);
  }
}

TEST_F(VirtualLineTest, Driver_ReleasedTooEarly_CutsWhatTheProgramSends) {
  UseLine({});
  Write({1, 2, 3}, 0);
  line->SetDriver(false, 600);
  line->AdvanceTo(10'000);
  ASSERT_EQ(listener.heard.size(), 2u);
  EXPECT_EQ(listener.heard[0].first, 1);
  EXPECT_NE(listener.heard[1].first, 2);
  EXPECT_EQ(line->counters().garbled_bytes, 1u);
  EXPECT_EQ(line->counters().undriven_bytes, 1u);
}

TEST_F(VirtualLineTest, TwoUnitsAtOnce_GarbleEachOther) {
  ScriptedUnit one({0xFE, 0x30, 10, 0});
  ScriptedUnit two({0xFE, 0x30, 10, 0}, 1300);
  UseLine({.driver_follows_rts = false}, {&one, &two});
  Write({0x88}, 0);
  line->AdvanceTo(600);
  arrived.clear();
  line->AdvanceTo(20'000);
  EXPECT_EQ(arrived.size(), 4u);  // one byte after the other, however many talk
  EXPECT_THAT(Values(arrived), Not(Contains(AnyOf(0x00, 0xFE, 10))));
  EXPECT_EQ(line->counters().garbled_bytes, 8u);
}

TEST_F(VirtualLineTest, ProgramTalksIntoReply_GarblesItUnlessOnlyPadsSuffer) {
  ScriptedUnit unit({0xFE, 0x30, 10, 0});
  UseLine({.driver_follows_rts = false}, {&unit});
  Write({0x88}, 0);
  line->AdvanceTo(600);
  Write({0x11, 0x12}, 2'200);  // within the second byte of the reply
  line->AdvanceTo(20'000);
  EXPECT_EQ(line->counters().garbled_bytes, 5u);
  EXPECT_THAT(arrived[1], Pair(0xFE, 2'042));
  EXPECT_THAT(Values(listener.heard), Not(Contains(AnyOf(0x11, 0x12, 0x30, 10))));
  EXPECT_THAT(unit.heard, ElementsAre(Pair(0x88, 521)));  // deaf while it talks

  ScriptedUnit padding({0, 0, 0, 0xFE, 0});
  UseLine({.driver_follows_rts = false}, {&padding});
  Write({0x88}, 0);
  Write({0x11}, 1'600);
  line->AdvanceTo(20'000);
  EXPECT_EQ(Values(listener.heard), (Bytes{0x88, 0x11, 0, 0xFE, 0}));
  EXPECT_EQ(line->counters().garbled_bytes, 0u);
}

}  // namespace
}  // namespace tendril
