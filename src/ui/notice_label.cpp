#include "ui/notice_label.h"

namespace tendril {

NoticeLabel::NoticeLabel(int lines) : lines_(lines) {
  setTextFormat(Qt::PlainText);
  setAlignment(Qt::AlignLeft | Qt::AlignTop);
  setWordWrap(lines > 1);
}

void NoticeLabel::ShowNotice(const QString& text, const QString& spoken) {
  if (text == toolTip() && spoken == accessibleName()) return;
  setToolTip(text);
  Fit();
  Announce(spoken);
}

void NoticeLabel::resizeEvent(QResizeEvent* event) {
  Announcement::resizeEvent(event);
  Fit();
}

void NoticeLabel::Fit() {
  setText(lines_ > 1 ? toolTip() : fontMetrics().elidedText(toolTip(), Qt::ElideRight, width()));
}

}  // namespace tendril
