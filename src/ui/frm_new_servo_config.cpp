#include "ui/frm_new_servo_config.h"

#include <QAbstractSpinBox>
#include <QCloseEvent>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QScreen>
#include <QScrollArea>
#include <QTimer>
#include <QVBoxLayout>
#include <optional>

#include "ui/accessible_controls.h"
#include "ui/freeze.h"

namespace tendril {
namespace {

constexpr QSize kFirstSize(1280, 800);
// Where the content does not fit, the window scrolls.
constexpr QSize kSmallestWindow(480, 360);
// The table is filled, then seen.
constexpr std::int32_t kSummaryScreenMs = 20;

}  // namespace

frmNewServoConfig::frmNewServoConfig(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes,
                                     ControlPanel& control_panel, const Version& version)
    : QWidget((InstallAccessibleControls(), nullptr)),
      link_(link),
      timers_(timers),
      control_panel_(control_panel),
      ports_(link, boxes, control_panel),
      connection_(new ConnectionArea(ports_)),
      progress_(new ProgressArea),
      commands_(link, timers, boxes, *progress_, *connection_, working_,
                {.starting =
                     [this] {
                       CommitTyping();
                       return live_test_.MakeWay();
                     },
                 .replaced =
                     [this] {
                       remarks_.AcceptRecords();
                       OnReplaced();
                     }}),
      command_area_(new CommandArea(commands_, *connection_, command_buttons_, [this] { ShowSummary(); })),
      apply_boxes_(new ApplyBoxes(channel_editor_, [this] { OnApplied(); })),
      channels_(new ChannelStrip(working_)),
      live_test_area_(new LiveTestArea),
      editor_(new EditorArea(
          channel_editor_, working_,
          {.parameters = {.edited = [this](FollowUp follow_up) { OnEdited(follow_up); },
                          .values_wanted = [this](const QWidget& label) { ShowActuals(label); }},
           .choices = {.kind_chosen = [this](std::int16_t kind) { OnKindChosen(kind); },
                       .preset_chosen = [this](std::size_t preset) { OnPresetChosen(preset); }}},
          live_test_area_->TestButtons())),
      views_(new QStackedWidget),
      simulators_(*channels_, *editor_, channel_editor_),
      live_test_(link, timers, boxes, commands_.running, *connection_, *editor_, *live_test_area_,
                 simulators_),
      tmrSummaryScreen_(timers.CreateTimer([this] { OnSummaryScreen(); })),
      shutdown_(link, timers, control_panel, [this] { close(); }) {
  setObjectName(QStringLiteral("frmNewServoConfig"));
  LayOut();
  commands_.running.SetObserver([this] { ShowRunning(); });
  connection_->SetUnitIdHandler([this] { command_buttons_.ShowRunning(commands_.running); });
  channels_->SetSelectHandler([this](std::size_t channel) { SelectChannel(channel); });
  live_test_area_->Connect(live_test_);
  ports_.SetOpeningHandler([this] { live_test_.OnTestButton(LiveTest::kNoButton); });
  link_.SetPortClosedHandler([this] { live_test_.OnPortClosed(); });
  StartUp(version);
}

frmNewServoConfig::~frmNewServoConfig() {
  hide();  // what is being typed is taken over now, and not when half of the window is gone
  commands_.running.SetObserver(nullptr);
  link_.SetPortClosedHandler(nullptr);
}

// Stacks and scroll areas show a widget as soon as they get it, and with that lay it out. So they get theirs
// while it is empty, and only when they are in this window themselves: without a parent, what they show would
// be a window of its own.
void frmNewServoConfig::LayOut() {
  setMinimumSize(kSmallestWindow);
  // A frame and a task bar want room too.
  resize(kFirstSize.boundedTo(screen()->availableSize() - QSize(8, 40)));
  auto* whole = new QVBoxLayout(this);
  whole->setContentsMargins(0, 0, 0, 0);
  auto* scroll = new QScrollArea;
  scroll->setFrameShape(QFrame::NoFrame);
  scroll->setWidgetResizable(true);
  scroll->setFocusPolicy(Qt::NoFocus);
  whole->addWidget(scroll);

  auto* content = new QWidget;
  scroll->setWidget(content);
  auto* column = new QVBoxLayout(content);
  column->setContentsMargins(8, 4, 8, 8);
  column->setSpacing(4);
  auto* top = new QHBoxLayout;
  top->addWidget(connection_);
  top->addWidget(command_area_, 1);
  column->addLayout(top);
  auto* boxes_or_progress = new QStackedLayout;
  column->addLayout(boxes_or_progress);
  progress_->SharePlace(*boxes_or_progress, apply_boxes_);
  column->addWidget(views_, 1);

  auto* simulator_view = new QWidget;
  simulator_view->installEventFilter(this);  // for its first paint
  views_->addWidget(simulator_view);
  auto* simulator_column = new QVBoxLayout(simulator_view);
  simulator_column->setContentsMargins(0, 0, 0, 0);
  simulator_column->setSpacing(4);
  simulator_column->addWidget(channels_, 1);
  simulator_column->addWidget(editor_, 3);
  simulator_column->addWidget(live_test_area_);
}

void frmNewServoConfig::StartUp(const Version& version) {
  setWindowTitle(QStringLiteral("Kelvane Tendril Utility v%1.%2.%3")
                     .arg(version.major_number)
                     .arg(version.minor_number)
                     .arg(version.revision));
  command_area_->DisableExportAndImport();
  editor_->SetUpSimulator();
  channels_->SetUpSimulators();
  connection_->FillUnitIds();
  editor_->ShowEditor();
  progress_->ShowProgress(false);
  editor_->ListPresets();
  for (std::size_t slot = 0; slot < kPortCount; ++slot)
    SetFromPreset(kPresets[kStartPreset], working_.At(slot));
  remarks_.AcceptRecords();
  connection_->ListCommPorts();
  control_panel_.ReadPreferences();
  control_panel_.InitializeCommListenerInterface();
  simulators_.UpdateAll(live_test_.ShownPosition());
  live_test_.OnRecordsReplaced();
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
  editor_->ShowEditor();
  if (actuals_ != nullptr) actuals_->SetValues(channel_editor_.WorkingValues());
  ShowRemarks();
}

void frmNewServoConfig::ShowRemarks() {
  const auto sentences = remarks_.Sentences(!SummaryShown());
  if (SummaryShown()) {
    summary_->ShowRemarks(sentences);
  } else {
    editor_->ShowRemarks(sentences);
  }
}

void frmNewServoConfig::ShowActuals(const QWidget& label) {
  if (actuals_ != nullptr) actuals_->ShowActuals(label);
}

// The person has edited a parameter.
void frmNewServoConfig::OnEdited(FollowUp follow_up) {
  remarks_.AcceptEdit();
  ShowEditor();
  switch (follow_up) {
    case FollowUp::kUpdateSimulators:
      simulators_.UpdateSimulators(live_test_.ShownPosition());
      break;
    case FollowUp::kRefreshLivePosition:
      live_test_.OnSlider();
      break;
  }
}

// The person has clicked an apply box.
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

// The records were replaced: all that is seen of them is shown anew, and nothing is stored.
void frmNewServoConfig::ShowRecords() {
  channels_->ShowKinds();
  ShowEditor();
  simulators_.UpdateAll(live_test_.ShownPosition());
  live_test_.OnRecordsReplaced();
}

void frmNewServoConfig::OnReplaced() {
  channel_editor_.ReloadChannel();
  ShowRecords();
  if (!SummaryShown()) return;
  summary_->ShowRecords();
  ShowRemarks();
}

// What is being typed counts from now on: a key can set off what uses it without taking the focus away.
void frmNewServoConfig::CommitTyping() {
  if (auto* spin = qobject_cast<QAbstractSpinBox*>(focusWidget())) spin->interpretText();
}

void frmNewServoConfig::ShowSummary() {
  CommitTyping();
  live_test_.OnTestButton(LiveTest::kNoButton);
  MakeUnseenParts();
  tmrSummaryScreen_->SetInterval(kSummaryScreenMs);
  tmrSummaryScreen_->SetEnabled(true);
}

void frmNewServoConfig::OnSummaryScreen() {
  tmrSummaryScreen_->SetEnabled(false);
  focus_before_summary_ = focusWidget();
  actuals_->hide();
  summary_->ShowRecords();
  live_test_.OnRecordsReplaced();  // showing the records can have changed them
  views_->setCurrentWidget(summary_);
  command_area_->ShowSummaryButton(false);
  apply_boxes_->ShowEditing(false);
  summary_->TakeFocus();
  ShowRemarks();
}

void frmNewServoConfig::ShowConfig() {
  CommitTyping();
  summary_->CloseNumberEntry();
  views_->setCurrentIndex(0);
  command_area_->ShowSummaryButton(true);
  apply_boxes_->ShowEditing(true);
  if (focus_before_summary_) focus_before_summary_->setFocus();
  OnReplaced();  // the summary has changed the records
}

bool frmNewServoConfig::SummaryShown() const {
  return summary_ != nullptr && views_->currentWidget() == summary_;
}

void frmNewServoConfig::ShowRunning() {
  const RunningCommand& running = commands_.running;
  // Disabling takes the focus off what was used last, and it would fall on some servo or button, and scroll there. It
  // rests on the window meanwhile and then goes back, unless the person has moved it since.
  if (running.Active()) {
    focus_before_command_ = focusWidget();
    setFocus();
  }
  connection_->ShowRunning(running.What());
  command_buttons_.ShowRunning(running);
  progress_->ShowRunning(running);
  live_test_area_->ShowRunning(running);
  if (!focus_before_command_) return;
  if (running.Active()) {
    if (focus_before_command_->isEnabled()) focus_before_command_->setFocus();
    focus_in_command_ = focusWidget();
  } else if (focusWidget() == focus_in_command_) {
    focus_before_command_->setFocus();
  }
}

// The summary has more controls than all the rest, and is not seen at first: the first picture of the window
// does not wait for it.
bool frmNewServoConfig::eventFilter(QObject* object, QEvent* event) {
  if (event->type() == QEvent::Paint) {
    object->removeEventFilter(this);
    QTimer::singleShot(0, this, [this] { MakeUnseenParts(); });
  }
  return QWidget::eventFilter(object, event);
}

void frmNewServoConfig::MakeUnseenParts() {
  if (summary_ != nullptr) return;
  summary_ = new SummaryArea(commands_, command_buttons_, timers_, working_,
                             {.back = [this] { ShowConfig(); },
                              .edited =
                                  [this](std::size_t channel) {
                                    remarks_.AcceptRecord(channel);
                                    ShowRemarks();
                                  }},
                             views_);
  summary_->SetRangeCaptions(QStringLiteral("1000--2000"));
  views_->addWidget(summary_);
  actuals_ = new ActualsFrame(timers_, *this);
  actuals_->SetValues(channel_editor_.WorkingValues());
  ShowRunning();  // the buttons that came
}

void frmNewServoConfig::closeEvent(QCloseEvent* event) {
  CommitTyping();  // later it would set off what has been stopped
  commands_.Stop();
  live_test_.OnTestButton(LiveTest::kNoButton);
  if (!shutdown_.MayClose()) {
    setEnabled(false);  // nothing opens the port again while it is given back
    event->ignore();
    return;
  }
  link_.SetPortOpen(false);
  event->accept();
}

}  // namespace tendril
