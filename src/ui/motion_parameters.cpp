#include "ui/motion_parameters.h"

#include <QEvent>
#include <QGridLayout>
#include <utility>

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
// In the order of Parameter. Row 3 has the heading of those that are measured from the neutral position.
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
constexpr int kHeadingRow = 3;
constexpr int kLastRow = 7;

// Each test stands beside the parameter that it tries; the one of the stops beside both. From top to bottom, as the
// Tab key goes.
struct TestPlace {
  std::size_t test;
  int row, rows;
  Parameter after;  // the spin button before it
};
constexpr std::array<TestPlace, LiveTest::kTestButtons> kTestPlaces{{{3, 0, 1, Parameter::kActualRange},
                                                                     {0, 1, 1, Parameter::kVirtualRange},
                                                                     {4, 2, 1, Parameter::kNeutralTrim},
                                                                     {1, 4, 2, Parameter::kRightStop},
                                                                     {2, 6, 1, Parameter::kDefaultPosition}}};

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

// The pulse widths that the parameter comes to.
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

MotionParameters::MotionParameters(ChannelEditor& editor, Events events,
                                   const std::array<QPushButton*, LiveTest::kTestButtons>& test_buttons,
                                   QWidget* parent)
    : FrameBox(QStringLiteral("Motion Parameters"), parent),
      editor_(editor),
      events_(std::move(events)),
      lblActPulseLeft_(Named(BoldLabel({}), QStringLiteral("lblActPulseLeft"))),
      remarks_(Named(new RemarksLabel, ArrayName(QStringLiteral("lblRemarks"), 0))) {
  auto* grid = new QGridLayout(this);
  grid->setContentsMargins(12, 8, 12, 8);
  grid->setHorizontalSpacing(10);
  for (std::size_t i = 0; i < kRows.size(); ++i) {
    const Row& row = kRows[i];
    const auto parameter = static_cast<Parameter>(i);
    auto* spin = Named(new CalmSpinBox, QString::fromUtf8(row.spin));
    auto* name = new QLabel(QString::fromUtf8(row.name));
    name->setBuddy(spin);
    spin->setAccessibleName(name->text());
    spins_[i] = spin;
    captions_[i] = Named(BoldLabel({}), QString::fromUtf8(row.caption));
    grid->addWidget(name, row.row, kName);
    grid->addWidget(captions_[i], row.row, kRightValue);
    grid->addWidget(spin, row.row, kSpin);
    QObject::connect(spin, &QSpinBox::valueChanged, this,
                     [this, parameter](int value) { events_.edited(editor_.Change(parameter, value)); });
  }
  auto* bracket = Named(BoldLabel(QStringLiteral("[ +/-")), QStringLiteral("Label13"));
  grid->addWidget(lblActPulseLeft_, 0, kLeftValue, Qt::AlignRight | Qt::AlignVCenter);
  grid->addWidget(bracket, 1, kLeftValue, Qt::AlignRight | Qt::AlignVCenter);
  grid->addWidget(DimLabel(QStringLiteral("Relative to Neutral")), kHeadingRow, kName, 1, 3, Qt::AlignBottom);
  for (const TestPlace& place : kTestPlaces) {
    grid->addWidget(test_buttons[place.test], place.row, kTest, place.rows, 1);
    setTabOrder(spins_[static_cast<std::size_t>(place.after)], test_buttons[place.test]);
  }
  grid->setColumnStretch(kName, 2);
  grid->setColumnStretch(kRightValue, 1);
  grid->addWidget(remarks_, kLastRow, kName, 1, kTest - kName + 1, Qt::AlignTop);
  grid->setRowStretch(kLastRow, 1);

  for (QLabel* label : {bracket, captions_[static_cast<std::size_t>(Parameter::kVirtualRange)],
                        captions_[static_cast<std::size_t>(Parameter::kLeftStop)],
                        captions_[static_cast<std::size_t>(Parameter::kRightStop)],
                        captions_[static_cast<std::size_t>(Parameter::kDefaultPosition)]}) {
    label->installEventFilter(this);
    label->setCursor(Qt::PointingHandCursor);
    label->setToolTip(QStringLiteral("Press to see the physical values with trim."));
  }
}

bool MotionParameters::eventFilter(QObject* object, QEvent* event) {
  if (event->type() == QEvent::MouseButtonPress) events_.values_wanted(*static_cast<QWidget*>(object));
  return FrameBox::eventFilter(object, event);
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
