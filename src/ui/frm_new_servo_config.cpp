#include "ui/frm_new_servo_config.h"

#include <QCloseEvent>
#include <QHBoxLayout>
#include <QScreen>
#include <QScrollArea>
#include <QTimer>
#include <QVBoxLayout>
#include <optional>

#include "ui/actuals_frame.h"
#include "ui/summary_area.h"

namespace tendril {
namespace {

constexpr QSize kFirstSize(1280, 800);
// Where the content does not fit, the window scrolls.
constexpr QSize kSmallestWindow(480, 360);

}  // namespace

frmNewServoConfig::frmNewServoConfig(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes,
                                     const Version& version)
    : link_(link),
      ports_(link, boxes),
      connection_(new ConnectionArea(ports_)),
      progress_(new ProgressArea),
      commands_(
          link, timers, boxes, *progress_, *connection_, working_,
          {.starting = [this] { return live_test_.MakeWay(); }, .replaced = [this] { ShowReplaced(); }}),
      command_area_(new CommandArea(commands_, *connection_, command_buttons_)),
      apply_boxes_(new ApplyBoxes),
      channels_(new ChannelStrip(working_)),
      live_test_area_(new LiveTestArea),
      editor_(new EditorArea(working_, live_test_area_->TestButtons())),
      views_(new QStackedWidget),
      simulators_(*channels_, *editor_, *apply_boxes_),
      live_test_(link, timers, boxes, commands_.Running(), *connection_, *editor_, *live_test_area_,
                 simulators_),
      shutdown_(
          link, timers, [](std::int16_t) {}, [this] { close(); }) {
  setObjectName(QStringLiteral("frmNewServoConfig"));
  LayOut();
  commands_.Running().SetObserver([this] { ShowRunning(); });
  connection_->SetUnitIdHandler([this] { command_buttons_.ShowRunning(commands_.Running()); });
  channels_->SetSelectHandler([this](std::size_t channel) { SelectChannel(channel); });
  live_test_area_->Connect(live_test_);
  ports_.SetOpeningHandler([this] { live_test_.OnTestButton(LiveTest::kNoButton); });
  StartUp(version);
}

frmNewServoConfig::~frmNewServoConfig() { commands_.Running().SetObserver(nullptr); }

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
  editor_->SetUpSpinButtons();
  progress_->ShowProgress(false);
  editor_->ListPresets();
  for (std::size_t slot = 0; slot < kPortCount; ++slot)
    SetFromPreset(kPresets[kStartPreset], working_.At(slot));
  connection_->ListCommPorts();
  simulators_.UpdateAll();
  live_test_.OnSlider();
}

void frmNewServoConfig::SelectChannel(std::size_t channel) {
  apply_boxes_->TickOnly(channel);
  channels_->ShowSelected(channel);
  editor_->LoadChannel(channel);
  live_test_.OnSlider();
}

void frmNewServoConfig::ShowReplaced() {
  if (const auto channel = editor_->Channel()) editor_->LoadChannel(*channel);
  simulators_.UpdateAll();
  live_test_.OnSlider();
}

void frmNewServoConfig::ShowRunning() {
  const RunningCommand& running = commands_.Running();
  if (running.Active()) focus_before_command_ = focusWidget();
  connection_->ShowRunning(running);
  command_buttons_.ShowRunning(running);
  progress_->ShowRunning(running);
  live_test_area_->ShowRunning(running);
  // Disabling takes the focus off what was used last, and it would fall on some servo or button. It rests on the
  // window meanwhile and then goes back, unless the person has moved it since.
  if (running.Active()) {
    if (focusWidget() != focus_before_command_) setFocus();
    focus_in_command_ = focusWidget();
  } else if (focus_before_command_ && focusWidget() == focus_in_command_) {
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
  auto* summary = new SummaryArea(commands_, command_buttons_, views_);
  summary->SetRangeCaptions(QStringLiteral("1000--2000"));
  views_->addWidget(summary);
  new ActualsFrame(this);  // the window owns it
  ShowRunning();           // the buttons that came
}

void frmNewServoConfig::closeEvent(QCloseEvent* event) {
  commands_.Stop();
  live_test_.OnTestButton(LiveTest::kNoButton);
  if (!shutdown_.MayClose()) {
    event->ignore();
    return;
  }
  link_.SetPortOpen(false);
  event->accept();
}

}  // namespace tendril
