#include "ui/editor_area.h"

#include <QHBoxLayout>
#include <QVBoxLayout>
#include <utility>

#include "ui/controls.h"
#include "ui/simulator_feed.h"

namespace tendril {
namespace {

constexpr QColor kOutputPanel(0xC0, 0xC0, 0xC0);

}  // namespace

EditorArea::EditorArea(ChannelEditor& editor, const ChannelTable& working, Events events,
                       const std::array<QPushButton*, LiveTest::kTestButtons>& test_buttons, QWidget* parent)
    : QWidget(parent),
      editor_(editor),
      working_(working),
      parameters_(new MotionParameters(editor, std::move(events.parameters), test_buttons)),
      choices_(new ChannelChoices(editor, working, std::move(events.choices))) {
  auto* row = new QHBoxLayout(this);
  row->setContentsMargins(0, 0, 0, 0);
  row->addWidget(MakeServo(), 3);
  row->addWidget(parameters_, 5);
  row->addWidget(choices_, 2);
}

QWidget* EditorArea::MakeServo() {
  auto* frame = new FrameBox(QStringLiteral("Channel"));
  ServoSimulator1_ = Named(new ServoSimulator, QStringLiteral("ServoSimulator1"));
  Disable(ServoSimulator1_, QStringLiteral("The chosen channel's servo."));
  QObject::connect(ServoSimulator1_, &ServoSimulator::Resized, this,
                   [this] { RefeedResizedSimulator(*ServoSimulator1_, Values(), arm_); });

  lblOutput_ = Named(BoldLabel({}), QStringLiteral("lblOutput"));
  lblOutput_->setAlignment(Qt::AlignCenter);
  lblOutput_->setAutoFillBackground(true);
  QPalette panel;
  panel.setColor(QPalette::Window, kOutputPanel);
  panel.setColor(QPalette::WindowText, Qt::black);
  lblOutput_->setPalette(panel);
  QFont font = lblOutput_->font();
  font.setPointSizeF(font.pointSizeF() * 1.5);
  lblOutput_->setFont(font);

  servo_or_output_ = new QStackedWidget;
  servo_or_output_->addWidget(ServoSimulator1_);
  servo_or_output_->addWidget(lblOutput_);
  auto* layout = new QVBoxLayout(frame);
  layout->setContentsMargins(4, 4, 4, 4);
  layout->addWidget(servo_or_output_);
  return frame;
}

void EditorArea::SetUpSimulator() {
  ServoSimulator1_->DisplaySize(kLargeSimulator);
  ServoSimulator1_->setAccessibleName(QStringLiteral("Chosen channel"));
}

void EditorArea::ShowEditor() {
  parameters_->ShowValues();
  choices_->ShowChoices();
  const auto channel = editor_.Channel();
  if (!channel) return;
  const QString caption = QStringLiteral("CHAN %1").arg(*channel + 1);
  ServoSimulator1_->DisplayCaption(caption);
  const QString kind = OutputLabel(working_.At(*channel).PortType);
  lblOutput_->setText(caption + QStringLiteral("\n\n") + kind);
  servo_or_output_->setCurrentWidget(kind.isEmpty() ? static_cast<QWidget*>(ServoSimulator1_) : lblOutput_);
}

ChannelConfig EditorArea::Values() const {
  return editor_.Channel() ? working_.At(*editor_.Channel()) : editor_.WorkingValues();
}

void EditorArea::UpdateSimulator(Microseconds arm) {
  arm_ = arm;
  FeedSimulator(*ServoSimulator1_, Values(), kLargeSimulator, arm);
}

void EditorArea::MoveArm(Microseconds arm) {
  arm_ = arm;
  ServoSimulator1_->SetMovingArmPositionUS(arm);
}

}  // namespace tendril
