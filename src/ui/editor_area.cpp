#include "ui/editor_area.h"

#include <QButtonGroup>
#include <QGridLayout>
#include <QHBoxLayout>
#include <QPushButton>
#include <QRadioButton>
#include <QStringList>
#include <QVBoxLayout>

#include "ui/controls.h"
#include "ui/simulator_feed.h"

namespace tendril {
namespace {

constexpr char kNotYet[] = "Editing a channel is not in this version yet.";
constexpr char kNoTestYet[] = "Testing a channel is not in this version yet.";

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

EditorArea::EditorArea(QWidget* parent) : QWidget(parent) {
  auto* row = new QHBoxLayout(this);
  row->setContentsMargins(0, 0, 0, 0);
  row->addWidget(MakeServo(), 3);
  row->addWidget(MakeMotionParameters(), 5);
  row->addWidget(MakeChoices(), 2);
}

QWidget* EditorArea::MakeServo() {
  servo_frame_ = new QGroupBox(QStringLiteral("Channel"));
  ServoSimulator1_ = Named(new ServoSimulator, QStringLiteral("ServoSimulator1"));
  Disable(ServoSimulator1_,
          QStringLiteral("The chosen channel's servo. Choosing one is not in this version yet."));
  auto* layout = new QVBoxLayout(servo_frame_);
  layout->setContentsMargins(4, 4, 4, 4);
  layout->addWidget(ServoSimulator1_);
  QObject::connect(ServoSimulator1_, &ServoSimulator::Resized, this,
                   [this] { RefeedResizedSimulator(*ServoSimulator1_, SpinButtonValues(), arm_); });
  return servo_frame_;
}

QWidget* EditorArea::MakeMotionParameters() {
  auto* frame = new QGroupBox(QStringLiteral("Motion Parameters"));
  auto* grid = new QGridLayout(frame);
  grid->setContentsMargins(12, 8, 12, 8);
  grid->setHorizontalSpacing(10);
  enum Column { kName, kLeftValue, kRightValue, kSpin, kTest };

  const auto add_parameter = [&](int row, const QString& name, const QString& control, QSpinBox*& spin,
                                 const QString& label, QLabel*& value) {
    spin = Named(new QSpinBox, control);
    spin->setSuffix(QStringLiteral(" µs"));
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
    const char* what;
  };
  constexpr std::array<TestPlace, 5> kTests{{{1, 1, "virtual pulse range"},
                                             {4, 2, "virtual stops"},
                                             {6, 1, "default position"},
                                             {0, 1, "actual pulse range"},
                                             {2, 1, "centre"}}};
  for (int index = 0; index < static_cast<int>(kTests.size()); ++index) {
    const TestPlace& place = kTests[static_cast<std::size_t>(index)];
    auto* test = Named(new QPushButton(QStringLiteral("Test")), ArrayName(QStringLiteral("cmdTest"), index));
    test->setAccessibleName(QStringLiteral("Test the %1").arg(QString::fromUtf8(place.what)));
    Disable(test, QString::fromUtf8(kNoTestYet));
    grid->addWidget(test, place.row, kTest, place.rows, 1);
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
  lblActPulseLeft_->setText(QStringLiteral("600"));
  lblActPulseRight_->setText(QStringLiteral("2400"));
  lblVirtPulseRange_->setText(QStringLiteral("800]"));
  lblLeftVirtStop_->setText(QStringLiteral("-750"));
  lblRightVirtStop_->setText(QStringLiteral("+750"));
  lblDefaultPos_->setText(QStringLiteral("0"));
  lblNeutralTrim_->setText(QStringLiteral("0"));
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

void EditorArea::UpdateSimulator(Microseconds arm) {
  arm_ = arm;
  FeedSimulator(*ServoSimulator1_, SpinButtonValues(), kLargeSimulator, arm);
}

}  // namespace tendril
