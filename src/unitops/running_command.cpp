#include "unitops/running_command.h"

#include <cmath>

namespace tendril {
namespace {

constexpr std::int32_t kGrowPeriodMs = 15;
constexpr std::int32_t kShowOutcomeMs = 3000;
constexpr int kStep = 10;  // the bar's first width, and what it grows by

}  // namespace

RunningCommand::RunningCommand(TimerFactory& timers, CommandProgressView& view)
    : view_(view), tmrProgress_(timers.CreateTimer([this] { OnTick(); })) {}

void RunningCommand::StartCommandProgress(UnitOperation& operation, std::string what) {
  operation_ = &operation;
  what_ = std::move(what);
  cancelled_ = false;
  value_ = kStep;
  part_.reset();
  if (observer_) observer_();
  view_.SetText("");
  view_.SetTitle(what_);
  view_.SetColour(ProgressColour::kBlue);
  view_.SetBarWidth(kStep);
  view_.ShowProgress(true);
  tmrProgress_->SetInterval(kGrowPeriodMs);
  tmrProgress_->SetEnabled(true);
  Report({what_, {}, {}});
}

void RunningCommand::ShowStep(const std::string& step, std::optional<double> part) {
  view_.SetTitle(what_ + ": " + step);
  part_ = part;
  if (part_) ShowPart();
}

void RunningCommand::ShowPart() {
  view_.SetBarWidth(static_cast<int>(std::lround(*part_ * view_.FrameWidth())));
}

void RunningCommand::SetCancelled() {
  cancelled_ = true;
  view_.SetTitle("Cancelling: waiting for the unit's last reply");
  if (observer_) observer_();
}

void RunningCommand::EndCommandProgress(Outcome outcome, const std::string& text, std::string aftermath) {
  const std::string what = what_;
  if (cancelled_) view_.SetTitle(what + ": cancelled");
  Stop();
  view_.SetColour(outcome == Outcome::kSuccess ? ProgressColour::kGreen : ProgressColour::kRed);
  view_.SetText(text);
  value_ = kEnded;
  tmrProgress_->SetInterval(kShowOutcomeMs);
  tmrProgress_->SetEnabled(true);
  Report({what, text, std::move(aftermath), cancelled_});
}

void RunningCommand::Stop() {
  if (!Active()) return;
  operation_ = nullptr;
  what_.clear();
  if (observer_) observer_();
}

void RunningCommand::StopAt(const CommandReport& report) {
  if (Active()) view_.SetTitle(report.outcome);
  Stop();
  Report(report);
}

void RunningCommand::Report(const CommandReport& report) {
  if (reporter_) reporter_(report);
}

void RunningCommand::OnTick() {
  if (value_ == kEnded) {
    tmrProgress_->SetEnabled(false);
    view_.ShowProgress(false);
    view_.SetBarWidth(kStep);
    return;
  }
  if (part_) return ShowPart();  // the frame may have another width
  // A full bar waits for the command's end, or for a wider frame.
  if (value_ < view_.FrameWidth()) {
    value_ += kStep;
    view_.SetBarWidth(value_);
  }
}

}  // namespace tendril
