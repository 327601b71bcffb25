#include "ui/channel_strip.h"

#include <QStackedWidget>

#include "ui/channel_columns.h"
#include "ui/controls.h"
#include "ui/simulator_feed.h"

namespace tendril {
namespace {

// Eight of them fit into a window 1024 wide.
constexpr QSize kSmallestSimulator(96, 96);

// The background that selected servos have.
constexpr char kSelectedOutput[] =
    "QPushButton { background-color: #0000ff; color: white; border: 2px solid #0000ff; }"
    "QPushButton:focus { border-color: white; }";

}  // namespace

ChannelStrip::ChannelStrip(const ChannelTable& working, QWidget* parent)
    : FrameBox(QStringLiteral("Click to Select Channel"), parent), working_(working) {
  arms_.fill(kCentrePulseWidth);
  QGridLayout* grid = MakeChannelColumns(this);
  for (int channel = 0; channel < kChannelColumns; ++channel) {
    const auto slot = static_cast<std::size_t>(channel);
    auto* simulator = Named(new ServoSimulator, ArrayName(QStringLiteral("ServoSimulator2"), channel));
    simulator->setMinimumSize(kSmallestSimulator);
    Describe(simulator,
             QStringLiteral("Chooses channel %1, to edit it and to move its servo.").arg(channel + 1));
    auto* output = Named(new QPushButton, ArrayName(QStringLiteral("cmdDigitalOutput"), channel));
    Describe(output, QStringLiteral("Chooses channel %1, to edit it.").arg(channel + 1));
    output->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
    QFont bold = output->font();
    bold.setBold(true);
    output->setFont(bold);
    auto* cell = new QStackedWidget;
    cell->addWidget(simulator);
    cell->addWidget(output);
    grid->addWidget(cell, 0, channel);
    cells_[slot] = cell;

    ServoSimulator2_[slot] = simulator;
    cmdDigitalOutput_[slot] = output;
    QObject::connect(simulator, &ServoSimulator::Resized, this, [this, simulator, slot] {
      RefeedResizedSimulator(*simulator, working_.At(slot), arms_[slot]);
    });
    const auto select = [this, slot] {
      if (select_) select_(slot);
    };
    QObject::connect(simulator, &ServoSimulator::Clicked, this, select);
    QObject::connect(output, &QAbstractButton::clicked, this, select);
  }
}

void ChannelStrip::SetUpSimulators() {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    const QString number = QString::number(slot + 1);
    ServoSimulator2_[slot]->DisplaySize(kSmallSimulator);
    ServoSimulator2_[slot]->DisplayCaption(QStringLiteral("CHAN %1").arg(number));
    ShowKind(slot);
  }
}

void ChannelStrip::ShowSelected(std::size_t channel) {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    ServoSimulator2_[slot]->SelectServo(slot == channel);
    cmdDigitalOutput_[slot]->setStyleSheet(slot == channel ? QString::fromLatin1(kSelectedOutput)
                                                           : QString());
  }
}

void ChannelStrip::ShowKinds() {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) ShowKind(slot);
}

void ChannelStrip::ShowKind(std::size_t slot) {
  const QString label = OutputLabel(working_.At(slot).PortType);
  QPushButton& output = *cmdDigitalOutput_[slot];
  output.setText(label.isEmpty() ? OutputLabel(kPortDigital) : label);
  output.setAccessibleName(QStringLiteral("Channel %1, %2")
                               .arg(slot + 1)
                               .arg(output.text().replace(QLatin1Char('\n'), QLatin1Char(' '))));
  QWidget* shown = label.isEmpty() ? static_cast<QWidget*>(ServoSimulator2_[slot]) : &output;
  if (cells_[slot]->currentWidget() == shown) return;
  // The one that takes the place of the other takes the focus too.
  const bool had_focus = cells_[slot]->currentWidget()->hasFocus();
  cells_[slot]->setCurrentWidget(shown);
  if (had_focus) shown->setFocus();
}

void ChannelStrip::UpdateSimulator(std::size_t channel, Microseconds arm) {
  arms_[channel] = arm;
  FeedSimulator(*ServoSimulator2_[channel], working_.At(channel), kSmallSimulator, arm);
}

void ChannelStrip::MoveArm(std::size_t channel, Microseconds arm) {
  arms_[channel] = arm;
  ServoSimulator2_[channel]->SetMovingArmPositionUS(arm);
}

}  // namespace tendril
