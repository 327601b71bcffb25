#include "platform/qt/qt_timer.h"

#include <gmock/gmock.h>

#include "platform/runtime_error.h"
#include "platform/steady_clock.h"
#include "platform/wait_for.h"

namespace tendril::test {
namespace {

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
  EXPECT_TRUE(WaitFor([&] { return ticks > 0; })) << "it is still enabled";
}

TEST_F(QtTimerTest, SettingAgain_StartsANewPeriod) {
  int ticks = 0;
  const auto timer = Start(200, [&] { ++ticks; });
  for (int i = 0; i < 20; ++i) {
    RunFor(20);
    i % 2 == 0 ? timer->SetInterval(200) : timer->SetEnabled(true);
  }
  EXPECT_EQ(ticks, 0);
}

TEST_F(QtTimerTest, EventLoopInsideATick_OnlyOtherTimersTick) {
  int depth = 0, deepest = 0, others = 0;
  const auto other = Start(1, [&] { ++others; });
  std::unique_ptr<Timer> timer;
  timer = Start(1, [&] {
    deepest = std::max(deepest, ++depth);
    timer->SetInterval(1);  // also in a new period
    const int before = others;
    EXPECT_TRUE(WaitFor([&] { return others >= before + 5; }));
    --depth;
  });
  EXPECT_TRUE(WaitFor([&] { return others >= 20; }));
  EXPECT_EQ(deepest, 1);
}

TEST_F(QtTimerTest, TickThatDestroysItsTimerOrFails_IsTheLast) {
  int ticks = 0;
  std::unique_ptr<Timer> timer;
  timer = Start(1, [&] {
    timer.reset();  // as when a window closes while a box is open
    ++ticks;
  });
  const auto failing = Start(1, [] { throw RuntimeError(kErrDivisionByZero, "Division by zero"); });
  RunFor(50);
  EXPECT_EQ(ticks, 1);
  EXPECT_THAT(faults_, testing::ElementsAre("Division by zero"));
  EXPECT_FALSE(failing->Enabled());
}

}  // namespace
}  // namespace tendril::test
