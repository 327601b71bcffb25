#include "ui/channel_strip.h"

#include "ui/channel_columns.h"
#include "ui/simulator_feed.h"

namespace tendril {
namespace {

// Eight of them fit into a window 910 wide, and all of a window 700 high.
constexpr QSize kSmallestSimulator(80, 72);
constexpr char kServoTip[] = "Chooses channel %1, to edit it and to move its servo (Ctrl+%1).";
constexpr char kOutputTip[] = "Chooses channel %1, to edit it (Ctrl+%1).";

}  // namespace

ChannelStrip::ChannelStrip(const ChannelTable& working)
    : QGroupBox(QStringLiteral("Click to Select Channel")), working_(working) {
  QGridLayout* grid = MakeChannelColumns(this);
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    grid->addWidget(MakeCell(channel), 0, static_cast<int>(channel));
  }
  ShowKinds();
}

QWidget* ChannelStrip::MakeCell(std::size_t channel) {
  auto* simulator = ServoSimulator2_[channel] = Named(new ServoSimulator, "ServoSimulator2", channel);
  simulator->setMinimumSize(kSmallestSimulator);
  simulator->DisplaySize(kSmallSimulator);
  const QString caption = QStringLiteral("CHAN %1").arg(channel + 1);
  simulator->DisplayCaption(caption);
  Describe(simulator, QString::fromUtf8(kServoTip).arg(channel + 1));

  auto* output = cmdDigitalOutput_[channel] = Named(new OutputButton(caption), "cmdDigitalOutput", channel);
  Describe(output, QString::fromUtf8(kOutputTip).arg(channel + 1));

  connect(simulator, &ServoSimulator::Resized, this, [this, simulator, channel](Microseconds arm) {
    RefeedResizedSimulator(*simulator, working_.At(channel), arm);
  });
  const auto choose = [this, channel] { Q_EMIT ChannelChosen(channel); };
  connect(simulator, &ServoSimulator::Clicked, this, choose);
  connect(output, &QAbstractButton::clicked, this, choose);

  auto* cell = cells_[channel] = new QStackedWidget;
  cell->addWidget(simulator);
  cell->addWidget(output);
  return cell;
}

void ChannelStrip::ShowSelected(std::size_t channel) {
  for (std::size_t i = 0; i < kPortCount; ++i) {
    ServoSimulator2_[i]->SelectServo(i == channel);
    cmdDigitalOutput_[i]->Select(i == channel);
  }
  Reveal(*cells_[channel]);  // a key may have chosen it
}

// A choice stores the values of the channel that was chosen before.
void ChannelStrip::EnableControls(const QString& running_command) {
  for (ServoSimulator* simulator : ServoSimulator2_) EnableUnless(running_command, simulator);
  for (OutputButton* output : cmdDigitalOutput_) EnableUnless(running_command, output);
}

void ChannelStrip::ShowKinds() {
  for (std::size_t channel = 0; channel < kPortCount; ++channel) ShowKind(channel);
}

void ChannelStrip::ShowKind(std::size_t channel) {
  const QString label = OutputLabel(working_.At(channel).PortType);
  OutputButton& output = *cmdDigitalOutput_[channel];
  output.setText(label.isEmpty() ? OutputLabel(kPortDigital) : label);
  output.setAccessibleName(QStringLiteral("Channel %1, %2")
                               .arg(channel + 1)
                               .arg(output.text().replace(QLatin1Char('\n'), QLatin1Char(' '))));
  QWidget* shown = label.isEmpty() ? static_cast<QWidget*>(ServoSimulator2_[channel]) : &output;
  QStackedWidget& cell = *cells_[channel];
  if (cell.currentWidget() == shown) return;
  // The one that takes the place of the other takes the focus too.
  const bool had_focus = cell.currentWidget()->hasFocus();
  cell.setCurrentWidget(shown);
  if (had_focus) shown->setFocus();
}

void ChannelStrip::UpdateSimulator(std::size_t channel, Microseconds arm) {
  FeedSimulator(*ServoSimulator2_[channel], working_.At(channel), arm);
}

void ChannelStrip::ShowChanged(const std::vector<std::size_t>& channels) {
  std::array<bool, kPortCount> changed{};
  for (const std::size_t channel : channels) changed.at(channel) = true;
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    if (changed_[channel] == changed[channel]) continue;
    changed_[channel] = changed[channel];
    ShowMarks(channel);
  }
}

void ChannelStrip::ShowDiffers(std::size_t channel, const QString& how) {
  if (differs_.at(channel) == how) return;
  differs_[channel] = how;
  ShowMarks(channel);
}

void ChannelStrip::ShowMarks(std::size_t channel) {
  const QString& differs = differs_[channel];
  QString meaning = changed_[channel]
                        ? QStringLiteral("Changed since it was read, sent or taken from a preset")
                        : QString();
  const QString dot = meaning.isEmpty() ? QString() : QStringLiteral("\n• ") + meaning;
  if (!meaning.isEmpty() && !differs.isEmpty()) meaning += QStringLiteral(". ");
  meaning += differs;
  const auto show = [&](auto& picture, const char* tip) {
    picture.Mark(changed_[channel]);
    picture.MarkDiffers(!differs.isEmpty());
    picture.setAccessibleDescription(meaning);
    Describe(&picture, QString::fromUtf8(tip).arg(channel + 1) + dot);
    DescribeDifference(&picture, differs);
  };
  show(*ServoSimulator2_[channel], kServoTip);
  show(*cmdDigitalOutput_[channel], kOutputTip);
}

void ChannelStrip::MoveArm(std::size_t channel, Microseconds arm) {
  ServoSimulator2_[channel]->SetMovingArmPositionUS(arm);
}

}  // namespace tendril
