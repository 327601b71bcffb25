#include "ui/chosen_servo.h"

#include <QVBoxLayout>

namespace tendril {

ChosenServo::ChosenServo(const ChannelEditor& editor, const ChannelTable& working)
    : FrameBox(QStringLiteral("Channel")),
      editor_(editor),
      working_(working),
      servo_or_output_(new QStackedWidget),
      ServoSimulator1_(Named(new ServoSimulator, "ServoSimulator1")),
      lblOutput_(Named(BoldLabel(), "lblOutput")) {
  ServoSimulator1_->setEnabled(false);
  ServoSimulator1_->setAccessibleName(QStringLiteral("Chosen channel"));
  Describe(ServoSimulator1_, "The chosen channel's servo.");
  ServoSimulator1_->DisplaySize(kLargeSimulator);
  connect(ServoSimulator1_, &ServoSimulator::Resized, this,
          [this](Microseconds arm) { RefeedResizedSimulator(*ServoSimulator1_, Values(), arm); });

  SetPaletteColour(lblOutput_, QPalette::Window, QColor(0xC0, 0xC0, 0xC0));
  SetPaletteColour(lblOutput_, QPalette::WindowText, Qt::black);
  lblOutput_->setAutoFillBackground(true);
  lblOutput_->setAlignment(Qt::AlignCenter);
  ScaleType(lblOutput_, 1.5);

  servo_or_output_->addWidget(ServoSimulator1_);
  servo_or_output_->addWidget(lblOutput_);
  AddLayout<QVBoxLayout>(this, {4, 4, 4, 4})->addWidget(servo_or_output_);
}

void ChosenServo::ShowChannel() {
  const auto channel = editor_.Channel();
  if (!channel) return;
  const QString caption = QStringLiteral("CHAN %1").arg(*channel + 1);
  ServoSimulator1_->DisplayCaption(caption);
  const QString kind = OutputLabel(working_.At(*channel).PortType);
  lblOutput_->setText(caption + QStringLiteral("\n\n") + kind);
  servo_or_output_->setCurrentIndex(kind.isEmpty() ? 0 : 1);
}

ChannelConfig ChosenServo::Values() const {
  return editor_.Channel() ? working_.At(*editor_.Channel()) : editor_.WorkingValues();
}

}  // namespace tendril
