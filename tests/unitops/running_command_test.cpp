#include "unitops/running_command.h"

#include "command_fixture.h"

namespace tendril::test {
namespace {

class Progress : public CommandTest {
 protected:
  void Start() { commands_.running.StartCommandProgress(commands_.send, "Sending"); }
  void End(Outcome outcome) { commands_.running.EndCommandProgress(outcome, "done", ""); }
  void Expect(std::uint64_t after_ms, bool shown, int bar_width, ProgressColour colour) {
    world_.time.Advance(after_ms);
    EXPECT_EQ(progress_.shown, shown);
    EXPECT_EQ(progress_.bar_width, bar_width);
    EXPECT_EQ(progress_.colour, colour);
  }
};

TEST_F(Progress, Bar_GrowsTenEvery15msUntilTheFrameIsFull) {
  Start();
  Expect(14, true, 10, ProgressColour::kBlue);
  Expect(1, true, 20, ProgressColour::kBlue);
  Expect(60000, true, 400, ProgressColour::kBlue);
  progress_.frame_width = 421;
  Expect(60000, true, 430, ProgressColour::kBlue);
  commands_.running.ShowStep("1 of 4", 0.25);
  Expect(0, true, 105, ProgressColour::kBlue);
  progress_.frame_width = 200;
  Expect(60000, true, 50, ProgressColour::kBlue);
}

TEST_F(Progress, Outcome_StaysForThreeSecondsUnlessAnotherCommandStarts) {
  Start();
  world_.time.Advance(150);
  End(Outcome::kFailure);
  Expect(2999, true, 110, ProgressColour::kRed);
  EXPECT_EQ(progress_.text, "done");
  Expect(1, false, 10, ProgressColour::kRed);
  EXPECT_EQ(world_.time.RunningTimers(), 0);

  Start();
  End(Outcome::kSuccess);
  Expect(2000, true, 10, ProgressColour::kGreen);
  Start();
  EXPECT_EQ(progress_.text, "");
  Expect(5000, true, 400, ProgressColour::kBlue);
}

}  // namespace
}  // namespace tendril::test
