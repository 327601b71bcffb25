// HintLabel: why a typed number cannot be taken.
#pragma once

#include <QString>

#include "ui/announcement.h"

namespace tendril {

// Keeps the room for its lines while it is empty, so that nothing around it moves. New hints are read out.
class HintLabel : public Announcement {
 public:
  // One line elides what has no room; two or more are wrapped.
  explicit HintLabel(int lines);

  // Shows `hint` about `field`, which is read out before it. An empty hint shows nothing.
  void ShowHint(const QString& field, const QString& hint);

  QSize sizeHint() const override { return {0, lines_ * fontMetrics().lineSpacing()}; }
  QSize minimumSizeHint() const override { return sizeHint(); }

 protected:
  void resizeEvent(QResizeEvent* event) override;

 private:
  void Fit();

  const int lines_;
};

}  // namespace tendril
