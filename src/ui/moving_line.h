// MovingLine: what moves, and the way to stop it.
#pragma once

#include <QPushButton>
#include <QString>
#include <QWidget>

#include "ui/elided_label.h"
#include "ui/model/moving.h"

namespace tendril {

// One line of a fixed height: what moves with the button that stops it, and which port is borrowed.
class MovingLine : public QWidget {
  Q_OBJECT

 public:
  MovingLine();

  // Shows what moves, and the button that stops it.
  void ShowMoving(const QString& sentence, Moves moves);
  // Shows the notice of a borrowed port; empty: none.
  void ShowBorrowed(const QString& notice);

 Q_SIGNALS:
  // The user pressed the button.
  void StopPressed();

 private:
  Moves moves_ = Moves::kNothing;
  ElidedLabel* lblMoving_;
  QPushButton* cmdStop_;
  ElidedLabel* lblBorrowed_;
};

}  // namespace tendril
