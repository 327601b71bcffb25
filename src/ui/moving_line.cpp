#include "ui/moving_line.h"

#include <QHBoxLayout>

#include "ui/controls.h"

namespace tendril {

MovingLine::MovingLine()
    : lblMoving_(Named(new ElidedLabel(QStringLiteral("What moves")), "lblMoving")),
      cmdStop_(Named(new QPushButton(QStringLiteral("Stop (goes to 1500 µs)")), "cmdStop")),
      lblBorrowed_(Named(new ElidedLabel(QStringLiteral("Borrowed port")), "lblBorrowed")) {
  Describe(cmdStop_, "Ends the test and moves the servo to the centre, 1500 µs.");
  cmdStop_->setFixedHeight(LowButtonHeight(*cmdStop_));
  cmdStop_->hide();
  QSizePolicy policy = lblBorrowed_->sizePolicy();
  policy.setRetainSizeWhenHidden(true);
  lblBorrowed_->setSizePolicy(policy);
  lblBorrowed_->hide();
  connect(cmdStop_, &QAbstractButton::clicked, this, &MovingLine::StopPressed);
  auto* row = AddLayout<QHBoxLayout>(this, {}, 8);
  row->addWidget(lblMoving_);
  row->addWidget(cmdStop_);
  row->addWidget(lblBorrowed_, 1);
  setFixedHeight(cmdStop_->height());
}

void MovingLine::ShowMoving(const QString& sentence, Moves moves) {
  lblMoving_->Show(sentence);
  if (moves == moves_) return;
  moves_ = moves;
  if (moves == Moves::kSlider) {
    cmdStop_->setText(QStringLiteral("Clear the slider's box"));
    Describe(cmdStop_, "Clears \"Use Slider to Test Intensity Values\". The servo stays where it is.");
  } else if (moves == Moves::kSweep) {
    cmdStop_->setText(QStringLiteral("Stop (goes to 1500 µs)"));
    Describe(cmdStop_, "Ends the test and moves the servo to the centre, 1500 µs (Escape).");
  }
  if (moves == Moves::kNothing) MoveFocusToWindow(*cmdStop_);
  cmdStop_->setVisible(moves != Moves::kNothing);
  QFont font = lblMoving_->font();
  font.setBold(moves != Moves::kNothing);
  lblMoving_->setFont(font);
}

void MovingLine::ShowBorrowed(const QString& notice) {
  lblBorrowed_->Show(notice);
  lblBorrowed_->setVisible(!notice.isEmpty());
}

}  // namespace tendril
