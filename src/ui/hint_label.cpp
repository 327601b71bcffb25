#include "ui/hint_label.h"

namespace tendril {

HintLabel::HintLabel(int lines) : lines_(lines) {
  setTextFormat(Qt::PlainText);
  setAlignment(Qt::AlignLeft | Qt::AlignTop);
  setWordWrap(lines > 1);
}

void HintLabel::ShowHint(const QString& field, const QString& hint) {
  const bool none = hint.isEmpty();
  setToolTip(none ? QString() : QStringLiteral("⚠ ") + hint);
  Fit();
  Announce(none ? QString() : field + QStringLiteral(": ") + hint);
}

void HintLabel::resizeEvent(QResizeEvent* event) {
  Announcement::resizeEvent(event);
  Fit();
}

void HintLabel::Fit() {
  setText(lines_ > 1 ? toolTip() : fontMetrics().elidedText(toolTip(), Qt::ElideRight, width()));
}

}  // namespace tendril
