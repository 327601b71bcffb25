#include "ui/remarks_label.h"

#include <algorithm>

namespace tendril {
namespace {

constexpr qsizetype kShownRemarks = 2;
constexpr int kLines = 3;            // the last one counts the others
constexpr qsizetype kTipLines = 24;  // of what differs
constexpr char kWhy[] =
    "A unit holds pulse widths of 10 to 2550 µs. Editor and summary show the actual range about 1500 µs, "
    "and all else inside it.\nLeaving a channel, and the summary, store what is shown.";

QStringList Signed(const char* sign, const QStringList& lines) {
  QStringList all;
  for (const QString& line : lines) all += QString::fromUtf8(sign) + line;
  return all;
}

QString Others(qsizetype count) { return QStringLiteral("and %1 more").arg(count); }

}  // namespace

void RemarksLabel::ShowRemarks(const std::vector<std::string>& sentences) {
  QStringList all;
  for (const std::string& sentence : sentences) all += QString::fromStdString(sentence);
  if (all == remarks_) return;
  remarks_ = all;
  ShowWhole();
  Announce(accessibleName());
}

void RemarksLabel::ShowDifferences(const QStringList& lines) {
  if (lines == differences_) return;
  differences_ = lines;
  ShowWhole();
  setVisible(!accessibleName().isEmpty());
}

// What differs is not read out: the control that changes says so.
void RemarksLabel::ShowWhole() {
  QStringList tip = remarks_;
  if (!remarks_.isEmpty()) tip += {QString(), QString::fromUtf8(kWhy)};
  if (!remarks_.isEmpty() && !differences_.isEmpty()) tip += QString();
  tip += Signed("≠ ", differences_.first(std::min(kTipLines, differences_.size())));
  if (differences_.size() > kTipLines) tip += Others(differences_.size() - kTipLines);
  setToolTip(tip.join(QLatin1Char('\n')));
  setAccessibleName((remarks_ + differences_).join(QLatin1Char('\n')));
  ShowLines();
}

QSize RemarksLabel::sizeHint() const { return {0, kLines * fontMetrics().lineSpacing()}; }

void RemarksLabel::resizeEvent(QResizeEvent* event) {
  Announcement::resizeEvent(event);
  ShowLines();
}

// Where no line is left for the number of the others, it follows the last line.
void RemarksLabel::ShowLines() {
  const QStringList all = Signed("⚠ ", remarks_) + Signed("≠ ", differences_);
  const qsizetype room = std::max(1, height() / fontMetrics().lineSpacing());
  // More than two remarks leave no room for what differs.
  const qsizetype wanted = remarks_.size() > kShownRemarks ? kShownRemarks : all.size();
  const qsizetype for_others = room > 2 && all.size() > room ? 1 : 0;
  const qsizetype shown = std::min(wanted, room - for_others);
  const QString more = shown < all.size() ? Others(all.size() - shown) : QString();
  const bool own_line = room > shown;
  const QString tail = more.isEmpty() || own_line ? QString() : QStringLiteral(" ") + more;
  QStringList lines;
  for (qsizetype i = 0; i < shown; ++i) {
    const QString end = i + 1 == shown ? tail : QString();
    const int width_left = width() - fontMetrics().horizontalAdvance(end);
    lines += fontMetrics().elidedText(all[i], Qt::ElideRight, width_left) + end;
  }
  if (own_line && !more.isEmpty()) lines += more;
  setText(lines.join(QLatin1Char('\n')));
}

}  // namespace tendril
