#include "unitops/running_command.h"

#include "command_fixture.h"

namespace tendril::test {
namespace {

class Progress : public CommandTest {
 protected:
  void Start() { commands_.running.StartCommandProgress(commands_.send, "Sending"); }
  void End(Outcome outcome) { commands_.running.EndCommandProgress(outcome, "done"); }
  void Advance(std::uint64_t ms) { world_.time.Advance(ms); }
};

TEST_F(Progress, Bar_GrowsTenEvery15msUntilTheFrameIsFull) {
  Start();
  EXPECT_TRUE(progress_.shown);
  EXPECT_EQ(progress_.bar_width, 10);
  EXPECT_EQ(progress_.colour, ProgressColour::kBlue);
  Advance(14);
  EXPECT_EQ(progress_.bar_width, 10);
  Advance(1);
  EXPECT_EQ(progress_.bar_width, 20);
  Advance(60000);
  EXPECT_EQ(progress_.bar_width, 400);
  progress_.frame_width = 421;
  Advance(60000);
  EXPECT_EQ(progress_.bar_width, 430) << "a frame made wider is filled as well";
}

TEST_F(Progress, Outcome_StaysForThreeSecondsUnlessAnotherCommandStarts) {
  Start();
  Advance(150);
  End(Outcome::kFailure);
  EXPECT_EQ(progress_.colour, ProgressColour::kRed);
  EXPECT_EQ(progress_.text, "done");
  Advance(2999);
  EXPECT_TRUE(progress_.shown);
  EXPECT_EQ(progress_.bar_width, 110);
  Advance(1);
  EXPECT_FALSE(progress_.shown);
  EXPECT_EQ(progress_.bar_width, 10);
  EXPECT_EQ(world_.time.RunningTimers(), 0);

  Start();
  End(Outcome::kSuccess);
  EXPECT_EQ(progress_.colour, ProgressColour::kGreen);
  Advance(2000);
  Start();
  EXPECT_EQ(progress_.text, "");
  Advance(5000);
  EXPECT_TRUE(progress_.shown);
  EXPECT_EQ(progress_.colour, ProgressColour::kBlue);
}

}  // namespace
}  // namespace tendril::test
