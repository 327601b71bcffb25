// The window's edits and views: what the user's acts do to the records, and how that is shown.
#include <QAbstractSpinBox>
#include <QGuiApplication>

#include "ui/freeze.h"
#include "ui/frm_new_servo_config.h"

namespace tendril {
namespace {

// The table is filled before it is shown.
constexpr std::int32_t kSummaryScreenMs = 20;

}  // namespace

// By a click, a key or an action of assistive technology: the focus may be elsewhere.
void frmNewServoConfig::ChooseChannel(std::size_t channel) {
  CommitTyping();
  SelectChannel(channel);
  status_->Say(QStringLiteral("Channel %1 selected").arg(channel + 1) +
               (live_test_area_->Sweeps() ? QStringLiteral("; the test goes on there") : QString()));
}

void frmNewServoConfig::SelectChannel(std::size_t channel) {
  const auto left = channel_editor_.Channel();
  channel_editor_.SelectChannel(channel);
  if (left) channels_->UpdateSimulator(*left, live_test_.ShownPosition());
  apply_boxes_->ShowTicks();
  channels_->ShowSelected(channel);
  ShowEditor();
  live_test_.OnSlider();
}

void frmNewServoConfig::ShowEditor() {
  Freeze freeze;
  freeze.SetForm(this);
  parameters_->ShowValues();
  choices_->ShowChoices();
  servo_->ShowChannel();
  actuals_->SetValues(channel_editor_.WorkingValues());
  ShowRemarks();
}

void frmNewServoConfig::ShowRemarks() {
  const auto sentences = remarks_.Sentences(!SummaryShown());
  if (SummaryShown()) {
    summary_->ShowRemarks(sentences);
  } else {
    parameters_->ShowRemarks(sentences);
  }
}

void frmNewServoConfig::OnEdited(FollowUp follow_up) {
  remarks_.AcceptEdit();
  ShowEditor();
  if (follow_up == FollowUp::kRefreshLivePosition) {
    live_test_.OnSlider();
  } else {
    simulators_.UpdateSimulators(live_test_.ShownPosition());
  }
}

void frmNewServoConfig::OnApplied() {
  remarks_.AcceptEdit();
  ShowRemarks();
  if (channel_editor_.Channel()) simulators_.UpdateSimulators(live_test_.ShownPosition());
}

void frmNewServoConfig::OnKindChosen(std::int16_t kind) {
  const auto channel = channel_editor_.Channel();
  if (!channel) return;
  channel_editor_.SetPortType(kind);
  channels_->ShowKinds();
  if (kind == kPortServo) {
    SelectChannel(*channel);
  } else {
    ShowEditor();
  }
}

void frmNewServoConfig::OnPresetChosen(std::size_t preset) {
  QGuiApplication::setOverrideCursor(Qt::WaitCursor);
  channel_editor_.ApplyPreset(kPresets.at(preset));
  remarks_.AcceptRecords();
  ShowRecords();
  QGuiApplication::restoreOverrideCursor();
}

// Shows the records after they were replaced. Stores nothing.
void frmNewServoConfig::ShowRecords() {
  channels_->ShowKinds();
  ShowEditor();
  simulators_.UpdateAll(live_test_.ShownPosition());
  live_test_.OnRecordsReplaced();
}

void frmNewServoConfig::OnReplaced() {
  channel_editor_.ReloadChannel();
  ShowRecords();
  if (SummaryShown()) summary_->NormaliseAndShowRecords();
  ShowRemarks();
}

// Lets typed text take effect. A key can trigger what uses it without taking the focus away.
void frmNewServoConfig::CommitTyping() {
  if (auto* spin = qobject_cast<QAbstractSpinBox*>(focusWidget())) spin->interpretText();
}

void frmNewServoConfig::ShowSummary() {
  CommitTyping();
  live_test_.OnTestButton(LiveTest::kNoButton);
  MakeSummary();
  tmrSummaryScreen_->SetInterval(kSummaryScreenMs);
  tmrSummaryScreen_->SetEnabled(true);
}

void frmNewServoConfig::OnSummaryScreen() {
  tmrSummaryScreen_->SetEnabled(false);
  // While a command runs the focus rests on the window.
  focus_before_summary_ = focusWidget() == this ? focus_before_command_.data() : focusWidget();
  actuals_->hide();
  summary_->NormaliseAndShowRecords();
  live_test_.OnRecordsReplaced();  // the records may have changed
  views_->setCurrentWidget(summary_);
  command_area_->ShowSummaryButton(false);
  menu_->ShowView(true);
  apply_boxes_->ShowEditing(false);
  summary_->TakeFocus();
  status_->Say(QStringLiteral("Summary of all eight channels"));
  ShowRemarks();
}

void frmNewServoConfig::ShowConfig() {
  CommitTyping();
  summary_->CloseNumberEntry();
  views_->setCurrentIndex(0);
  command_area_->ShowSummaryButton(true);
  menu_->ShowView(false);
  apply_boxes_->ShowEditing(true);
  if (focus_before_summary_) focus_before_summary_->setFocus();
  status_->Say(QStringLiteral("Simulator"));
  OnReplaced();  // the summary has changed the records
}

bool frmNewServoConfig::SummaryShown() const { return views_->currentWidget() == summary_; }

}  // namespace tendril
