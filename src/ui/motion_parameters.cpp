#include "ui/motion_parameters.h"

#include <QEvent>

namespace tendril {
namespace {

enum Column { kName, kLeftValue, kRightValue, kSpin, kTest };

struct Row {
  int row;
  const char* name;
  const char* spin;
  const char* caption;
  const char* what;  // for the tool tip
};
// In the order of Parameter.
constexpr std::array<Row, kParameterCount> kRows{
    {{0, "Actual Pulse Range", "spnActPulseRange", "lblActPulseRight",
      "Half the width of the pulse range beyond which the servo is never driven, about 1500 µs"},
     {1, "Virtual Pulse Range", "spnVirtPulseRange", "lblVirtPulseRange",
      "Half the width of the pulse range that intensities of 0 to 100 % are mapped to"},
     {2, "Neutral Trim", "spnNeutralTrim", "lblNeutralTrim",
      "How far the neutral position lies from 1500 µs; virtual range, stops and default move with it"},
     {4, "Left Virtual Stop", "spnLeftVirtStop", "lblLeftVirtStop",
      "The shortest pulse that intensities can give, relative to the neutral position"},
     {5, "Right Virtual Stop", "spnRightVirtStop", "lblRightVirtStop",
      "The longest pulse that intensities can give, relative to the neutral position"},
     {6, "Default Position", "spnDefaultPos", "lblDefaultPos",
      "Where the servo rests, relative to the neutral position"}}};
constexpr int kHeadingRow = 3;  // of those that are measured from the neutral position
constexpr int kRemarksRow = 7;

// Each test stands beside the parameter that it tries; that of the stops beside both.
struct Test {
  const char* what;
  const char* tip;
  int row, rows;
  Parameter after;  // the spin button before it in the tab order
};
constexpr std::array<Test, LiveTest::kTestButtons> kTests{
    {{"virtual pulse range",
      "Moves the servo to and fro through its virtual range, until the button is pressed again.", 1, 1,
      Parameter::kVirtualRange},
     {"virtual stops",
      "Moves the servo to and fro between its virtual stops, until the button is pressed again.", 4, 2,
      Parameter::kRightStop},
     {"default position", "Moves the servo to its default position.", 6, 1, Parameter::kDefaultPosition},
     {"actual pulse range",
      "Moves the servo to and fro through its whole actual range, until the button is pressed again.", 0, 1,
      Parameter::kActualRange},
     {"centre", "Moves the servo to the centre, 1500 µs.", 2, 1, Parameter::kNeutralTrim}}};

QString WithSign(int value) { return (value < 1 ? QString() : QStringLiteral("+")) + QString::number(value); }

QString CaptionOf(Parameter parameter, int value) {
  switch (parameter) {
    case Parameter::kActualRange:
      return QString::number(kCentrePulseWidth + value);
    case Parameter::kVirtualRange:
      return QString::number(value) + QLatin1Char(']');
    case Parameter::kLeftStop:
      return QString::number(value);
    case Parameter::kRightStop:
      return QLatin1Char('+') + QString::number(value);
    case Parameter::kNeutralTrim:
    case Parameter::kDefaultPosition:
      break;
  }
  return WithSign(value);
}

// The pulse widths that result from the parameter.
QString PhysicalValue(Parameter parameter, const ChannelConfig& values) {
  const auto range = [](const PulsePair& pair) {
    return QStringLiteral("%1 to %2 µs").arg(pair[0]).arg(pair[1]);
  };
  const auto one = [](Microseconds value) { return QStringLiteral("%1 µs").arg(value); };
  switch (parameter) {
    case Parameter::kActualRange:
      return range(values.ActualRange);
    case Parameter::kVirtualRange:
      return range(values.VirtualRange);
    case Parameter::kNeutralTrim:
      return one(values.NeutralPosition);
    case Parameter::kLeftStop:
      return one(values.VirtualStops[0]);
    case Parameter::kRightStop:
      return one(values.VirtualStops[1]);
    case Parameter::kDefaultPosition:
      break;
  }
  return one(values.DefaultPosition);
}

}  // namespace

MotionParameters::MotionParameters(ChannelEditor& editor)
    : FrameBox(QStringLiteral("Motion Parameters")),
      editor_(editor),
      lblActPulseLeft_(Named(BoldLabel(), "lblActPulseLeft")),
      remarks_(Named(new RemarksLabel, "lblRemarks", 0)) {
  auto* grid = AddLayout<QGridLayout>(this, {12, 8, 12, 8});
  grid->setHorizontalSpacing(10);
  AddParameters(*grid);
  AddTests(*grid);
  grid->setColumnStretch(kName, 2);
  grid->setColumnStretch(kRightValue, 1);
  grid->addWidget(remarks_, kRemarksRow, kName, 1, kTest - kName + 1, Qt::AlignTop);
  grid->setRowStretch(kRemarksRow, 1);
}

void MotionParameters::AddParameters(QGridLayout& grid) {
  for (std::size_t i = 0; i < kRows.size(); ++i) {
    const Row& row = kRows[i];
    const auto parameter = static_cast<Parameter>(i);
    auto* spin = spins_[i] = Named(new CalmSpinBox, row.spin);
    auto* name = new QLabel(QString::fromUtf8(row.name));
    name->setBuddy(spin);
    spin->setAccessibleName(name->text());
    captions_[i] = Named(BoldLabel(), row.caption);
    grid.addWidget(name, row.row, kName);
    grid.addWidget(captions_[i], row.row, kRightValue);
    grid.addWidget(spin, row.row, kSpin);
    connect(spin, &QSpinBox::valueChanged, this,
            [this, parameter](int value) { Q_EMIT Edited(editor_.Change(parameter, value)); });
  }
  auto* bracket = Named(BoldLabel("[ +/-"), "Label13");
  grid.addWidget(lblActPulseLeft_, 0, kLeftValue, Qt::AlignRight | Qt::AlignVCenter);
  grid.addWidget(bracket, 1, kLeftValue, Qt::AlignRight | Qt::AlignVCenter);
  grid.addWidget(DimLabel("Relative to Neutral"), kHeadingRow, kName, 1, 3, Qt::AlignBottom);
  MakePressable(bracket);
  for (const Parameter parameter :
       {Parameter::kVirtualRange, Parameter::kLeftStop, Parameter::kRightStop, Parameter::kDefaultPosition}) {
    MakePressable(captions_[static_cast<std::size_t>(parameter)]);
  }
}

void MotionParameters::AddTests(QGridLayout& grid) {
  for (std::size_t i = 0; i < kTests.size(); ++i) {
    const Test& test = kTests[i];
    const int button = static_cast<int>(i);
    cmdTest_[i] = Named(new QPushButton, "cmdTest", i);
    Describe(cmdTest_[i], test.tip);
    ShowTestRunning(button, false);
    grid.addWidget(cmdTest_[i], test.row, kTest, test.rows, 1);
    setTabOrder(spins_[static_cast<std::size_t>(test.after)], cmdTest_[i]);
    connect(cmdTest_[i], &QAbstractButton::clicked, this, [this, button] { Q_EMIT TestPressed(button); });
  }
}

void MotionParameters::MakePressable(QLabel* label) {
  label->installEventFilter(this);
  label->setCursor(Qt::PointingHandCursor);
  Describe(label, "Press to see the physical values with trim.");
}

bool MotionParameters::eventFilter(QObject* object, QEvent* event) {
  if (event->type() == QEvent::MouseButtonPress) Q_EMIT LabelPressed(static_cast<QWidget*>(object));
  return FrameBox::eventFilter(object, event);
}

void MotionParameters::ShowTestRunning(int button, bool running) {
  const auto i = static_cast<std::size_t>(button);
  cmdTest_[i]->setText(running ? QStringLiteral("Stop") : QStringLiteral("Test"));
  cmdTest_[i]->setAccessibleName(
      (running ? QStringLiteral("Stop testing the %1") : QStringLiteral("Test the %1"))
          .arg(QString::fromUtf8(kTests[i].what)));
}

void MotionParameters::EnableTests(const QString& why_not) {
  for (QPushButton* test : cmdTest_) EnableUnless(why_not, test);
}

void MotionParameters::ShowValues() {
  lblActPulseLeft_->setNum(kCentrePulseWidth - editor_.Spin(Parameter::kActualRange).Value());
  for (std::size_t i = 0; i < kRows.size(); ++i) {
    const auto parameter = static_cast<Parameter>(i);
    const BoundedValue& value = editor_.Spin(parameter);
    spins_[i]->Show(value);
    captions_[i]->setText(CaptionOf(parameter, value.Value()));
    Describe(spins_[i], QStringLiteral("%1. From %2 to %3 µs; now %4.")
                            .arg(QString::fromUtf8(kRows[i].what))
                            .arg(value.Minimum())
                            .arg(value.Maximum())
                            .arg(PhysicalValue(parameter, editor_.WorkingValues())));
  }
}

}  // namespace tendril
