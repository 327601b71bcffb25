#include "ui/chosen_servo.h"

#include <QVBoxLayout>

namespace tendril {
namespace {

// Smaller than the simulator asks for: in a low window the servo gives way.
constexpr QSize kSmallestServo(120, 120);

}  // namespace

ChosenServo::ChosenServo(const ChannelEditor& editor, const ChannelTable& working)
    : QGroupBox(QStringLiteral("Channel")),
      editor_(editor),
      working_(working),
      servo_or_output_(new QStackedWidget),
      ServoSimulator1_(Named(new ServoSimulator, "ServoSimulator1")),
      lblOutput_(Named(BoldLabel(), "lblOutput")) {
  setObjectName("fraChosenServo");
  ServoSimulator1_->setEnabled(false);
  ServoSimulator1_->setAccessibleName(QStringLiteral("Chosen channel"));
  Describe(ServoSimulator1_, "The chosen channel's servo.");
  ServoSimulator1_->DisplaySize(kLargeSimulator);
  ServoSimulator1_->setMinimumSize(kSmallestServo);
  connect(ServoSimulator1_, &ServoSimulator::Resized, this,
          [this](Microseconds arm) { RefeedResizedSimulator(*ServoSimulator1_, Values(), arm); });

  SetPaletteColour(lblOutput_, QPalette::Window, QColor(0xC0, 0xC0, 0xC0));
  SetPaletteColour(lblOutput_, QPalette::WindowText, Qt::black);
  lblOutput_->setAutoFillBackground(true);
  lblOutput_->setAlignment(Qt::AlignCenter);
  ScaleType(lblOutput_, 1.5);

  servo_or_output_->addWidget(ServoSimulator1_);
  servo_or_output_->addWidget(lblOutput_);
  auto* column = AddLayout<QVBoxLayout>(this, {4, 4, 4, 4}, 4);
  column->addWidget(servo_or_output_, 1);
  column->addWidget(legend_);
}

void ChosenServo::ShowChannel() {
  const auto channel = editor_.Channel();
  if (!channel) return;
  const QString caption = QStringLiteral("CHAN %1").arg(*channel + 1);
  setTitle(caption);
  ServoSimulator1_->DisplayCaption(caption);
  ServoSimulator1_->setAccessibleName(QStringLiteral("Chosen channel, %1").arg(*channel + 1));
  const QString kind = OutputLabel(working_.At(*channel).PortType);
  lblOutput_->setText(caption + QStringLiteral("\n\n") + kind);
  servo_or_output_->setCurrentIndex(kind.isEmpty() ? 0 : 1);
  legend_->setVisible(kind.isEmpty());
}

ChannelConfig ChosenServo::Values() const {
  return editor_.Channel() ? working_.At(*editor_.Channel()) : editor_.WorkingValues();
}

}  // namespace tendril
