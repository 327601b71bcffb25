// ElidedLabel: one line of text that fits into any width.
#pragma once

#include <QLabel>
#include <QString>

namespace tendril {

// Paints the text of `label`, with an ellipsis where the label is too narrow.
void PaintElided(QLabel& label);

// Shows as much of the text as there is room for. The tool tip and the accessible name have all of it.
class ElidedLabel : public QLabel {
  Q_OBJECT

 public:
  // `what` names it for assistive technology before the text ("Port").
  explicit ElidedLabel(QString what);

  // Shows `text`. Does nothing when it shows that already.
  void Show(const QString& text);

  QSize minimumSizeHint() const override { return {0, QLabel::minimumSizeHint().height()}; }

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  const QString what_;
};

}  // namespace tendril
