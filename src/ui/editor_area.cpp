#include "ui/editor_area.h"

#include <QButtonGroup>
#include <QGridLayout>
#include <QHBoxLayout>
#include <QRadioButton>
#include <QStringList>
#include <QVBoxLayout>

#include "platform/rounding.h"
#include "ui/controls.h"
#include "ui/simulator_feed.h"

namespace tendril {
namespace {

constexpr char kNotYet[] = "Editing a channel is not in this version yet.";
// Every value that a record can give fits.
constexpr int kWidestLimit = 2 * kMaxPulseWidth;

// A frame of radio buttons `array`_0, `array`_1 ...
QGroupBox* MakeOptions(const QString& title, const QString& array, const QStringList& captions,
                       QBoxLayout* layout) {
  auto* frame = new QGroupBox(title);
  frame->setLayout(layout);
  layout->setContentsMargins(9, 2, 9, 4);
  layout->setSpacing(2);
  for (int index = 0; index < captions.size(); ++index) {
    auto* option = Named(new QRadioButton(captions[index]), ArrayName(array, index));
    option->setAccessibleName(title + QStringLiteral(": ") + captions[index]);
    Disable(option, QString::fromUtf8(kNotYet));
    layout->addWidget(option);
  }
  return frame;
}

}  // namespace

EditorArea::EditorArea(const ChannelTable& working,
                       const std::array<QPushButton*, LiveTest::kTestButtons>& test_buttons, QWidget* parent)
    : QWidget(parent), working_(working) {
  auto* row = new QHBoxLayout(this);
  row->setContentsMargins(0, 0, 0, 0);
  row->addWidget(MakeServo(), 3);
  row->addWidget(MakeMotionParameters(test_buttons), 5);
  row->addWidget(MakeChoices(), 2);
}

QWidget* EditorArea::MakeServo() {
  servo_frame_ = new QGroupBox(QStringLiteral("Channel"));
  ServoSimulator1_ = Named(new ServoSimulator, QStringLiteral("ServoSimulator1"));
  Disable(ServoSimulator1_, QStringLiteral("The chosen channel's servo."));
  auto* layout = new QVBoxLayout(servo_frame_);
  layout->setContentsMargins(4, 4, 4, 4);
  layout->addWidget(ServoSimulator1_);
  QObject::connect(ServoSimulator1_, &ServoSimulator::Resized, this,
                   [this] { RefeedResizedSimulator(*ServoSimulator1_, Values(), arm_); });
  return servo_frame_;
}

QWidget* EditorArea::MakeMotionParameters(
    const std::array<QPushButton*, LiveTest::kTestButtons>& test_buttons) {
  auto* frame = new QGroupBox(QStringLiteral("Motion Parameters"));
  auto* grid = new QGridLayout(frame);
  grid->setContentsMargins(12, 8, 12, 8);
  grid->setHorizontalSpacing(10);
  enum Column { kName, kLeftValue, kRightValue, kSpin, kTest };

  const auto add_parameter = [&](int row, const QString& name, const QString& control, QSpinBox*& spin,
                                 const QString& label, QLabel*& value) {
    spin = Named(new QSpinBox, control);
    spin->setSuffix(QStringLiteral(" µs"));
    spin->setRange(-kWidestLimit, kWidestLimit);
    spin->setFixedWidth(spin->sizeHint().width());  // whatever its limits become, nothing around it moves
    spin->setAccessibleName(name);
    Disable(spin, QString::fromUtf8(kNotYet));
    auto* name_label = new QLabel(name);
    name_label->setBuddy(spin);
    value = Named(BoldLabel({}), label);
    grid->addWidget(name_label, row, kName);
    grid->addWidget(value, row, kRightValue);
    grid->addWidget(spin, row, kSpin);
  };
  add_parameter(0, QStringLiteral("Actual Pulse Range"), QStringLiteral("spnActPulseRange"),
                spnActPulseRange_, QStringLiteral("lblActPulseRight"), lblActPulseRight_);
  add_parameter(1, QStringLiteral("Virtual Pulse Range"), QStringLiteral("spnVirtPulseRange"),
                spnVirtPulseRange_, QStringLiteral("lblVirtPulseRange"), lblVirtPulseRange_);
  add_parameter(2, QStringLiteral("Neutral Trim"), QStringLiteral("spnNeutralTrim"), spnNeutralTrim_,
                QStringLiteral("lblNeutralTrim"), lblNeutralTrim_);
  grid->addWidget(DimLabel(QStringLiteral("Relative to Neutral")), 3, kName, 1, 3, Qt::AlignBottom);
  add_parameter(4, QStringLiteral("Left Virtual Stop"), QStringLiteral("spnLeftVirtStop"), spnLeftVirtStop_,
                QStringLiteral("lblLeftVirtStop"), lblLeftVirtStop_);
  add_parameter(5, QStringLiteral("Right Virtual Stop"), QStringLiteral("spnRightVirtStop"),
                spnRightVirtStop_, QStringLiteral("lblRightVirtStop"), lblRightVirtStop_);
  add_parameter(6, QStringLiteral("Default Position"), QStringLiteral("spnDefaultPos"), spnDefaultPos_,
                QStringLiteral("lblDefaultPos"), lblDefaultPos_);
  lblActPulseLeft_ = Named(BoldLabel({}), QStringLiteral("lblActPulseLeft"));
  grid->addWidget(lblActPulseLeft_, 0, kLeftValue, Qt::AlignRight | Qt::AlignVCenter);
  grid->addWidget(Named(BoldLabel(QStringLiteral("[ +/-")), QStringLiteral("Label13")), 1, kLeftValue,
                  Qt::AlignRight | Qt::AlignVCenter);

  // Each test stands beside the parameter that it tries; the one of the stops beside both.
  struct TestPlace {
    int row, rows;
  };
  constexpr std::array<TestPlace, LiveTest::kTestButtons> kTestPlaces{
      {{1, 1}, {4, 2}, {6, 1}, {0, 1}, {2, 1}}};
  for (const std::size_t test : {3u, 0u, 4u, 1u, 2u}) {  // from top to bottom, as the Tab key goes
    grid->addWidget(test_buttons[test], kTestPlaces[test].row, kTest, kTestPlaces[test].rows, 1);
  }
  grid->setColumnStretch(kName, 2);
  grid->setColumnStretch(kRightValue, 1);
  grid->setRowStretch(7, 1);
  return frame;
}

QWidget* EditorArea::MakeChoices() {
  auto* presets = new QGroupBox(QStringLiteral("Standard Preset Values"));
  cmbPresets_ = Named(new CalmComboBox, QStringLiteral("cmbPresets"));
  cmbPresets_->setAccessibleName(presets->title());
  Disable(cmbPresets_, QStringLiteral("Applying a preset is not in this version yet."));
  auto* presets_layout = new QVBoxLayout(presets);
  presets_layout->setContentsMargins(9, 2, 9, 4);
  presets_layout->addWidget(cmbPresets_);

  auto* choices = new QWidget;
  auto* column = new QVBoxLayout(choices);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(3);
  column->addWidget(presets);
  column->addWidget(MakeOptions(QStringLiteral("Output"), QStringLiteral("optChannelType"),
                                {QStringLiteral("Servo"), QStringLiteral("Digital"), QStringLiteral("PWM")},
                                new QHBoxLayout));
  column->addWidget(
      MakeOptions(QStringLiteral("Power Up Parameters"), QStringLiteral("optPowerUp"),
                  {QStringLiteral("Move to Default Position"), QStringLiteral("Move to Neutral Position"),
                   QStringLiteral("Start Pulse on First Command")},
                  new QVBoxLayout));
  column->addWidget(MakeOptions(
      QStringLiteral("Lost Communications Parameters"), QStringLiteral("optLostComm"),
      {QStringLiteral("Hold at Current Position"), QStringLiteral("Move to Default Position"),
       QStringLiteral("Move to Neutral Position"), QStringLiteral("Stop Pulse / Start on First Command")},
      new QVBoxLayout));
  column->addStretch();
  return choices;
}

void EditorArea::SetUpSimulator() {
  ServoSimulator1_->DisplaySize(kLargeSimulator);
  ServoSimulator1_->setAccessibleName(QStringLiteral("Chosen channel"));
}

void EditorArea::SetUpSpinButtons() {
  const auto set_up = [](QSpinBox* spin, int minimum, int maximum, int value) {
    spin->setRange(minimum, maximum);
    spin->setSingleStep(10);
    spin->setValue(value);
  };
  set_up(spnActPulseRange_, 0, 1000, 900);
  set_up(spnVirtPulseRange_, 0, 1000, 800);
  set_up(spnLeftVirtStop_, -800, 0, -750);
  set_up(spnRightVirtStop_, 0, 800, 750);
  set_up(spnNeutralTrim_, -200, 200, 0);
  set_up(spnDefaultPos_, -750, 750, 0);
  ShowCaptions();
}

void EditorArea::ShowCaptions() {
  const auto with_sign = [](int value) {
    return (value < 1 ? QString() : QStringLiteral("+")) + QString::number(value);
  };
  lblActPulseLeft_->setNum(kCentrePulseWidth - spnActPulseRange_->value());
  lblActPulseRight_->setNum(kCentrePulseWidth + spnActPulseRange_->value());
  lblVirtPulseRange_->setText(QString::number(spnVirtPulseRange_->value()) + QLatin1Char(']'));
  lblNeutralTrim_->setText(with_sign(spnNeutralTrim_->value()));
  lblLeftVirtStop_->setNum(spnLeftVirtStop_->value());
  lblRightVirtStop_->setText(QLatin1Char('+') + QString::number(spnRightVirtStop_->value()));
  lblDefaultPos_->setText(with_sign(spnDefaultPos_->value()));
}

void EditorArea::LoadChannel(std::size_t channel) {
  const ChannelConfig& record = working_.At(channel);
  channel_ = channel;
  const auto load = [](QSpinBox* spin, int value) {
    spin->setRange(-kWidestLimit, kWidestLimit);
    spin->setValue(value);
  };
  const auto half_width = [](const PulsePair& range) { return RoundHalfToEven((range[1] - range[0]) / 2.0); };
  load(spnActPulseRange_, half_width(record.ActualRange));
  load(spnVirtPulseRange_, half_width(record.VirtualRange));
  load(spnNeutralTrim_, record.NeutralPosition - kCentrePulseWidth);
  load(spnLeftVirtStop_, record.VirtualStops[0] - record.NeutralPosition);
  load(spnRightVirtStop_, record.VirtualStops[1] - record.NeutralPosition);
  load(spnDefaultPos_, record.DefaultPosition - record.NeutralPosition);
  ShowCaptions();
  ServoSimulator1_->DisplayCaption(QStringLiteral("CHAN %1").arg(channel + 1));
}

void EditorArea::ListPresets() {
  for (const Preset& preset : kPresets) {
    cmbPresets_->addItem(QString::fromUtf8(preset.name.data(), static_cast<qsizetype>(preset.name.size())));
  }
  cmbPresets_->setCurrentIndex(static_cast<int>(kStartPreset));
}

ChannelConfig EditorArea::SpinButtonValues() const {
  const Microseconds neutral = kCentrePulseWidth + spnNeutralTrim_->value();
  ChannelConfig values;
  values.ActualRange = {kCentrePulseWidth - spnActPulseRange_->value(),
                        kCentrePulseWidth + spnActPulseRange_->value()};
  values.VirtualRange = {neutral - spnVirtPulseRange_->value(), neutral + spnVirtPulseRange_->value()};
  values.VirtualStops = {neutral + spnLeftVirtStop_->value(), neutral + spnRightVirtStop_->value()};
  values.NeutralPosition = neutral;
  values.DefaultPosition = neutral + spnDefaultPos_->value();
  return values;
}

ChannelConfig EditorArea::Values() const { return channel_ ? working_.At(*channel_) : SpinButtonValues(); }

void EditorArea::UpdateSimulator(Microseconds arm) {
  arm_ = arm;
  FeedSimulator(*ServoSimulator1_, Values(), kLargeSimulator, arm);
}

void EditorArea::MoveArm(Microseconds arm) {
  arm_ = arm;
  ServoSimulator1_->SetMovingArmPositionUS(arm);
}

}  // namespace tendril
