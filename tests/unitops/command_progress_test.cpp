#include "unitops/command_progress.h"

#include <gtest/gtest.h>

#include "support/recorded_progress.h"
#include "support/simulated_time.h"

namespace tendril::test {
namespace {

TEST(CommandProgress, Bar_GrowsTenEvery15msUntilTheFrameIsFull) {
  SimulatedTime time;
  RecordedProgress view;
  CommandProgress progress(time, view);
  progress.StartCommandProgress();
  EXPECT_TRUE(view.shown);
  EXPECT_EQ(view.bar_width, 10);
  EXPECT_EQ(view.colour, ProgressColour::kBlue);
  time.Advance(14);
  EXPECT_EQ(view.bar_width, 10);
  time.Advance(1);
  EXPECT_EQ(view.bar_width, 20);
  time.Advance(60000);
  EXPECT_EQ(view.bar_width, 400);
  view.frame_width = 421;
  time.Advance(60000);
  EXPECT_EQ(view.bar_width, 430) << "a frame made wider is filled as well";
  progress.EndCommandProgress(Outcome::kSuccess, "done");
  time.Advance(3000);
  EXPECT_FALSE(view.shown);
}

TEST(CommandProgress, Outcome_StaysForThreeSecondsAndTheBarStartsOver) {
  SimulatedTime time;
  RecordedProgress view;
  CommandProgress progress(time, view);
  progress.StartCommandProgress();
  time.Advance(150);
  progress.EndCommandProgress(Outcome::kFailure, "COMMAND FAILED!");
  EXPECT_EQ(view.colour, ProgressColour::kRed);
  EXPECT_EQ(view.text, "COMMAND FAILED!");
  time.Advance(2999);
  EXPECT_TRUE(view.shown);
  EXPECT_EQ(view.bar_width, 110);
  time.Advance(1);
  EXPECT_FALSE(view.shown);
  EXPECT_EQ(view.bar_width, 10);
  EXPECT_EQ(time.RunningTimers(), 0);
}

TEST(CommandProgress, NewCommandWithinTheThreeSeconds_IsNotHiddenByTheOldOnesEnd) {
  SimulatedTime time;
  RecordedProgress view;
  CommandProgress progress(time, view);
  progress.StartCommandProgress();
  progress.EndCommandProgress(Outcome::kSuccess, "SUCCESS: Send Complete!");
  EXPECT_EQ(view.colour, ProgressColour::kGreen);
  time.Advance(2000);
  progress.StartCommandProgress();
  EXPECT_EQ(view.text, "");
  time.Advance(5000);
  EXPECT_TRUE(view.shown);
  EXPECT_EQ(view.colour, ProgressColour::kBlue);
}

}  // namespace
}  // namespace tendril::test
