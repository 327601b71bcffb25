#include "ui/live_test_area.h"

#include <QEvent>
#include <QGridLayout>
#include <QHBoxLayout>
#include <QSignalBlocker>

#include "ui/appearance.h"
#include "ui/sign.h"

namespace tendril {
namespace {

struct ReadOut {
  const char* title;
  const char* scale;
  const char* name;
};
// In the order of SliderReadOut.
constexpr std::array<ReadOut, 3> kReadOuts{{{"Nyx Value", "0%..100%", "lblPositionValue_0"},
                                            {"DMX Value", "0..255", "lblPositionValue_1"},
                                            {"Pulse Width", "1000..2000", "txtPositionValue"}}};

constexpr QColor kWarning(0xA8, 0x00, 0x20);

}  // namespace

LiveTestArea::LiveTestArea(MotionParameters& tests)
    : QGroupBox(QStringLiteral("Live Test")),
      tests_(tests),
      warning_(new QWidget),
      HScrollSendServoPosition_(Named(new QSlider(Qt::Horizontal), "HScrollSendServoPosition")),
      chkSendSlideCommands_(Named(new QCheckBox(QStringLiteral("Use Slider to Test Intensity Values")),
                                  "chkSendSlideCommands")) {
  Describe(
      chkSendSlideCommands_,
      "While this is ticked, the slider moves the real servo too: the chosen channel's, at the chosen unit.");
  Describe(
      HScrollSendServoPosition_,
      "Moves the chosen channel's drawn servo through its virtual range, 0 to 100 %, and no further than the "
      "virtual stops. Arrow keys move it by 1 %, page keys by 10 %.");
  chkSendSlideCommands_->setAccessibleName(chkSendSlideCommands_->text());
  HScrollSendServoPosition_->setAccessibleName(QStringLiteral("Servo position"));
  HScrollSendServoPosition_->setRange(0, LiveTest::kSliderMaximum);
  HScrollSendServoPosition_->setSingleStep(LiveTest::kSliderMaximum / 100);
  HScrollSendServoPosition_->setPageStep(LiveTest::kSliderMaximum / 10);
  HScrollSendServoPosition_->setValue(LiveTest::kSliderMaximum / 2);
  connect(HScrollSendServoPosition_, &QAbstractSlider::valueChanged, this, &LiveTestArea::SliderMoved);
  connect(chkSendSlideCommands_, &QAbstractButton::toggled, this, &LiveTestArea::SliderSendsChanged);

  auto* warning = AddLayout<QHBoxLayout>(warning_, {});
  warning->addWidget(new Sign(SignKind::kWarning));
  warning->addWidget(
      BoldLabel("WARNING: Possible Servo Damage: Limits present in the controller are bypassed."), 1);
  auto* grid = AddLayout<QGridLayout>(this, {9, 3, 9, 6});
  grid->setVerticalSpacing(1);
  grid->setHorizontalSpacing(16);
  grid->addWidget(warning_, 0, 0);
  grid->addWidget(HScrollSendServoPosition_, 1, 0);
  grid->addWidget(chkSendSlideCommands_, 2, 0);
  for (std::size_t i = 0; i < kReadOuts.size(); ++i) {
    const int column = static_cast<int>(i) + 1;
    auto* value = read_outs_[i] = Named(BoldLabel(), kReadOuts[i].name);
    ScaleType(value, 1.5);
    value->setMinimumWidth(value->fontMetrics().horizontalAdvance(QStringLiteral("0000")));
    grid->addWidget(new QLabel(QString::fromUtf8(kReadOuts[i].title)), 0, column);
    grid->addWidget(value, 1, column);
    grid->addWidget(DimLabel(kReadOuts[i].scale), 2, column);
  }
  grid->setColumnStretch(0, 1);
  ColourWarning();
}

void LiveTestArea::EnableControls(const QString& running_command) {
  EnableUnless(running_command, HScrollSendServoPosition_);
  tests_.EnableTests(running_command.isEmpty() && SliderSends()
                         ? QStringLiteral("The slider tests the servo now. Clear \"Use Slider to Test "
                                          "Intensity Values\" to use this button.")
                         : running_command);
}

void LiveTestArea::ShowTestRunning(int button, bool running) {
  tests_.ShowTestRunning(button, running);
  if (running == (running_test_ == button)) return;
  running_test_ = running ? std::optional(button) : std::nullopt;
  Q_EMIT SweepChanged();
}

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

void LiveTestArea::changeEvent(QEvent* event) {
  QGroupBox::changeEvent(event);
  if (event->type() == QEvent::PaletteChange) ColourWarning();
}

void LiveTestArea::ColourWarning() {
  SetPaletteColour(warning_, QPalette::WindowText,
                   WithContrast(kWarning, palette().color(QPalette::Window), kTextContrast));
}

}  // namespace tendril
