#include "ui/frm_new_servo_config.h"

#include <QCloseEvent>
#include <QDateTime>
#include <QHBoxLayout>
#include <QScreen>
#include <QScrollArea>
#include <QTimer>
#include <QVBoxLayout>
#include <utility>

#include "platform/hex_text.h"
#include "trace/line_verdict.h"
#include "ui/about_dialog.h"
#include "ui/accessible_controls.h"
#include "ui/appearance.h"
#include "ui/escape_key.h"
#include "ui/keys_dialog.h"
#include "ui/manual.h"
#include "ui/model/port_sentences.h"
#include "ui/program_icon.h"
#include "ui/wrapping_row.h"

namespace tendril {
namespace {

constexpr QSize kFirstSize(1280, 800);
// Where the content does not fit, the window scrolls.
constexpr QSize kSmallestWindow(480, 360);

}  // namespace

frmNewServoConfig::frmNewServoConfig(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes,
                                     ControlPanel& control_panel, const ProgramInfo& info)
    : QMainWindow((InstallAccessibleControls(), InstallAppearance(), nullptr)),
      link_(link),
      timers_(timers),
      boxes_(boxes),
      control_panel_(control_panel),
      info_(info),
      ports_(link, boxes, control_panel),
      actuals_(new ActualsFrame(timers, *this)),
      commands_(
          link, trace_, timers, boxes, *progress_, *connection_, config_.Records(),
          {.starting = [this] { return MakeWayForCommand(); },
           .polled = [this](std::uint8_t unit,
                            bool replied) { facts_.NotePoll(unit, replied && !AnotherUnitAnswered(trace_)); },
           .replaced = [this](std::uint8_t unit) { OnRead(unit); },
           .sent = [this](std::uint8_t unit) { OnSent(unit); },
           .compared = [this](std::uint8_t unit, const OptionTable& held) { OnCompared(unit, held); },
           .searched =
               [this] {
                 if (found_units_ != nullptr) found_units_->ShowSearch();
               }}),
      live_test_(link, timers, boxes, commands_.running, *connection_, *servo_, *live_test_area_,
                 simulators_),
      tmrSummaryScreen_(timers.CreateTimer([this] { OnSummaryScreen(); })),
      shutdown_(link, timers, control_panel, [this] { close(); }) {
  setObjectName("frmNewServoConfig");
  LayOut();
  ConnectAreas();
  ConnectMenu();
  ConnectOperations();
  StartUp();
}

frmNewServoConfig::~frmNewServoConfig() {
  hide();  // typed text takes effect now, while all parts of the window exist
  link_.SetLineObserver(nullptr);
  link_.SetPortHandler(nullptr);
}

// Stacks and scroll areas show a widget, and lay it out, as soon as they get it. So they get it empty, and only when
// they are in this window: without a parent, the widget would become a window.
void frmNewServoConfig::LayOut() {
  setMinimumSize(kSmallestWindow);
  // Leaves room for a frame and a task bar.
  resize(kFirstSize.boundedTo(screen()->availableSize() - QSize(8, 40)));
  auto* scroll = new QScrollArea;
  scroll->setFrameShape(QFrame::NoFrame);
  scroll->setWidgetResizable(true);
  scroll->setFocusPolicy(Qt::NoFocus);
  setCentralWidget(scroll);
  setStatusBar(status_);

  auto* content = new QWidget;
  scroll->setWidget(content);
  auto* column = AddLayout<QVBoxLayout>(content, {5, 2, 5, 2}, 3);
  column->addWidget(new WrappingRow(connection_, command_area_));
  auto* boxes_or_progress = new QStackedLayout;
  column->addLayout(boxes_or_progress);
  progress_->SharePlace(*boxes_or_progress, apply_boxes_);
  column->addWidget(views_, 1);

  auto* simulator_view = new QWidget;
  simulator_view->installEventFilter(this);  // for its first paint
  views_->addWidget(simulator_view);
  auto* simulator_column = AddLayout<QVBoxLayout>(simulator_view, {}, 3);
  auto* editor = new QWidget;
  auto* editor_row = AddLayout<QHBoxLayout>(editor, {}, 4);
  editor_row->addWidget(servo_, 3);
  editor_row->addWidget(parameters_, 5);
  editor_row->addWidget(choices_, 2);
  simulator_column->addWidget(channels_, 1);
  simulator_column->addWidget(editor, 3);
  simulator_column->addWidget(live_test_area_);
  setMenuBar(menu_ = new MainMenu(*this));
  compared_.SetMenu(*menu_);
}

void frmNewServoConfig::ConnectAreas() {
  QObject* const c = &connections_;
  connect(connection_, &ConnectionArea::UnitIdChanged, c, [this] { EnableControls(); });
  connect(connection_, &ConnectionArea::FindPressed, c, [this] { FindUnits(); });
  connect(command_area_, &CommandArea::SendPressed, c, [this] { commands_.send.Start(); });
  connect(command_area_, &CommandArea::GetPressed, c, [this] { commands_.get.Start(); });
  connect(command_area_, &CommandArea::ComparePressed, c, [this] { commands_.compare.Start(); });
  connect(command_area_, &CommandArea::ChangeIdPressed, c, [this] { commands_.change_id.Start(); });
  connect(command_area_, &CommandArea::SummaryPressed, c, [this] { ShowSummary(); });
  connect(apply_boxes_, &ApplyBoxes::Applied, c, [this] { OnApplied(); });
  connect(channels_, &ChannelStrip::ChannelChosen, c,
          [this](std::size_t channel) { ChooseChannel(channel); });
  connect(parameters_, &MotionParameters::Edited, c,
          [this](const QString& what, FollowUp follow_up) { OnEdited(what, follow_up); });
  connect(parameters_, &MotionParameters::LabelPressed, c,
          [this](const QWidget* label) { actuals_->ShowActuals(*label); });
  connect(parameters_, &MotionParameters::NumberDropped, c,
          [this](const QString& typed, const QString& sentence) { OnNumberDropped(typed, sentence); });
  connect(parameters_, &MotionParameters::StorePressed, c, [this] {
    CommitTyping();
    apply_boxes_->Store();
  });
  connect(parameters_, &MotionParameters::TestPressed, c, [this](int button) {
    CommitTyping();
    live_test_.OnTestButton(button);
  });
  connect(choices_, &ChannelChoices::KindChosen, c, [this](std::int16_t kind) { OnKindChosen(kind); });
  connect(choices_, &ChannelChoices::OptionChosen, c, [this](const QString& what) { NoteStep(what); });
  connect(choices_, &ChannelChoices::PresetChosen, c, [this](std::size_t preset) { OnPresetChosen(preset); });
  connect(live_test_area_, &LiveTestArea::SliderMoved, c, [this] {
    live_test_.OnSlider();
    facts_.Show();
  });
  connect(live_test_area_, &LiveTestArea::SliderSendsChanged, c, [this] {
    EnableControls();
    live_test_.OnSliderSends();
  });
  connect(live_test_area_, &LiveTestArea::SweepChanged, c, [this] {
    EnableControls();
    status_->Say(live_test_area_->Sweeps() ? QStringLiteral("Servo test running")
                                           : QStringLiteral("Servo test stopped"));
  });
  connect(status_, &StatusLine::UndoPressed, c, [this] { Undo(); });
  connect(&status_->Compared(), &ComparisonLine::ComparePressed, c, [this] { commands_.compare.Start(); });
  connect(&status_->Compared(), &ComparisonLine::DismissPressed, c, [this] { compared_.Dismiss(); });
  connect(&status_->Moving(), &MovingLine::StopPressed, c, [this] {
    if (!live_test_.EndSweep()) live_test_area_->ClearSliderSends();
  });
  new EscapeKey(*this, {[this] { return summary_ != nullptr && summary_->CloseNumberEntry(); },
                        [this] { return live_test_.EndSweep(); }, [this] { return commands_.Cancel(); }});
  connect(progress_, &ProgressArea::CancelPressed, c, [this] { commands_.Cancel(); });
}

void frmNewServoConfig::ConnectOperations() {
  commands_.running.SetObserver(
      [this] { command_focus_.Follow(commands_.running.Active(), [this] { EnableControls(); }); });
  commands_.running.SetReporter([this](const CommandReport& report) { OnReport(report); });
  link_.SetLineObserver([this](const LineEvent& event) { OnLine(event); });
  link_.SetPortHandler([this](bool open) {
    const bool swept = live_test_area_->Sweeps();
    if (!open) live_test_.OnPortClosed();
    if (!open && swept)
      status_->Say(QStringLiteral("Servo test stopped: the port is closed, and the servo stays where it is"));
    ports_.OnPort(open);
  });
  ports_.SetChangedHandler([this] { ShowPort(); });
  ports_.SetOpeningHandler([this] { live_test_.OnTestButton(LiveTest::kNoButton); });
}

void frmNewServoConfig::ConnectMenu() {
  QObject* const c = &connections_;
  connect(menu_, &MainMenu::ChannelChosen, c, [this](std::size_t channel) { ChooseChannel(channel); });
  connect(menu_, &MainMenu::CopyChosen, c, [this] { Copy(); });
  connect(menu_, &MainMenu::CopyConfigurationChosen, c, [this] { CopyConfiguration(); });
  connect(menu_, &MainMenu::PasteConfigurationChosen, c, [this] { PasteConfiguration(); });
  connect(menu_, &MainMenu::CopyStatusChosen, c, [this] { status_->Copy(); });
  connect(menu_, &MainMenu::CopyLineChosen, c, [this] { Line().CopyReport(); });
  connect(menu_, &MainMenu::LineToggled, c, [this](bool shown) { shown ? Line().Open() : Line().hide(); });
  connect(menu_, &MainMenu::IdStepped, c, [this](int by) {
    connection_->StepUnitId(by);
    SayUnitId();
  });
  connect(menu_, &MainMenu::FindChosen, c, [this] { FindUnits(); });
  connect(menu_, &MainMenu::UndoChosen, c, [this] { Undo(); });
  connect(menu_, &MainMenu::RedoChosen, c, [this] { Redo(); });
  connect(menu_, &MainMenu::RestoreChosen, c, [this] { RestoreReading(); });
  connect(menu_, &MainMenu::DismissChosen, c, [this] { compared_.Dismiss(); });
  connect(menu_, &MainMenu::SimulatorChosen, c, [this] { ShowConfig(); });
  connect(menu_, &MainMenu::KeysChosen, c, [this] { ShowKeys(*this, *menu_); });
  connect(menu_, &MainMenu::ManualChosen, c, [this] { ShowManual(); });
  connect(menu_, &MainMenu::AboutChosen, c, [this] { ShowAbout(*this, info_); });
  connect(menu_, &MainMenu::StopChosen, c, [this] { live_test_.EndSweep(); });
}

// A unit answers some 25 ms after a poll, and the line has to be released by then. Painting may take longer.
void frmNewServoConfig::OnLine(const LineEvent& event) {
  trace_.Note(event, QDateTime::currentMSecsSinceEpoch());
  if (event.kind == LineEvent::Kind::kPollSent) {
    until_released_.SetForm(this);
  } else if (event.kind != LineEvent::Kind::kReceived) {
    until_released_.SetForm(nullptr);
  }
}

void frmNewServoConfig::ShowPort() {
  const PortFacts facts = ports_.Facts();
  status_->ShowPort(QString::fromStdString(PortSentence(facts)));
  status_->ShowBorrowed(QString::fromStdString(BorrowedPortSentence(facts)));
  facts_.Show();
  ShowUndo();  // each port has a way back of its own
  compared_.Show();
}

void frmNewServoConfig::StartUp() {
  setWindowTitle(QStringLiteral("Kelvane Tendril Utility v") + info_.version.Text());
  connection_->ListCommPorts();
  control_panel_.ReadPreferences();
  control_panel_.InitializeCommListenerInterface();
  ShowRecords();
  ShowOrigin();
  facts_.Show();
}

void frmNewServoConfig::EnableControls() {
  const RunningCommand& running = commands_.running;
  const QString running_command = QString::fromStdString(running.What());
  const bool finding = running.Operation() == &commands_.find;
  connection_->EnableControls(running_command, finding);
  command_area_->EnableCommands(running_command, connection_->UnitId(), SummaryShown());
  live_test_area_->EnableControls(running_command);
  apply_boxes_->EnableControls(running_command, SummaryShown());
  channels_->EnableControls(running_command);
  parameters_->EnableEditing(running_command);
  choices_->EnableControls(running_command);
  if (summary_ != nullptr) summary_->EnableControls(running_command);
  menu_->EnableIdSteps(!running.Active() && !live_test_area_->Moves());
  menu_->EnableFind(finding || !running.Active());
  menu_->ShowView(SummaryShown(), running.Active());
  progress_->EnableCancel(!running.Active() ? QStringLiteral("No command runs.")
                          : running.Cancelled()
                              ? QStringLiteral("The command ends with the unit's last reply.")
                              : QString());
  if (found_units_ != nullptr)
    found_units_->EnableControls(running_command, finding, running.Cancelled(), live_test_area_->Moves());
  ShowUndo();
  menu_->EnableStop(live_test_area_->Sweeps());
  status_->Compared().EnableOffer(running_command);
  compared_.Show();  // another unit may be chosen
  facts_.Show();
}

// The window is painted first: the summary has more controls than everything else, and the icon has to be decoded.
bool frmNewServoConfig::eventFilter(QObject* object, QEvent* event) {
  if (event->type() == QEvent::Paint) {
    object->removeEventFilter(this);
    QTimer::singleShot(0, &connections_, [this] {
      MakeSummary();
      connection_->WatchCommPorts();
      setWindowIcon(ProgramIcon());
    });
  }
  return QMainWindow::eventFilter(object, event);
}

LinePane& frmNewServoConfig::Line() {
  if (line_ == nullptr) {
    line_ = new LinePane(trace_, timers_, link_, *connection_, info_, *this);
    setAnimated(false);  // what is above the pane moves at once
    addDockWidget(Qt::BottomDockWidgetArea, line_);
    connect(line_, &LinePane::Said, &connections_,
            [this](const QString& sentence) { status_->Say(sentence); });
    connect(line_, &LinePane::visibilityChanged, &connections_,
            [this](bool shown) { menu_->ShowLine(shown); });
  }
  return *line_;
}

void frmNewServoConfig::MakeSummary() {
  if (summary_ != nullptr) return;
  summary_ = new SummaryArea(timers_, config_.Records(), comparison_, views_);
  compared_.SetSummary(*summary_);
  views_->addWidget(summary_);
  EnableControls();
  connect(summary_, &SummaryArea::SendPressed, &connections_, [this] { commands_.send.Start(); });
  connect(summary_, &SummaryArea::GetPressed, &connections_, [this] { commands_.get.Start(); });
  connect(summary_, &SummaryArea::ComparePressed, &connections_, [this] { commands_.compare.Start(); });
  connect(summary_, &SummaryArea::OptionChosen, &connections_,
          [this] { NoteStep(QStringLiteral("Option")); });
  connect(summary_, &SummaryArea::SimulatorPressed, &connections_, [this] { ShowConfig(); });
  connect(summary_, &SummaryArea::NumberDropped, &connections_,
          [this](const QString& typed, const QString& sentence) { OnNumberDropped(typed, sentence); });
  connect(summary_, &SummaryArea::Edited, &connections_, [this](std::size_t channel) {
    ForgetDropped();
    config_.Remarks().AcceptRecord(channel);
    config_.Editor().ReloadChannel();
    ShowRemarks();
    NoteStep(QStringLiteral("Edit"), summary_->Repeats());
  });
}

// A search that runs goes on: only its list is shown again.
void frmNewServoConfig::FindUnits() {
  if (isEnabled() && !commands_.running.Active()) commands_.find.Start();
  if (commands_.running.Operation() != &commands_.find) return;
  if (found_units_ == nullptr) {
    found_units_ = new FoundUnits(commands_.find.Search(), *this);
    connect(found_units_, &FoundUnits::UnitChosen, &connections_, [this](std::uint8_t id) {
      connection_->ChooseUnitId(id);
      SayUnitId();
    });
    connect(found_units_, &FoundUnits::CancelPressed, &connections_, [this] { commands_.Cancel(); });
    connect(found_units_, &FoundUnits::FindPressed, &connections_, [this] { FindUnits(); });
    connect(found_units_, &QDialog::finished, &connections_, [this] {
      if (commands_.running.Operation() == &commands_.find)
        status_->Say(QStringLiteral("Finding units goes on: Find shows the list again, Cancel ends it"));
    });
    EnableControls();
  }
  found_units_->show();
  found_units_->raise();
  found_units_->activateWindow();
}

void frmNewServoConfig::SayUnitId() {
  status_->Say(QStringLiteral("Unit ID ") + QString::fromStdString(HexByte(connection_->UnitId())));
}

void frmNewServoConfig::ShowManual() {
  ManualFacts facts{
      .moves = facts_.AnythingMoves(), .port = ports_.Facts(), .no_answer = facts_.UnitMissing()};
  const std::pair<const QWidget*, ManualChapter> described[] = {
      {connection_, ManualChapter::kFirstUnit},
      {command_area_, ManualChapter::kConfigurations},
      {apply_boxes_, ManualChapter::kConfigurations},
      {live_test_area_, ManualChapter::kLiveTest},
      {line_, ManualChapter::kNoAnswer},
      {summary_, ManualChapter::kConfigurations},
      {views_, ManualChapter::kNumbers}};
  for (const auto& [area, chapter] : described) {
    if (area != nullptr && area->isAncestorOf(focusWidget())) {
      facts.focus = chapter;
      break;
    }
  }
  live_test_.OnTestButton(LiveTest::kNoButton);  // no servo moves while the user looks elsewhere
  const QString sentence = OpenManual(FittingChapter(facts), boxes_);
  if (!sentence.isEmpty()) status_->Say(sentence);
}

void frmNewServoConfig::closeEvent(QCloseEvent* event) {
  CommitTyping();  // later it would start again what is stopped here
  commands_.Stop();
  live_test_.OnTestButton(LiveTest::kNoButton);
  if (!shutdown_.MayClose()) {
    setEnabled(false);  // nothing can open the port again while it is given back
    event->ignore();
    return;
  }
  link_.SetPortOpen(false);
  event->accept();
}

}  // namespace tendril
