#include "unitops/command_progress.h"

namespace tendril {
namespace {

constexpr std::int32_t kGrowPeriodMs = 15;
constexpr std::int32_t kShowOutcomeMs = 3000;
constexpr int kStep = 10;  // the bar's first width, and what it grows by

}  // namespace

CommandProgress::CommandProgress(TimerFactory& timers, CommandProgressView& view)
    : view_(view), timer_(timers.CreateTimer([this] { OnTick(); })) {}

void CommandProgress::StartCommandProgress() {
  value_ = kStep;
  view_.SetText("");
  view_.SetColour(ProgressColour::kBlue);
  view_.SetBarWidth(kStep);
  view_.ShowProgress(true);
  timer_->SetInterval(kGrowPeriodMs);
  timer_->SetEnabled(true);
}

void CommandProgress::EndCommandProgress(Outcome outcome, const std::string& text) {
  view_.SetColour(outcome == Outcome::kSuccess ? ProgressColour::kGreen : ProgressColour::kRed);
  view_.SetText(text);
  value_ = kEnded;
  timer_->SetInterval(kShowOutcomeMs);
  timer_->SetEnabled(true);
}

void CommandProgress::OnTick() {
  if (value_ == kEnded) {
    timer_->SetEnabled(false);
    view_.ShowProgress(false);
    view_.SetBarWidth(kStep);
    return;
  }
  // A full bar waits for the command's end, or for a wider frame.
  if (value_ < view_.FrameWidth()) {
    value_ += kStep;
    view_.SetBarWidth(value_);
  }
}

}  // namespace tendril
