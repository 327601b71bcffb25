// NoticeLabel: a notice that is shown for a time.
#pragma once

#include <QString>

#include "ui/announcement.h"

namespace tendril {

// Keeps the room for its lines while it is empty, so that nothing around it moves. New notices are read out. The tool tip
// has all of a notice that does not fit.
class NoticeLabel : public Announcement {
 public:
  // One line elides what has no room; two or more are wrapped.
  explicit NoticeLabel(int lines);

  // Shows `text`. `spoken` is read out. Empty texts show nothing.
  void ShowNotice(const QString& text, const QString& spoken);

  QSize sizeHint() const override { return {0, lines_ * fontMetrics().lineSpacing()}; }
  QSize minimumSizeHint() const override { return sizeHint(); }

 protected:
  void resizeEvent(QResizeEvent* event) override;

 private:
  void Fit();

  const int lines_;
};

}  // namespace tendril
