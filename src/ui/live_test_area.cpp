#include "ui/live_test_area.h"

#include <QEvent>
#include <QGridLayout>
#include <QSignalBlocker>

#include "ui/controls.h"

namespace tendril {
namespace {

constexpr int kSliderStep = 10;
constexpr int kSliderPage = 100;

struct ReadOut {
  const char* title;
  const char* scale;
  const char* name;
};
// In the order of SliderReadOut.
constexpr std::array<ReadOut, 3> kReadOuts{{{"Nyx Value", "0%..100%", "lblPositionValue_0"},
                                            {"DMX Value", "0..255", "lblPositionValue_1"},
                                            {"Pulse Width", "1000..2000", "txtPositionValue"}}};

struct TestTexts {
  const char* what;
  const char* tip;
};
constexpr std::array<TestTexts, LiveTest::kTestButtons> kTests{
    {{"virtual pulse range",
      "Moves the servo to and fro through its virtual range, until the button is pressed again."},
     {"virtual stops",
      "Moves the servo to and fro between its virtual stops, until the button is pressed again."},
     {"default position", "Moves the servo to its default position."},
     {"actual pulse range",
      "Moves the servo to and fro through its whole actual range, until the button is pressed again."},
     {"centre", "Moves the servo to the centre, 1500 µs."}}};

constexpr char kSliderTip[] =
    "Moves the chosen channel's drawn servo through its virtual range, 0 to 100 %, and no further than the "
    "virtual stops. Arrow keys move it by 1 %, page keys by 10 %.";
constexpr char kSendsTip[] =
    "While this is ticked, the slider moves the real servo too: the chosen channel's, at the chosen unit.";
constexpr char kSliderTestsTip[] =
    "The slider tests the servo now. Clear \"Use Slider to Test Intensity Values\" to use this button.";

QString TestName(int button, bool running) {
  return (running ? QStringLiteral("Stop testing the %1") : QStringLiteral("Test the %1"))
      .arg(QString::fromUtf8(kTests[static_cast<std::size_t>(button)].what));
}

}  // namespace

LiveTestArea::LiveTestArea(QWidget* parent) : FrameBox(QStringLiteral("Live Test"), parent) {
  chkSendSlideCommands_ = Named(new QCheckBox(QStringLiteral("Use Slider to Test Intensity Values")),
                                QStringLiteral("chkSendSlideCommands"));
  Describe(chkSendSlideCommands_, QString::fromUtf8(kSendsTip));
  warning_ = BoldLabel(
      QStringLiteral("WARNING: Possible Servo Damage: Limits present in the controller are bypassed."));

  HScrollSendServoPosition_ = Named(new QSlider(Qt::Horizontal), QStringLiteral("HScrollSendServoPosition"));
  HScrollSendServoPosition_->setRange(0, LiveTest::kSliderMaximum);
  HScrollSendServoPosition_->setSingleStep(kSliderStep);
  HScrollSendServoPosition_->setPageStep(kSliderPage);
  HScrollSendServoPosition_->setValue(LiveTest::kSliderMaximum / 2);
  HScrollSendServoPosition_->setAccessibleName(QStringLiteral("Servo position"));

  auto* grid = new QGridLayout(this);
  grid->setContentsMargins(9, 3, 9, 6);
  grid->setVerticalSpacing(1);
  grid->setHorizontalSpacing(16);
  grid->addWidget(warning_, 0, 0);
  grid->addWidget(HScrollSendServoPosition_, 1, 0);
  grid->addWidget(chkSendSlideCommands_, 2, 0);
  int column = 1;
  for (const ReadOut& read_out : kReadOuts) {
    auto* value = Named(BoldLabel({}), QString::fromUtf8(read_out.name));
    QFont font = value->font();
    font.setPointSizeF(font.pointSizeF() * 1.5);
    value->setFont(font);
    value->setMinimumWidth(value->fontMetrics().horizontalAdvance(QStringLiteral("0000")));
    grid->addWidget(new QLabel(QString::fromUtf8(read_out.title)), 0, column);
    grid->addWidget(value, 1, column);
    grid->addWidget(DimLabel(QString::fromUtf8(read_out.scale)), 2, column);
    read_outs_[static_cast<std::size_t>(column - 1)] = value;
    ++column;
  }
  grid->setColumnStretch(0, 1);

  for (int button = 0; button < LiveTest::kTestButtons; ++button) {
    cmdTest_[static_cast<std::size_t>(button)] =
        Named(new QPushButton, ArrayName(QStringLiteral("cmdTest"), button));
    LiveTestArea::ShowTestRunning(button, false);
  }
  EnableControls();
  ColourWarning();
}

void LiveTestArea::Connect(LiveTest& test) {
  for (int button = 0; button < LiveTest::kTestButtons; ++button) {
    QObject::connect(cmdTest_[static_cast<std::size_t>(button)], &QAbstractButton::clicked, this,
                     [&test, button] { test.OnTestButton(button); });
  }
  QObject::connect(HScrollSendServoPosition_, &QAbstractSlider::valueChanged, this,
                   [&test] { test.OnSlider(); });
  QObject::connect(chkSendSlideCommands_, &QAbstractButton::toggled, this, [this, &test] {
    EnableControls();
    test.OnSliderSends();
  });
}

void LiveTestArea::ShowRunning(const RunningCommand& running) {
  running_command_ = QString::fromStdString(running.What());
  EnableControls();
}

void LiveTestArea::EnableControls() {
  EnableUnless(running_command_, HScrollSendServoPosition_, QString::fromUtf8(kSliderTip));
  const QString why_no_test = !running_command_.isEmpty() ? running_command_
                              : SliderSends()             ? QString::fromUtf8(kSliderTestsTip)
                                                          : QString();
  for (std::size_t button = 0; button < cmdTest_.size(); ++button) {
    EnableUnless(why_no_test, cmdTest_[button], QString::fromUtf8(kTests[button].tip));
  }
}

void LiveTestArea::ShowTestRunning(int button, bool running) {
  QPushButton& test = *cmdTest_[static_cast<std::size_t>(button)];
  test.setText(running ? QStringLiteral("Stop") : QStringLiteral("Test"));
  test.setAccessibleName(TestName(button, running));
}

int LiveTestArea::SliderValue() const { return HScrollSendServoPosition_->value(); }

void LiveTestArea::SetSlider(int value) {
  const QSignalBlocker silent(HScrollSendServoPosition_);
  HScrollSendServoPosition_->setValue(value);
}

void LiveTestArea::ShowReadOut(const SliderReadOut& read_out) {
  const std::array values{read_out.percent, read_out.dmx, read_out.pulse_width};
  for (std::size_t i = 0; i < values.size(); ++i) read_outs_[i]->setNum(values[i]);
  HScrollSendServoPosition_->setAccessibleDescription(
      QStringLiteral("%1 %, %2 µs").arg(read_out.percent).arg(read_out.pulse_width));
}

bool LiveTestArea::SliderSends() const { return chkSendSlideCommands_->isChecked(); }

void LiveTestArea::ClearSliderSends() { chkSendSlideCommands_->setChecked(false); }

void LiveTestArea::changeEvent(QEvent* event) {
  FrameBox::changeEvent(event);
  if (event->type() == QEvent::PaletteChange) ColourWarning();
}

void LiveTestArea::ColourWarning() {
  QPalette palette = warning_->palette();
  palette.setColor(QPalette::WindowText, IsDark(*this) ? QColor(0xFF, 0x8A, 0x80) : QColor(0xA8, 0x00, 0x20));
  warning_->setPalette(palette);
}

}  // namespace tendril
