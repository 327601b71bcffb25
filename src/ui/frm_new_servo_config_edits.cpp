// The window's edits and views: what the user's acts do to the records, and how that is shown.
#include <QClipboard>
#include <QGuiApplication>
#include <utility>

#include "platform/hex_text.h"
#include "ui/calm_spin_box.h"
#include "ui/configuration_clipboard.h"
#include "ui/freeze.h"
#include "ui/frm_new_servo_config.h"
#include "ui/time_of_day.h"

namespace tendril {
namespace {

// The table is filled before it is shown.
constexpr std::int32_t kSummaryScreenMs = 20;

QString UnitHeld(std::uint8_t unit, const Readings::Reading& reading, const char* text) {
  return QString::fromLatin1(text).arg(QString::fromStdString(HexByte(unit)),
                                       QString::fromStdString(ClockTime(reading.time)));
}

}  // namespace

// By a click, a key or an action of assistive technology: the focus may be elsewhere.
void frmNewServoConfig::ChooseChannel(std::size_t channel) {
  CommitTyping();
  SelectChannel(channel);
  NoteStep(QStringLiteral("Leaving the channel"));
  status_->Say(QStringLiteral("Channel %1 selected").arg(channel + 1) +
               (live_test_area_->Sweeps() ? QStringLiteral("; the test goes on there") : QString()));
}

void frmNewServoConfig::SelectChannel(std::size_t channel) {
  const auto left = config_.Editor().Channel();
  config_.Editor().SelectChannel(channel);
  if (left) channels_->UpdateSimulator(*left, live_test_.ShownPosition());
  apply_boxes_->ShowTicks();
  channels_->ShowSelected(channel);
  ShowEditor();
  live_test_.OnSlider();
  facts_.Show();
}

void frmNewServoConfig::ShowEditor() {
  Freeze freeze;
  freeze.SetForm(this);
  parameters_->ShowValues();
  choices_->ShowChoices();
  servo_->ShowChannel();
  actuals_->SetValues(config_.Editor().WorkingValues());
  ShowRemarks();
}

void frmNewServoConfig::ShowRemarks() {
  const auto sentences = config_.Remarks().Sentences(!SummaryShown());
  if (SummaryShown()) {
    summary_->ShowRemarks(sentences);
  } else {
    parameters_->ShowRemarks(sentences);
  }
}

void frmNewServoConfig::OnEdited(const QString& what, FollowUp follow_up) {
  ForgetDropped();
  config_.Remarks().AcceptEdit();
  ShowEditor();
  if (follow_up == FollowUp::kRefreshLivePosition) {
    live_test_.OnSlider();
  } else {
    simulators_.UpdateSimulators(live_test_.ShownPosition());
  }
  NoteStep(what, parameters_->Repeats());
}

void frmNewServoConfig::OnApplied() {
  config_.Remarks().AcceptEdit();
  parameters_->ShowValues();  // as stored
  ShowRemarks();
  if (config_.Editor().Channel()) simulators_.UpdateSimulators(live_test_.ShownPosition());
  NoteStep(QStringLiteral("Storing"));
}

void frmNewServoConfig::OnKindChosen(std::int16_t kind) {
  CommitTyping();
  const auto channel = config_.Editor().Channel();
  if (!channel) return;
  config_.Editor().SetPortType(kind);
  channels_->ShowKinds();
  if (kind == kPortServo) {
    SelectChannel(*channel);
  } else {
    ShowEditor();
  }
  NoteStep(QStringLiteral("Output"));
}

void frmNewServoConfig::OnPresetChosen(std::size_t preset) {
  CommitTyping();
  ForgetDropped();
  QGuiApplication::setOverrideCursor(Qt::WaitCursor);
  config_.ApplyPreset(preset);
  ShowRecords();
  NoteStep(QStringLiteral("Preset ") + QAnyStringView(kPresets[preset].name).toString());
  QGuiApplication::restoreOverrideCursor();
}

// Shows the records after they were replaced. Stores nothing.
void frmNewServoConfig::ShowRecords() {
  channels_->ShowKinds();
  ShowEditor();
  simulators_.UpdateAll(live_test_.ShownPosition());
  live_test_.OnRecordsReplaced();
}

// The records were read, or the summary has changed them.
void frmNewServoConfig::OnReplaced(const QString& what) {
  ForgetDropped();
  if (SummaryShown()) summary_->NormaliseAndShowRecords();
  config_.Editor().ReloadChannel();
  ShowRecords();
  ShowRemarks();
  NoteStep(what);
}

void frmNewServoConfig::OnRead(std::uint8_t unit) {
  const std::string time = IsoTime();
  compared_.NoteRead(unit);
  readings_.Keep(link_.CommPort(), unit, config_.Records(), time);
  config_.ReadFrom(unit, time);
  OnReplaced(QStringLiteral("Get from unit ") + QString::fromStdString(HexByte(unit)));
}

void frmNewServoConfig::OnSent(std::uint8_t unit) {
  config_.SentTo(unit, TimeOfDay());
  NoteStep({});
  compared_.NoteSent(unit);
}

void frmNewServoConfig::OnCompared(std::uint8_t unit, const OptionTable& held) {
  ChannelTable records;
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    records.At(slot) = DecodeOptions(held[slot]);
    records.At(slot).Received = false;
  }
  readings_.KeepCompared(link_.CommPort(), unit, records, IsoTime());  // known, should a send follow
  compared_.NoteCompared(unit, held);
  outcome_spoken_ = QString::fromStdString(comparison_.Sentence());
}

void frmNewServoConfig::OnReport(const CommandReport& report) {
  QString sentence = QString::fromStdString(report.Sentence(TimeOfDay()));
  if (commands_.send.TakeWriting()) OnWriting();
  if (report.outcome.empty()) {
    OnBegun();
  } else {
    sentence += std::exchange(outcome_note_, {});
    if (commands_.compare.TakeFailure()) compared_.NoteFailure(report.cancelled);
  }
  status_->Say(sentence, std::exchange(outcome_spoken_, {}));
}

void frmNewServoConfig::OnBegun() {
  status_->OfferUndo({});  // it is off while a command runs
  compared_.NoteBegun(commands_.running.Operation() == &commands_.change_id);
}

// A send has begun to write, before it runs. Keeps what the status bar says beside its outcome.
void frmNewServoConfig::OnWriting() {
  compared_.NoteWriting();
  if (!dropped_.isEmpty())
    NoteOutcome(QStringLiteral("Sent without the %1 that was typed.").arg(std::exchange(dropped_, {})));
  const std::uint8_t unit = connection_->UnitId();
  if (!readings_.SendBegins(link_.CommPort(), unit))
    NoteOutcome(QStringLiteral("What it held before is not known: it was not read."));
}

void frmNewServoConfig::RestoreReading() {
  const std::uint8_t unit = connection_->UnitId();
  const Readings::Reading* reading = readings_.WayBack(link_.CommPort(), unit);
  if (reading == nullptr) return;
  CommitTyping();
  config_.Load(reading->records, unit, reading->time);
  const QString what = UnitHeld(unit, *reading, "what unit %1 held at %2");
  OnReplaced(QStringLiteral("Restoring ") + what);
  status_->Say(QStringLiteral("Shown now: %1. Nothing is sent yet.").arg(what));
}

void frmNewServoConfig::Copy() {
  if (CopySelection()) return;
  if (!SummaryShown()) return CopyFocused();
  QGuiApplication::clipboard()->setText(summary_->TableText());
  status_->Say(QStringLiteral("Copied the table: %1 channels").arg(kPortCount));
}

void frmNewServoConfig::CopyConfiguration() {
  CommitTyping();
  status_->Say(CopyAsText(config_));
}

void frmNewServoConfig::PasteConfiguration() {
  CommitTyping();
  if (!MayUndo()) return;
  const ChannelTable before = config_.Records();
  const QString refusal = PasteText(config_);
  if (!refusal.isEmpty()) return status_->Say(refusal);
  ForgetDropped();
  if (SummaryShown()) summary_->ShowRecords();
  ShowRecords();
  NoteStep(QStringLiteral("Paste"));
  const auto changed = ChannelsThatDiffer(before, config_.Records());
  const QString channels = QString::fromStdString(changed.empty() ? "no channel" : ChannelsInWords(changed));
  status_->SayOfChange(QStringLiteral("Paste: %1 changed").arg(channels));
}

// Called after everything that may have changed the configuration.
void frmNewServoConfig::NoteStep(const QString& what, bool goes_on) {
  const auto changed = history_.Note(what, goes_on);
  const bool many = changed.size() > 1;
  if (!changed.empty()) {
    status_->OfferUndo(many ? history_.UndoText() : QString());
    compared_.NoteEdit();
  }
  if (!changed.empty() && !goes_on) {  // a held arrow says it once
    status_->ForgetChange();
    if (many) {
      const QString channels = QString::fromStdString(ChannelsInWords(changed));
      status_->SayOfChange(QStringLiteral("%1: %2 changed").arg(what, channels));
    }
  }
  ShowOrigin();
  ShowUndo();
  compared_.Show();
}

void frmNewServoConfig::ShowOrigin() {
  status_->ShowOrigin(QString::fromStdString(config_.Origin().Sentence()));
  channels_->ShowChanged(config_.Origin().ChangedChannels());
}

void frmNewServoConfig::ShowUndo() {
  const bool may = MayUndo();
  status_->EnableUndo(may);
  menu_->EnablePaste(may);
  menu_->ShowUndo(may && history_.CanUndo(), history_.UndoText(), may && history_.CanRedo(),
                  history_.RedoText());
  const std::uint8_t unit = connection_->UnitId();
  const Readings::Reading* reading = readings_.WayBack(link_.CommPort(), unit);
  menu_->ShowWayBack(may && reading != nullptr,
                     reading != nullptr ? UnitHeld(unit, *reading, "Unit %1 Held at %2") : QString());
}

bool frmNewServoConfig::MayUndo() const { return !commands_.running.Active() && !live_test_area_->Moves(); }

void frmNewServoConfig::Undo() {
  CommitTyping();
  if (!MayUndo() || !history_.CanUndo()) return;
  const QString what = history_.UndoText();
  history_.Undo();
  ShowRestored(QStringLiteral("Undone: ") + what);
}

void frmNewServoConfig::Redo() {
  CommitTyping();
  if (!MayUndo() || !history_.CanRedo()) return;  // what was typed is a step of its own
  const QString what = history_.RedoText();
  history_.Redo();
  ShowRestored(QStringLiteral("Done again: ") + what);
}

// Shows the configuration that undo or redo has restored. Stores nothing, and sends nothing.
void frmNewServoConfig::ShowRestored(const QString& said) {
  ForgetDropped();
  choices_->ShowPreset(config_.ChosenPreset());
  apply_boxes_->ShowTicks();
  if (const auto channel = config_.Editor().Channel()) channels_->ShowSelected(*channel);
  if (SummaryShown()) summary_->ShowRecords();
  ShowRecords();
  status_->OfferUndo({});
  ShowOrigin();
  ShowUndo();
  compared_.NoteEdit();
  compared_.Show();
  status_->SayOfChange(said);
}

// Lets typed text take effect. A key can trigger what uses it without taking the focus away.
void frmNewServoConfig::CommitTyping() {
  if (auto* number = qobject_cast<CalmSpinBox*>(focusWidget())) number->EndTyping();
}

void frmNewServoConfig::ForgetDropped() {
  dropped_.clear();
  status_->ForgetEarlier();
}

// A send that follows before the next edit goes without it.
void frmNewServoConfig::OnNumberDropped(const QString& typed, const QString& sentence) {
  dropped_ = typed;
  status_->SayTwice(sentence);
}

// A command is about to start: until it ends, nothing changes the records.
bool frmNewServoConfig::MakeWayForCommand() {
  CommitTyping();
  if (tmrSummaryScreen_->Enabled()) OnSummaryScreen();
  if (summary_ != nullptr) summary_->CloseNumberEntry();
  return live_test_.MakeWay();
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
  focus_before_summary_ = focusWidget();
  actuals_->hide();
  summary_->NormaliseAndShowRecords();
  config_.Editor().ReloadChannel();
  live_test_.OnRecordsReplaced();  // the records may have changed
  views_->setCurrentWidget(summary_);
  EnableControls();
  summary_->TakeFocus();
  status_->Say(QStringLiteral("Summary of all eight channels"));
  ShowRemarks();
  NoteStep(QStringLiteral("Showing the summary"));
}

void frmNewServoConfig::ShowConfig() {
  CommitTyping();
  summary_->CloseNumberEntry();
  views_->setCurrentIndex(0);
  EnableControls();
  if (focus_before_summary_) focus_before_summary_->setFocus();
  status_->Say(QStringLiteral("Simulator"));
  OnReplaced({});  // the summary has changed the records
}

bool frmNewServoConfig::SummaryShown() const { return views_->currentWidget() == summary_; }

}  // namespace tendril
