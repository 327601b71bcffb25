#include "ui/channel_strip.h"

#include <QStackedWidget>

#include "ui/channel_columns.h"
#include "ui/controls.h"
#include "ui/simulator_feed.h"

namespace tendril {
namespace {

// Eight of them fit into a window 1024 wide.
constexpr QSize kSmallestSimulator(96, 96);

}  // namespace

ChannelStrip::ChannelStrip(const ChannelTable& working, QWidget* parent)
    : QGroupBox(QStringLiteral("Click to Select Channel"), parent), working_(working) {
  arms_.fill(kCentrePulseWidth);
  const QString no_editor = QStringLiteral("Editing a channel is not in this version yet.");
  QGridLayout* grid = MakeChannelColumns(this);
  for (int channel = 0; channel < kChannelColumns; ++channel) {
    const auto slot = static_cast<std::size_t>(channel);
    auto* simulator = Named(new ServoSimulator, ArrayName(QStringLiteral("ServoSimulator2"), channel));
    simulator->setMinimumSize(kSmallestSimulator);
    Describe(simulator,
             QStringLiteral("Chooses channel %1, to look at it and to move its servo.").arg(channel + 1));
    auto* output = Named(new QPushButton, ArrayName(QStringLiteral("cmdDigitalOutput"), channel));
    Disable(output, no_editor);
    auto* cell = new QStackedWidget;
    cell->addWidget(simulator);
    cell->addWidget(output);
    grid->addWidget(cell, 0, channel);

    ServoSimulator2_[slot] = simulator;
    cmdDigitalOutput_[slot] = output;
    QObject::connect(simulator, &ServoSimulator::Resized, this, [this, simulator, slot] {
      RefeedResizedSimulator(*simulator, working_.At(slot), arms_[slot]);
    });
    QObject::connect(simulator, &ServoSimulator::Clicked, this, [this, slot] {
      if (select_) select_(slot);
    });
  }
}

void ChannelStrip::SetUpSimulators() {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    const QString number = QString::number(slot + 1);
    ServoSimulator2_[slot]->DisplaySize(kSmallSimulator);
    ServoSimulator2_[slot]->DisplayCaption(QStringLiteral("CHAN %1").arg(number));
    cmdDigitalOutput_[slot]->setText(QStringLiteral("DIGITAL\nPORT"));
    cmdDigitalOutput_[slot]->setAccessibleName(QStringLiteral("Channel %1, digital").arg(number));
  }
}

void ChannelStrip::ShowSelected(std::size_t channel) {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) ServoSimulator2_[slot]->SelectServo(slot == channel);
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
