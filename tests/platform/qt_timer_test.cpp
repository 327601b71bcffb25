#include "platform/qt/qt_timer.h"

#include <gmock/gmock.h>

#include "platform/runtime_error.h"
#include "platform/steady_clock.h"
#include "platform/wait_for.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;

class QtTimerTest : public testing::Test {
 protected:
  std::unique_ptr<Timer> Start(std::int32_t ms, std::function<void()> on_tick) {
    auto timer = factory_.CreateTimer(std::move(on_tick));
    timer->SetInterval(ms);
    timer->SetEnabled(true);
    return timer;
  }

  std::vector<std::string> faults_;
  QtTimerFactory factory_{[this](const std::string& fault) { faults_.push_back(fault); }};
};

TEST_F(QtTimerTest, Tick_ComesEachPeriodAndNeverEarly) {
  const SteadyClock clock;
  std::vector<std::uint32_t> ticks;
  const std::uint32_t start = clock.NowMs();
  const auto timer = Start(300, [&] { ticks.push_back(clock.NowMs() - start); });
  ASSERT_TRUE(WaitFor([&] { return ticks.size() == 2; }));
  EXPECT_GE(ticks[0], 300u);
  EXPECT_GE(ticks[1], 600u);
}

TEST_F(QtTimerTest, IntervalZero_NeverTicks) {
  int ticks = 0;
  const auto timer = Start(0, [&] { ++ticks; });
  RunFor(30);
  EXPECT_EQ(ticks, 0);
  timer->SetInterval(1);
  EXPECT_TRUE(WaitFor([&] { return ticks > 0; })) << "it was enabled all the time";
}

TEST_F(QtTimerTest, SettingAgain_BeginsThePeriodAnew) {
  int ticks = 0;
  const auto timer = Start(200, [&] { ++ticks; });
  for (int i = 0; i < 20; ++i) {
    RunFor(20);
    i % 2 == 0 ? timer->SetInterval(200) : timer->SetEnabled(true);
  }
  EXPECT_EQ(ticks, 0);
  EXPECT_TRUE(WaitFor([&] { return ticks == 1; }));
}

TEST_F(QtTimerTest, EventLoopInsideATick_OnlyOtherTimersTick) {
  int depth = 0;
  int deepest = 0;
  int others = 0;
  const auto other = Start(1, [&] { ++others; });
  std::unique_ptr<Timer> timer;
  timer = Start(1, [&] {
    deepest = std::max(deepest, ++depth);
    timer->SetInterval(1);  // a new period does not lift the ban
    const int before = others;
    EXPECT_TRUE(WaitFor([&] { return others >= before + 5; }));
    --depth;
  });
  EXPECT_TRUE(WaitFor([&] { return others >= 20; }));
  EXPECT_EQ(deepest, 1);
}

TEST_F(QtTimerTest, TimerDestroyedByItsOwnTick_IsGone) {  // as when a window closes under a box
  int ticks = 0;
  std::unique_ptr<Timer> timer;
  timer = Start(1, [&] {
    timer.reset();
    ++ticks;
  });
  RunFor(30);
  EXPECT_EQ(ticks, 1);
}

TEST_F(QtTimerTest, FailureInATick_IsShownOnceAndTheTimerStops) {
  const auto failing = Start(1, [] { throw RuntimeError(kErrDivisionByZero, "Division by zero"); });
  EXPECT_TRUE(WaitFor([&] { return !faults_.empty(); }));
  RunFor(30);
  EXPECT_THAT(faults_, ElementsAre("Division by zero"));
  EXPECT_FALSE(failing->Enabled());
}

}  // namespace
}  // namespace tendril::test
