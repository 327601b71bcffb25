#include "ui/remarks_label.h"

#include <algorithm>

namespace tendril {
namespace {

constexpr qsizetype kShownRemarks = 2;
constexpr int kLines = 3;  // the last one counts the others
constexpr char kWhy[] =
    "A unit holds pulse widths of 10 to 2550 µs. Editor and summary show the actual range about 1500 µs, "
    "and all else inside it.\nLeaving a channel, and the summary, store what is shown.";

}  // namespace

void RemarksLabel::ShowRemarks(const std::vector<std::string>& sentences) {
  QStringList all;
  for (const std::string& sentence : sentences) all += QString::fromStdString(sentence);
  if (all == remarks_) return;
  remarks_ = all;
  const QString whole = all.join(QLatin1Char('\n'));
  setToolTip(all.isEmpty() ? QString() : whole + QStringLiteral("\n\n") + QString::fromUtf8(kWhy));
  ShowLines();
  Announce(whole);
}

QSize RemarksLabel::sizeHint() const { return {0, kLines * fontMetrics().lineSpacing()}; }

void RemarksLabel::resizeEvent(QResizeEvent* event) {
  Announcement::resizeEvent(event);
  ShowLines();
}

// Where no line is left for the number of the others, it follows the last remark.
void RemarksLabel::ShowLines() {
  const qsizetype room = std::max(1, height() / fontMetrics().lineSpacing());
  const qsizetype shown = std::min({remarks_.size(), kShownRemarks, room});
  const qsizetype others = remarks_.size() - shown;
  const QString more = others > 0 ? QStringLiteral("and %1 more").arg(others) : QString();
  const bool own_line = room > shown;
  const QString tail = more.isEmpty() || own_line ? QString() : QStringLiteral(" ") + more;
  QStringList lines;
  for (qsizetype i = 0; i < shown; ++i) {
    const QString end = i + 1 == shown ? tail : QString();
    const int width_left = width() - fontMetrics().horizontalAdvance(end);
    lines += fontMetrics().elidedText(QStringLiteral("⚠ ") + remarks_[i], Qt::ElideRight, width_left) + end;
  }
  if (own_line && !more.isEmpty()) lines += more;
  setText(lines.join(QLatin1Char('\n')));
}

}  // namespace tendril
