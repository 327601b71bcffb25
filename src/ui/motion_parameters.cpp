#include "ui/motion_parameters.h"

#include <QEvent>
#include <QStyle>
#include <algorithm>
#include <utility>

#include "ui/test_icons.h"

namespace tendril {
namespace {

enum Column { kName, kGap1, kLeftValue, kRightValue, kGap2, kSpin, kGap3, kPulseWidth, kGap4, kTest, kRest };

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
// What is compared of each parameter, in the same order.
constexpr std::array kComparedParts{ComparedPart::kActualRange,     ComparedPart::kVirtualRange,
                                    ComparedPart::kNeutralPosition, ComparedPart::kLeftStop,
                                    ComparedPart::kRightStop,       ComparedPart::kDefaultPosition};
constexpr int kHeadingRow = 3;  // of those that are measured from the neutral position
constexpr int kGapRow = 7;
constexpr int kScaleRow = 8;
constexpr int kNotesRow = 9;
constexpr int kRestRow = 10;
constexpr int kGap = 12;  // between two columns
constexpr int kMinGap = 2;
constexpr int kGapOfPulseWidth = 4;  // which keeps room for its sign
constexpr int kCaptionGap = 1;
constexpr int kIconGap = 4;  // between icon and text of a button

// Each test stands beside the parameter that it tries; that of the stops beside both.
struct Test {
  const char* what;
  const char* tip;
  TestIcon icon;
  int row, rows;
  Parameter after;  // the spin button before it in the tab order
};
constexpr std::array<Test, LiveTest::kTestButtons> kTests{
    {{"virtual pulse range",
      "Moves the servo to and fro through its stored virtual range, beyond the virtual stops, until the "
      "button is pressed again. Begins and ends at 1500 µs.",
      TestIcon::kSweep, 1, 1, Parameter::kVirtualRange},
     {"virtual stops",
      "Moves the servo to and fro between its stored virtual stops, until the button is pressed again. "
      "Begins and ends at 1500 µs.",
      TestIcon::kSweep, 4, 2, Parameter::kRightStop},
     {"default position", "Moves the servo to its stored default position.", TestIcon::kStep, 6, 1,
      Parameter::kDefaultPosition},
     {"actual pulse range",
      "Warning: goes beyond the virtual stops, to the servo's physical ends. Moves the servo to and fro "
      "through its whole stored actual range, until the button is pressed again. Begins and ends at 1500 µs.",
      TestIcon::kDangerSweep, 0, 1, Parameter::kActualRange},
     {"centre", "Moves the servo to the centre, 1500 µs.", TestIcon::kStep, 2, 1, Parameter::kNeutralTrim}}};

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

// Shows the pulse widths that result from the parameter.
void ShowPhysicalValue(Parameter parameter, const ChannelConfig& values, PulseWidthLabel& label) {
  switch (parameter) {
    case Parameter::kActualRange:
      return label.ShowRange(values.ActualRange);
    case Parameter::kVirtualRange:
      return label.ShowRange(values.VirtualRange);
    case Parameter::kNeutralTrim:
      return label.ShowPosition(values.NeutralPosition);
    case Parameter::kLeftStop:
      return label.ShowPosition(values.VirtualStops[0]);
    case Parameter::kRightStop:
      return label.ShowPosition(values.VirtualStops[1]);
    case Parameter::kDefaultPosition:
      break;
  }
  label.ShowPosition(values.DefaultPosition);
}

// What the parameter's number means, and the pulse width that it is relative to.
std::pair<NumberMeaning, int> MeaningOf(Parameter parameter, Microseconds neutral) {
  switch (parameter) {
    case Parameter::kActualRange:
      return {NumberMeaning::kHalfWidth, kCentrePulseWidth};
    case Parameter::kVirtualRange:
      return {NumberMeaning::kHalfWidth, neutral};
    case Parameter::kNeutralTrim:
      return {NumberMeaning::kDistance, kCentrePulseWidth};
    case Parameter::kLeftStop:
    case Parameter::kRightStop:
    case Parameter::kDefaultPosition:
      break;
  }
  return {NumberMeaning::kDistance, neutral};
}

// A caption beside a spin button, less prominent than the pulse widths.
QLabel* CaptionLabel(QAnyStringView text = {}) {
  auto* label = DimLabel(text);
  label->setAlignment(Qt::AlignRight | Qt::AlignVCenter);
  return label;
}

}  // namespace

MotionParameters::MotionParameters(ChannelEditor& editor, const ChannelTable& working,
                                   const Comparison& comparison)
    : QGroupBox(QStringLiteral("Motion Parameters")),
      editor_(editor),
      working_(working),
      comparison_(comparison),
      lblActPulseLeft_(Named(CaptionLabel(), "lblActPulseLeft")),
      heading_(DimLabel("Relative to Neutral")),
      typed_(Named(new NoticeLabel(1), "lblTyped")),
      notes_(new EditorNotes),
      scale_(Named(new PulseScale, "PulseScale")),
      hint_(Named(new QLabel(QStringLiteral("Choose a channel: click a servo, or Ctrl+1")), "lblNoChannel")) {
  auto* grid = AddLayout<QGridLayout>(this, {6, 2, 6, 2});
  grid->setHorizontalSpacing(0);  // the gaps are columns, which a narrow window shrinks
  grid->setVerticalSpacing(1);
  AddParameters(*grid);
  AddTests(*grid);
  AddSpacing(*grid);
  for (std::size_t button = 0; button < kTests.size(); ++button)
    ShowTestRunning(static_cast<int>(button), false);
  const int columns = kRest - kName + 1;
  grid->addWidget(scale_, kScaleRow, kName, 1, columns);
  grid->addWidget(hint_, kScaleRow, kName, 1, columns, Qt::AlignCenter);
  grid->addWidget(notes_, kNotesRow, kName, 1, columns);
  for (const Row& row : kRows) grid->setRowStretch(row.row, 1);
  grid->setRowStretch(kGapRow, 1);
  grid->setRowStretch(kRestRow, 10);
  hint_->hide();
  connect(notes_, &EditorNotes::StorePressed, this, &MotionParameters::OnStore);
}

// The button hides when all is stored: its focus goes to a value that it stores.
void MotionParameters::OnStore() {
  if (notes_->isAncestorOf(window()->focusWidget())) {
    const Unstored unstored(editor_, working_);
    std::size_t first = 0;
    while (first + 1 < kParameterCount && !unstored.Has(static_cast<Parameter>(first))) ++first;
    spins_[first]->setFocus();
  }
  Q_EMIT StorePressed();
}

void MotionParameters::AddParameters(QGridLayout& grid) {
  for (std::size_t i = 0; i < kRows.size(); ++i) {
    const Row& row = kRows[i];
    auto* spin = spins_[i] = MakeSpin(i);
    auto* name = names_[i] = new QLabel(spin->accessibleName());
    name->setBuddy(spin);
    captions_[i] = Named(CaptionLabel(), row.caption);
    pulse_widths_[i] = new PulseWidthLabel;
    // Only the first two rows have a caption on the left, too.
    const int first = row.row <= 1 ? kRightValue : kLeftValue;
    grid.addWidget(name, row.row, kName);
    grid.addWidget(captions_[i], row.row, first, 1, kRightValue - first + 1);
    grid.addWidget(spin, row.row, kSpin);
    grid.addWidget(pulse_widths_[i], row.row, kPulseWidth);
  }
  auto* bracket = Named(CaptionLabel("[ +/-"), "Label13");
  grid.addWidget(lblActPulseLeft_, 0, kLeftValue);
  grid.addWidget(bracket, 1, kLeftValue);
  grid.addWidget(heading_, kHeadingRow, kName, 1, kSpin, Qt::AlignBottom);
  grid.addWidget(typed_, kHeadingRow, kName, 1, kRest - kName + 1, Qt::AlignBottom);
  MakePressable(bracket);
  for (const Parameter parameter :
       {Parameter::kVirtualRange, Parameter::kLeftStop, Parameter::kRightStop, Parameter::kDefaultPosition}) {
    MakePressable(captions_[static_cast<std::size_t>(parameter)]);
  }
}

CalmSpinBox* MotionParameters::MakeSpin(std::size_t index) {
  auto* spin = Named(new CalmSpinBox, kRows[index].spin);
  spin->setAccessibleName(QString::fromUtf8(kRows[index].name));
  connect(spin, &QSpinBox::valueChanged, this, [this, spin, index](int value) {
    const auto parameter = static_cast<Parameter>(index);
    // Assistive technology can set a disabled one.
    if (!spin->isEnabled()) return spin->Show(editor_.Spin(parameter));
    const FollowUp follow_up = editor_.Change(parameter, value);
    Q_EMIT Edited(QString::fromUtf8(kRows[index].name), follow_up);
  });
  connect(spin, &CalmSpinBox::HintChanged, this, [this](const QString& hint, const QString& spoken) {
    typed_->ShowNotice(hint, spoken);
    heading_->setVisible(hint.isEmpty());
  });
  connect(spin, &CalmSpinBox::Dropped, this, &MotionParameters::NumberDropped);
  return spin;
}

void MotionParameters::AddTests(QGridLayout& grid) {
  for (std::size_t i = 0; i < kTests.size(); ++i) {
    const Test& test = kTests[i];
    const int button = static_cast<int>(i);
    cmdTest_[i] = Named(new QPushButton, "cmdTest", i);
    cmdTest_[i]->setIcon(MakeTestIcon(test.icon, *cmdTest_[i]));
    cmdTest_[i]->setIconSize(TestIconSize(*cmdTest_[i]));
    Describe(cmdTest_[i], test.tip);
    grid.addWidget(cmdTest_[i], test.row, kTest, test.rows, 1);
    setTabOrder(spins_[static_cast<std::size_t>(test.after)], cmdTest_[i]);
    connect(cmdTest_[i], &QAbstractButton::clicked, this, [this, button] { Q_EMIT TestPressed(button); });
  }
}

// What is left of the width goes to the right of the test buttons. No text that changes moves anything.
void MotionParameters::AddSpacing(QGridLayout& grid) {
  grid.addItem(new QSpacerItem(kGapOfPulseWidth, 0, QSizePolicy::Preferred), 0, kGap3);
  for (const int gap : {kGap1, kGap2, kGap4}) {
    grid.addItem(new QSpacerItem(kGap, 0, QSizePolicy::Preferred), 0, gap);
    grid.setColumnMinimumWidth(gap, kMinGap);
  }
  grid.setColumnMinimumWidth(kGap2, kMinGap + 1);
  const QFontMetrics metrics = fontMetrics();
  grid.setColumnMinimumWidth(kLeftValue, metrics.horizontalAdvance(QStringLiteral("[ +/-")) + kCaptionGap);
  grid.setColumnMinimumWidth(kRightValue, metrics.horizontalAdvance(QStringLiteral("-0000]")) + 1);

  QPushButton& widest = *cmdTest_[0];
  widest.setText(QStringLiteral("Stop"));
  grid.addItem(new QSpacerItem(widest.sizeHint().width(), 0, QSizePolicy::Preferred), kHeadingRow, kTest);
  // Styles ask for more room than a button needs.
  const int needed = widest.iconSize().width() + kIconGap + metrics.horizontalAdvance(widest.text()) +
                     style()->pixelMetric(QStyle::PM_ButtonMargin) +
                     2 * style()->pixelMetric(QStyle::PM_DefaultFrameWidth);
  for (QPushButton* test : cmdTest_) test->setMinimumWidth(needed);
  grid.setColumnStretch(kRest, 1);
}

void MotionParameters::MakePressable(QLabel* label) {
  label->installEventFilter(this);
  label->setCursor(Qt::PointingHandCursor);
  Describe(label, "Press to see the physical values with trim.");
}

bool MotionParameters::eventFilter(QObject* object, QEvent* event) {
  if (event->type() == QEvent::MouseButtonPress) Q_EMIT LabelPressed(static_cast<QWidget*>(object));
  return QGroupBox::eventFilter(object, event);
}

void MotionParameters::ShowTestRunning(int button, bool running) {
  const auto i = static_cast<std::size_t>(button);
  cmdTest_[i]->setText(running ? QStringLiteral("Stop") : QStringLiteral("Test"));
  cmdTest_[i]->setAccessibleName(
      (running ? QStringLiteral("Stop testing the %1") : QStringLiteral("Test the %1"))
          .arg(QString::fromUtf8(kTests[i].what)));
}

void MotionParameters::EnableEditing(const QString& why_not) {
  for (CalmSpinBox* spin : spins_) EnableUnless(why_not, spin);
  notes_->EnableStore(why_not);
}

bool MotionParameters::Repeats() const {
  return std::any_of(spins_.begin(), spins_.end(), [](const CalmSpinBox* spin) { return spin->Repeats(); });
}

void MotionParameters::EnableTests(const QString& why_not) {
  for (QPushButton* test : cmdTest_) EnableUnless(why_not, test);
}

// Dimmed, not disabled: the spin buttons work without a channel, too.
void MotionParameters::ShowHasChannel() {
  const bool has_channel = editor_.Channel().has_value();
  if (hint_->isHidden() == has_channel) return;
  hint_->setVisible(!has_channel);
  const auto role = has_channel ? QPalette::WindowText : QPalette::PlaceholderText;
  for (QLabel* name : names_) name->setForegroundRole(role);
  for (QLabel* pulse_width : pulse_widths_) pulse_width->setForegroundRole(role);
}

void MotionParameters::ShowValues() {
  ShowHasChannel();
  const ChannelConfig values = editor_.WorkingValues();
  const Unstored unstored(editor_, working_);
  scale_->ShowValues(editor_.Channel() ? std::optional(values) : std::nullopt, unstored);
  notes_->ShowUnstored(unstored.Sentence(), StoreCaption(editor_));
  lblActPulseLeft_->setNum(kCentrePulseWidth - editor_.Spin(Parameter::kActualRange).Value());
  for (std::size_t i = 0; i < kRows.size(); ++i) {
    const auto parameter = static_cast<Parameter>(i);
    const BoundedValue& value = editor_.Spin(parameter);
    const auto [meaning, origin] = MeaningOf(parameter, values.NeutralPosition);
    spins_[i]->SetMeaning(meaning, origin);
    spins_[i]->Show(value);
    captions_[i]->setText(CaptionOf(parameter, value.Value()));
    ShowPhysicalValue(parameter, values, *pulse_widths_[i]);
  }
  DescribeValues(unstored);
}

void MotionParameters::ShowDifferences() { DescribeValues(Unstored(editor_, working_)); }

void MotionParameters::DescribeValues(const Unstored& unstored) {
  for (std::size_t i = 0; i < kRows.size(); ++i) DescribeValue(i, unstored);
  const auto channel = editor_.Channel();
  const std::string differs = channel ? comparison_.InWords(*channel) : std::string();
  notes_->ShowDifferences(QString::fromStdString(differs).split(QLatin1Char('\n'), Qt::SkipEmptyParts));
}

void MotionParameters::DescribeValue(std::size_t index, const Unstored& unstored) {
  const auto parameter = static_cast<Parameter>(index);
  PulseWidthLabel& pulse_width = *pulse_widths_[index];
  const QString unless_stored = unstored.Has(parameter) ? QStringLiteral(", not stored yet") : QString();
  const auto channel = editor_.Channel();
  const QString differs =
      channel ? QString::fromStdString(comparison_.InWords(*channel, kComparedParts[index])) : QString();
  const QString spoken = pulse_width.InFull() + unless_stored;
  pulse_width.ShowStored(unless_stored.isEmpty());
  pulse_width.ShowDiffers(differs);
  pulse_width.setAccessibleName(names_[index]->text() + QStringLiteral(": ") + spoken +
                                (differs.isEmpty() ? QString() : QStringLiteral(", ") + differs));
  const BoundedValue& value = editor_.Spin(parameter);
  Describe(spins_[index], QStringLiteral("%1. From %2 to %3 µs; now %4.")
                              .arg(QString::fromUtf8(kRows[index].what))
                              .arg(value.Minimum())
                              .arg(value.Maximum())
                              .arg(spoken));
  DescribeDifference(spins_[index], differs);
}

}  // namespace tendril
